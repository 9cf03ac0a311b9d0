#include "FifTextTest.h"

#include "FifFileDecoder.h"

#include <cstring>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Gui {
namespace Orba {

namespace {

// A UTF-16 or UTF-32 byte-order mark.
bool startsOtherBom(const char* head, qint64 size)
{
    return FifFileDecoder(QByteArrayView(head, size)).getUnitSize() > 1;
}

// Bytes that are control characters on their own (tab, line feed, vertical
// tab, form feed and carriage return are white space).
bool isControlByte(uchar c)
{
    return (c < 0x20 && (c < 0x09 || c > 0x0D)) || c == 0x7F;
}

// Second bytes after C2 that make a C1 control character, all but U+0085.
bool isC1Second(uchar c)
{
    return c >= 0x80 && c <= 0x9F && c != 0x85;
}

} // namespace

FifTextTest::Verdict FifTextTest::feed(const char* data, qint64 size)
{
    if (verdict != Undecided || size <= 0)
        return verdict;
    if (headSize < 4) {
        const int take = int(qMin<qint64>(4 - headSize, size));
        std::memcpy(head + headSize, data, size_t(take));
        headSize += take;
        data += take;
        size -= take;
        if (headSize < 4)
            return verdict;
        if (startsOtherBom(head, headSize))
            return verdict = OtherEncoding;
        if (examine(head, headSize) != Undecided)
            return verdict;
    }
    return examine(data, size);
}

FifTextTest::Verdict FifTextTest::finish()
{
    if (verdict != Undecided)
        return verdict;
    if (headSize < 4) {
        if (startsOtherBom(head, headSize))
            return verdict = OtherEncoding;
        examine(head, headSize);
    }
    if (verdict == Undecided)
        verdict = Text;
    return verdict;
}

FifTextTest::Verdict FifTextTest::examine(const char* data, qint64 size)
{
    const auto* bytes = reinterpret_cast<const uchar*>(data);
    qint64 i = 0;
    while (i < size) {
#ifdef __SSE2__
        // Most bytes are none of line feed, control, C2: pass over 16 at once.
        if (!afterC2) {
            const __m128i below20 = _mm_set1_epi8(0x1F);
            const __m128i del = _mm_set1_epi8(0x7F);
            const __m128i c2 = _mm_set1_epi8(char(0xC2));
            while (i + 16 <= size) {
                const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + i));
                const __m128i low = _mm_cmpeq_epi8(_mm_max_epu8(x, below20), below20);
                const __m128i other =
                    _mm_or_si128(_mm_cmpeq_epi8(x, del), _mm_cmpeq_epi8(x, c2));
                if (_mm_movemask_epi8(_mm_or_si128(low, other)))
                    break;
                i += 16;
            }
            if (i >= size)
                break;
        }
#endif
        const uchar c = bytes[i++];
        if (afterC2 && isC1Second(c))
            return verdict = Binary;
        afterC2 = c == 0xC2;
        if (c == '\n') {
            if (++lines == linesExamined)
                return verdict = Text;
        } else if (isControlByte(c)) {
            return verdict = Binary;
        }
    }
    return verdict;
}

} // namespace Orba
} // namespace Gui
