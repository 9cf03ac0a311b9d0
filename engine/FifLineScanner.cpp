#include "FifLineScanner.h"

#include "FifLineCounter.h"

#include <QIODevice>

#include <climits>
#include <cstring>

namespace Gui {
namespace Orba {

namespace {

// Bytes of an over-long line that are held back before they are counted,
// so that the "\r" of a terminator is still at hand.
constexpr int heldBack = 4;
// No UTF-8 sequence has more continuation bytes than this.
constexpr int maxContinuation = 3;

int clampToInt(qint64 value)
{
    return value > INT_MAX ? INT_MAX : int(value);
}

bool isContinuationByte(char c)
{
    return (uchar(c) & 0xC0) == 0x80;
}

// A place at or just before `cut` (0 < cut < size) where `bytes` can be
// split so that decoding the two parts gives what decoding them together
// does. An undecodable byte always becomes one replacement character, so
// the only place that is not safe is inside a well-formed sequence: cut
// before a byte that is not a continuation byte, or where no sequence lead
// is close enough to reach.
qsizetype safeCut(const char* bytes, qsizetype cut)
{
    for (qsizetype p = cut; p >= 0 && p >= cut - maxContinuation; --p) {
        if (!isContinuationByte(bytes[p]))
            return p;
    }
    return cut;
}

// One line of UTF-8 as its pieces are read. Up to `maxBytes` of it are kept
// for matching, cut where decoding the kept part alone gives what decoding
// the whole does; the characters of the rest are only counted, a piece at a
// time, so that memory stays bounded however long the line. Its last bytes
// are held back from counting: they may be the "\r" of its terminator.
class Utf8Line
{
public:
    Utf8Line(qint64 maxBytes, qint64 countPiece, FifFileDecoder& decoder)
        : decoder(decoder)
        , maxBytes(maxBytes)
        , countPiece(countPiece)
    {
    }

    bool isEmpty() const { return kept.isEmpty() && !overlong; }
    bool isOverlong() const { return overlong; }
    const QByteArray& keptBytes() const { return kept; }

    void add(const char* bytes, qint64 size)
    {
        if (size <= 0)
            return;
        endsWithCR = bytes[size - 1] == '\r';
        if (!overlong) {
            const qint64 room = maxBytes - kept.size();
            if (size <= room) {
                kept.append(bytes, size);
                return;
            }
            kept.append(bytes, room);
            bytes += room;
            size -= room;
            overlong = true;
            // Where the kept part ends, the decoding must not change.
            const QByteArray around = kept.right(maxContinuation) + bytes[0];
            const qsizetype back = around.size() - 1 - safeCut(around.constData(), around.size() - 1);
            tail = kept.right(back);
            kept.chop(back);
        }
        tail.append(bytes, size);
        if (tail.size() > countPiece + heldBack) {
            const qsizetype cut = safeCut(tail.constData(), tail.size() - heldBack);
            if (cut > 0) {
                restChars += FifLineCounter::utf16Length(tail.constData(), cut, decoder);
                tail.remove(0, cut);
            }
        }
    }

    // Ends the line and gives the length of its terminator: 1 for "\n", 2
    // for "\r\n" (the "\r" leaves the text), 0 at the end of the file.
    int end(bool newline)
    {
        if (!newline)
            return 0;
        if (!endsWithCR)
            return 1;
        // An over-long line always holds its last bytes in the tail.
        if (overlong)
            tail.chop(1);
        else
            kept.chop(1);
        return 2;
    }

    // The characters of the line beyond the kept bytes; after end().
    qint64 countRest()
    {
        restChars += FifLineCounter::utf16Length(tail.constData(), tail.size(), decoder);
        tail.resize(0);
        return restChars;
    }

    // Keeps the buffers' memory for the next line.
    void clear()
    {
        kept.resize(0);
        tail.resize(0);
        overlong = false;
        endsWithCR = false;
        restChars = 0;
    }

private:
    FifFileDecoder& decoder;
    const qint64 maxBytes;
    const qint64 countPiece;
    QByteArray kept;
    QByteArray tail;         // bytes beyond the kept part not yet counted
    bool overlong = false;   // the line has outgrown the kept part
    bool endsWithCR = false; // the last byte of the line so far is "\r"
    qint64 restChars = 0;    // characters beyond the kept part already counted
};

} // namespace

FifLineScanner::FifLineScanner(const QRegExp& expression, qint64 maxBytes, qint64 block)
    : rx(expression)
    , prefilter(expression)
    , asciiMatcher(expression)
    , usePrefilter(prefilter.isActive() || asciiMatcher.isActive())
    , maxLineBytes(qMax<qint64>(maxBytes, 1))
    , blockSize(qMax<qint64>(block, 1))
{
    const QRegExp::PatternSyntax syntax = rx.patternSyntax();
    if ((syntax == QRegExp::RegExp || syntax == QRegExp::RegExp2) && rx.isValid()
        && !rx.pattern().contains(QLatin1Char('^'))) {
        anchored = QRegExp(QLatin1String("^(?:") + rx.pattern() + QLatin1Char(')'),
                           rx.caseSensitivity(), syntax);
        anchored.setMinimal(rx.isMinimal());
        if (!anchored.isValid())
            anchored = QRegExp();
    }
}

int FifLineScanner::indexIn(const QString& text, int* length)
{
    if (text.size() <= sliceThreshold || anchored.pattern().isEmpty()) {
        const int position = rx.indexIn(text, 0, QRegExp::CaretAtZero);
        *length = rx.matchedLength();
        return position;
    }
    // With the caret at the offset, "^(?:P)" can only match at the offset,
    // and does so exactly when P matches there: P holds no caret, and every
    // other assertion sees the whole line as before.
    for (int start = 0; start <= text.size(); ++start) {
        if (stopRequested()) {
            stopped = true;
            return -1;
        }
        if (anchored.indexIn(text, start, QRegExp::CaretAtOffset) == start) {
            *length = anchored.matchedLength();
            return start;
        }
    }
    return -1;
}

bool FifLineScanner::scan(QIODevice& device, const MatchSink& matchSink,
                          const StopPoll& shouldStop)
{
    sink = &matchSink;
    stopPoll = &shouldStop;
    stopped = false;
    hasHit = false;
    lineNumber = 1;
    offset = 0;
    rawOffset = 0;
    FifFileDecoder decoder(device.peek(4));
    device.skip(decoder.getMarkSize());
    if (decoder.getUnitSize() == 1)
        scanUtf8(device, decoder);
    else
        scanDecoded(device, decoder);
    sink = nullptr;
    stopPoll = nullptr;
    return hasHit;
}

template <typename Take>
bool FifLineScanner::readBlocks(QIODevice& device, Take take)
{
    for (bool first = true;; first = false) {
        // A single line may span many blocks; a stop must not wait for its end.
        if (!first && stopRequested())
            return false;
        // Read into the buffer not holding lines still to be counted.
        QByteArray& buffer = buffers[current];
        current = 1 - current;
        if (buffer.size() != blockSize)
            buffer.resize(blockSize);
        const qint64 got = device.read(buffer.data(), blockSize);
        if (got <= 0)
            return true;
        if (!take(buffer.constData(), got))
            return false;
    }
}

FifLineScanner::Sifted FifLineScanner::sift(const char* begin, const char* end, const char* from,
                                            int* column) const
{
    if (prefilter.isActive()) {
        FifPrefilter::Cursor cursor;
        const char* found = prefilter.find(from, end, cursor);
        if (found == end)
            return CannotMatch;
        if (prefilter.isExact() && FifAsciiMatcher::isAscii(begin, end - begin)) {
            *column = int(found - begin);
            return MayMatch;
        }
    }
    // PCRE2 rules out lines of ASCII characters only.
    return asciiMatcher.match(begin, end - begin) == FifAsciiMatcher::NoMatch ? CannotMatchAscii
                                                                               : MayMatch;
}

void FifLineScanner::matchLine(const QString& text, int terminatorLength, qint64 extraChars,
                               int knownColumn)
{
    int length = 0;
    int position = knownColumn;
    if (knownColumn >= 0)
        length = int(prefilter.getNeedle().size());
    else
        position = indexIn(text, &length);
    if (position >= 0) {
        hasHit = true;
        (*sink)(Match{clampToInt(lineNumber), clampToInt(offset + position),
                      clampToInt(rawOffset + position), text, position, length});
    }
    advance(text.size() + extraChars, terminatorLength);
}

void FifLineScanner::advance(qint64 chars, int terminatorLength)
{
    offset += chars + (terminatorLength > 0 ? 1 : 0);
    rawOffset += chars + terminatorLength;
    ++lineNumber;
}

void FifLineScanner::scanUtf8(QIODevice& device, FifFileDecoder& decoder)
{
    Utf8Line line(maxLineBytes, blockSize, decoder);

    // Whole lines that cannot match are not decoded; the counters pass over
    // them as matching them would have. Those after the last candidate of a
    // block are counted only once a later line needs the counts, so not at
    // all when the file ends first.
    const char* uncountedFrom = nullptr;
    const char* uncountedTo = nullptr;
    // Returns whether a line numbered by a multiple of pollInterval, where
    // the stop flag is read, was passed over.
    auto passOver = [&](const char* begin, const char* end) {
        if (begin >= end)
            return false;
        const FifLineCounter::Counts counts = FifLineCounter::count(begin, end, decoder);
        const bool pollDue = lineNumber % pollInterval == 0
                             || (lineNumber + counts.lines - 1) / pollInterval
                                    != (lineNumber - 1) / pollInterval;
        lineNumber += counts.lines;
        offset += counts.chars + counts.lines;
        rawOffset += counts.chars + counts.lines + counts.crlfLines;
        return pollDue;
    };
    auto settle = [&] {
        const bool pollDue = passOver(uncountedFrom, uncountedTo);
        uncountedFrom = uncountedTo = nullptr;
        return pollDue;
    };

    // Matches the line read so far, or passes over one that cannot match;
    // false when a stop came while it was matched.
    auto finishLine = [&](bool newline) {
        const int terminator = line.end(newline);
        const QByteArray& bytes = line.keptBytes();
        int column = -1;
        if (usePrefilter && !line.isOverlong()
            && sift(bytes.constData(), bytes.constData() + bytes.size(), bytes.constData(), &column)
                   != MayMatch) {
            // Only a line after it needs its length.
            if (newline) {
                settle();
                advance(FifLineCounter::utf16Length(bytes.constData(), bytes.size(), decoder),
                        terminator);
            }
        } else {
            settle();
            const qint64 rest = line.countRest();
            matchLine(decoder.decode(bytes), terminator, rest, column);
        }
        line.clear();
        return !stopped;
    };

    // The same for a line that lies whole in the buffer, ended by "\n"
    // and kept whole: sifted and decoded where it lies. No match starts
    // before `candidate`.
    auto finishWholeLine = [&](const char* lineStart, const char* newline, const char* candidate) {
        const bool crlf = newline > lineStart && newline[-1] == '\r';
        const char* end = newline - (crlf ? 1 : 0);
        int column = -1;
        const Sifted sifted = usePrefilter ? sift(lineStart, end, qMin(candidate, end), &column) : MayMatch;
        if (sifted == CannotMatchAscii)
            advance(end - lineStart, crlf ? 2 : 1);
        else if (sifted == CannotMatch)
            advance(FifLineCounter::utf16Length(lineStart, end - lineStart, decoder), crlf ? 2 : 1);
        else
            matchLine(decoder.decode(QByteArrayView(lineStart, end - lineStart)), crlf ? 2 : 1, 0, column);
        return !stopped;
    };

    // Matches the whole lines of [begin, end), each ended by "\n"; false
    // when a stop was requested. Only the lines the prefilter points at
    // are decoded and matched.
    auto scanLines = [&](const char* begin, const char* end) {
        FifPrefilter::Cursor cursor;
        while (begin < end) {
            const char* candidate = usePrefilter ? prefilter.find(begin, end, cursor) : begin;
            if (candidate == end)
                break;
            const char* lineStart = static_cast<const char*>(
                memrchr(begin, '\n', size_t(candidate - begin)));
            lineStart = lineStart ? lineStart + 1 : begin;
            const char* newline = static_cast<const char*>(
                std::memchr(candidate, '\n', size_t(end - candidate)));
            bool pollDue = settle();
            pollDue = passOver(begin, lineStart) || pollDue;
            if ((pollDue || lineNumber % pollInterval == 0) && stopRequested())
                return false;
            if (newline - lineStart <= maxLineBytes) {
                if (!finishWholeLine(lineStart, newline, candidate))
                    return false;
            } else {
                line.add(lineStart, newline - lineStart);
                if (!finishLine(true))
                    return false;
            }
            begin = newline + 1;
        }
        uncountedFrom = begin;
        uncountedTo = end;
        return true;
    };

    const bool atEnd = readBlocks(device, [&](const char* data, qint64 size) {
        if (settle() && stopRequested())
            return false;
        const char* end = data + size;
        // The end of a line begun in an earlier block.
        if (!line.isEmpty()) {
            const char* newline =
                static_cast<const char*>(std::memchr(data, '\n', size_t(end - data)));
            if (!newline) {
                line.add(data, end - data);
                return true;
            }
            if (lineNumber % pollInterval == 0 && stopRequested())
                return false;
            line.add(data, newline - data);
            if (!finishLine(true))
                return false;
            data = newline + 1;
        }
        const char* lastNewline =
            static_cast<const char*>(memrchr(data, '\n', size_t(end - data)));
        const char* whole = lastNewline ? lastNewline + 1 : data;
        if (!scanLines(data, whole))
            return false;
        line.add(whole, end - whole);
        return true;
    });
    if (atEnd && !line.isEmpty()) {
        const bool pollDue = settle();
        if (!((pollDue || lineNumber % pollInterval == 0) && stopRequested()))
            finishLine(false);
    }
}

void FifLineScanner::scanDecoded(QIODevice& device, FifFileDecoder& decoder)
{
    QString line;
    bool overlong = false;    // the line has outgrown `line`
    qint64 restChars = 0;     // characters of the line beyond `line`
    bool endsWithCR = false;  // the last character of the line so far is "\r"
    const qint64 maxLineChars = qMax<qint64>(maxLineBytes / 2, 1);

    auto add = [&](QStringView chars) {
        if (chars.isEmpty())
            return;
        endsWithCR = chars.back() == QLatin1Char('\r');
        qsizetype take = 0;
        if (!overlong) {
            take = qMin<qsizetype>(maxLineChars - line.size(), chars.size());
            overlong = take < chars.size();
            line.append(chars.left(take));
            // Keep a surrogate pair together, also when it was split
            // between two reads.
            if (overlong && !line.isEmpty() && line.back().isHighSurrogate()) {
                line.chop(1);
                ++restChars;
            }
        }
        restChars += chars.size() - take;
    };

    auto finishLine = [&](bool newline) {
        int terminator = newline ? 1 : 0;
        if (newline && endsWithCR) {
            terminator = 2;
            // Once a line is over-long, its last characters are counted ones.
            if (overlong)
                --restChars;
            else
                line.chop(1);
        }
        matchLine(line, terminator, restChars);
        line.clear();
        overlong = false;
        restChars = 0;
        endsWithCR = false;
        return !stopped;
    };

    const bool atEnd = readBlocks(device, [&](const char* data, qint64 size) {
        const QString text = decoder.decode(QByteArrayView(data, size));
        const QStringView view(text);
        qsizetype start = 0;
        while (start < view.size()) {
            const qsizetype newline = view.indexOf(QLatin1Char('\n'), start);
            if (newline < 0) {
                add(view.mid(start));
                break;
            }
            if (lineNumber % pollInterval == 0 && stopRequested())
                return false;
            add(view.mid(start, newline - start));
            if (!finishLine(true))
                return false;
            start = newline + 1;
        }
        return true;
    });
    if (!atEnd)
        return;
    // A file that ends inside a code unit ends with an undecodable character.
    add(decoder.finish());
    if ((!line.isEmpty() || overlong) && !(lineNumber % pollInterval == 0 && stopRequested()))
        finishLine(false);
}

} // namespace Orba
} // namespace Gui
