#include "FifLineCounter.h"

#include "FifFileDecoder.h"

#include <cstring>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Gui {
namespace Orba {

namespace {

bool isContinuation(uchar c)
{
    return (c & 0xC0) == 0x80;
}

// Newlines, "\r\n" pairs, and whether any byte is not ASCII.
struct Scan
{
    qint64 newlines = 0;
    qint64 crlf = 0;
    bool ascii = true;
};

Scan scanBytes(const uchar* p, qint64 size)
{
    Scan scan;
    qint64 i = 0;
#ifdef __SSE2__
    // Counts in byte lanes (each compare gives -1 per hit), summed before a
    // lane can overflow.
    const __m128i nl = _mm_set1_epi8('\n');
    const __m128i cr = _mm_set1_epi8('\r');
    const __m128i zero = _mm_setzero_si128();
    __m128i high = zero;
    while (i + 16 <= size) {
        __m128i newlines = zero;
        __m128i crlf = zero;
        const qint64 stop = qMin<qint64>(size, i + 255 * 16);
        for (; i + 16 <= stop; i += 16) {
            const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + i));
            const __m128i isNl = _mm_cmpeq_epi8(x, nl);
            // The byte before each: the last of the previous 16, or none.
            const __m128i before = i > 0
                ? _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + i - 1))
                : _mm_slli_si128(x, 1);
            const __m128i isCrlf = _mm_and_si128(isNl, _mm_cmpeq_epi8(before, cr));
            newlines = _mm_sub_epi8(newlines, isNl);
            crlf = _mm_sub_epi8(crlf, isCrlf);
            high = _mm_or_si128(high, x);
        }
        const __m128i sumNl = _mm_sad_epu8(newlines, zero);
        const __m128i sumCrlf = _mm_sad_epu8(crlf, zero);
        scan.newlines += _mm_cvtsi128_si32(sumNl) + _mm_extract_epi16(sumNl, 4);
        scan.crlf += _mm_cvtsi128_si32(sumCrlf) + _mm_extract_epi16(sumCrlf, 4);
    }
    scan.ascii = _mm_movemask_epi8(high) == 0;
#endif
    bool lastWasCR = i > 0 && p[i - 1] == '\r';
    for (; i < size; ++i) {
        const uchar c = p[i];
        if (c == '\n') {
            ++scan.newlines;
            scan.crlf += lastWasCR ? 1 : 0;
        }
        if (c >= 0x80)
            scan.ascii = false;
        lastWasCR = c == '\r';
    }
    return scan;
}

} // namespace

qint64 FifLineCounter::wellFormedLength(const uchar* p, qint64 size)
{
    qint64 length = 0;
    qint64 i = 0;
    while (i < size) {
        const uchar c = p[i];
        if (c < 0x80) {
            ++i;
            ++length;
            continue;
        }
        if (c >= 0xC2 && c <= 0xDF) {
            if (i + 1 >= size || !isContinuation(p[i + 1]))
                return -1;
            i += 2;
            ++length;
            continue;
        }
        if (c >= 0xE0 && c <= 0xEF) {
            if (i + 2 >= size || !isContinuation(p[i + 1]) || !isContinuation(p[i + 2]))
                return -1;
            const uchar d = p[i + 1];
            if ((c == 0xE0 && d < 0xA0) || (c == 0xED && d > 0x9F))
                return -1;  // over-long, or a surrogate
            // Non-characters U+FDD0..U+FDEF and U+FFFE, U+FFFF: left to the
            // decoder, whatever it makes of them.
            if (c == 0xEF && ((d == 0xB7 && p[i + 2] >= 0x90 && p[i + 2] <= 0xAF)
                              || (d == 0xBF && p[i + 2] >= 0xBE)))
                return -1;
            i += 3;
            ++length;
            continue;
        }
        if (c >= 0xF0 && c <= 0xF4) {
            if (i + 3 >= size || !isContinuation(p[i + 1]) || !isContinuation(p[i + 2])
                || !isContinuation(p[i + 3]))
                return -1;
            const uchar d = p[i + 1];
            if ((c == 0xF0 && d < 0x90) || (c == 0xF4 && d > 0x8F))
                return -1;
            // U+xFFFE and U+xFFFF of every plane: to the decoder as well.
            if ((d & 0x0F) == 0x0F && p[i + 2] == 0xBF && p[i + 3] >= 0xBE)
                return -1;
            i += 4;
            length += 2;
            continue;
        }
        return -1;
    }
    return length;
}

qint64 FifLineCounter::utf16Length(const char* bytes, qint64 size, FifFileDecoder& decoder)
{
    const qint64 length = wellFormedLength(reinterpret_cast<const uchar*>(bytes), size);
    if (length >= 0)
        return length;
    return decoder.decode(QByteArrayView(bytes, size)).size();
}

FifLineCounter::Counts FifLineCounter::count(const char* begin, const char* end,
                                             FifFileDecoder& decoder)
{
    Counts counts;
    const Scan scan = scanBytes(reinterpret_cast<const uchar*>(begin), end - begin);
    counts.lines = scan.newlines;
    counts.crlfLines = scan.crlf;
    if (scan.ascii) {
        counts.chars = (end - begin) - scan.newlines - scan.crlf;
        return counts;
    }
    const char* line = begin;
    while (line < end) {
        const char* newline =
            static_cast<const char*>(std::memchr(line, '\n', size_t(end - line)));
        if (!newline)
            newline = end;  // not expected: the range holds whole lines
        qint64 size = newline - line;
        if (size > 0 && newline < end && line[size - 1] == '\r')
            --size;
        counts.chars += utf16Length(line, size, decoder);
        line = newline + 1;
    }
    return counts;
}

} // namespace Orba
} // namespace Gui
