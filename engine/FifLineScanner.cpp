#include "FifLineScanner.h"

#include "FifLineCounter.h"

#include <QIODevice>
#include <QStringDecoder>

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

QString decodeUtf8(QStringDecoder& decoder, const char* bytes, qsizetype size)
{
    return decoder.decode(QByteArrayView(bytes, size));
}

// Characters that `bytes` decode to, decoded in pieces of bounded size.
qint64 utf8Length(QStringDecoder& decoder, const char* bytes, qsizetype size)
{
    qint64 length = 0;
    while (size > 0) {
        qsizetype piece = size;
        if (piece > 1024 * 1024) {
            piece = safeCut(bytes, 1024 * 1024);
            if (piece == 0)
                piece = 1024 * 1024;
        }
        length += decodeUtf8(decoder, bytes, piece).size();
        bytes += piece;
        size -= piece;
    }
    return length;
}

} // namespace

FifLineScanner::FifLineScanner(const QRegExp& expression, qint64 maxBytes, qint64 block)
    : rx(expression)
    , prefilter(expression)
    , usePrefilter(prefilter.isActive())
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

int FifLineScanner::indexIn(const QString& text, const StopPoll& shouldStop)
{
    if (text.size() <= sliceThreshold || anchored.pattern().isEmpty())
        return rx.indexIn(text, 0, QRegExp::CaretAtZero);
    // With the caret at the offset, "^(?:P)" can only match at the offset,
    // and does so exactly when P matches there: P holds no caret, and every
    // other assertion sees the whole line as before.
    for (int start = 0; start <= text.size(); ++start) {
        if (shouldStop && shouldStop()) {
            stopped = true;
            return -1;
        }
        if (anchored.indexIn(text, start, QRegExp::CaretAtOffset) == start)
            return start;
    }
    return -1;
}

bool FifLineScanner::scan(QIODevice& device, const MatchSink& sink, const StopPoll& shouldStop)
{
    lineNumber = 1;
    offset = 0;
    rawOffset = 0;
    // The same byte-order-mark detection as QTextStream's, so that the text
    // test and the scan read a file alike.
    const auto encoding = QStringConverter::encodingForData(device.peek(4));
    if (encoding) {
        switch (*encoding) {
        case QStringConverter::Utf16LE:
        case QStringConverter::Utf16BE:
            device.skip(2);
            return scanDecoded(device, *encoding, 2, sink, shouldStop);
        case QStringConverter::Utf32LE:
        case QStringConverter::Utf32BE:
            device.skip(4);
            return scanDecoded(device, *encoding, 4, sink, shouldStop);
        case QStringConverter::Utf8:
            device.skip(3);
            break;
        default:
            break;
        }
    }
    return scanUtf8(device, sink, shouldStop);
}

bool FifLineScanner::matchLine(const QString& text, int terminatorLength, qint64 extraChars,
                               const MatchSink& sink, const StopPoll& shouldStop)
{
    bool matched = false;
    const int position = indexIn(text, shouldStop);
    if (position >= 0) {
        matched = true;
        sink(Match{clampToInt(lineNumber), clampToInt(offset + position),
                   clampToInt(rawOffset + position), text});
    }
    const qint64 length = text.size() + extraChars;
    offset += length + (terminatorLength > 0 ? 1 : 0);
    rawOffset += length + terminatorLength;
    ++lineNumber;
    return matched;
}

bool FifLineScanner::scanUtf8(QIODevice& device, const MatchSink& sink,
                              const StopPoll& shouldStop)
{
    bool hasHit = false;
    // Stateless, so that pieces decode alike wherever they are cut; and,
    // unlike QString::fromUtf8(), keeping a U+FEFF at the start of a line:
    // only the one that starts the file is a byte-order mark.
    QStringDecoder decoder(QStringDecoder::Utf8,
                           QStringDecoder::Flag::Stateless
                               | QStringDecoder::Flag::ConvertInitialBom);
    QByteArray line;          // the kept part of the line being read
    bool overlong = false;    // the line has outgrown the kept part
    QByteArray tail;          // bytes beyond the kept part not yet counted
    qint64 skippedChars = 0;  // characters beyond the kept part already counted
    bool endsWithCR = false;  // the last byte of the line so far is "\r"

    auto stopRequested = [&] { return shouldStop && shouldStop(); };

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

    auto finishLine = [&](bool hasNewline) {
        int terminator = hasNewline ? 1 : 0;
        if (hasNewline && endsWithCR) {
            terminator = 2;
            // An over-long line always holds its last bytes in the tail.
            if (overlong)
                tail.chop(1);
            else
                line.chop(1);
        }
        FifPrefilter::Cursor cursor;
        const char* lineEnd = line.constData() + line.size();
        if (usePrefilter && !overlong
            && prefilter.find(line.constData(), lineEnd, cursor) == lineEnd) {
            // Cannot match. Only a line after it needs its length.
            if (hasNewline) {
                settle();
                const qint64 length =
                    FifLineCounter::utf16Length(line.constData(), line.size(), decoder);
                offset += length + 1;
                rawOffset += length + terminator;
                ++lineNumber;
            }
        } else {
            settle();
            if (!tail.isEmpty())
                skippedChars += utf8Length(decoder, tail.constData(), tail.size());
            if (matchLine(decodeUtf8(decoder, line.constData(), line.size()), terminator,
                          skippedChars, sink, shouldStop))
                hasHit = true;
        }
        // Keep the buffers' memory for the next line.
        line.resize(0);
        tail.resize(0);
        overlong = false;
        skippedChars = 0;
        endsWithCR = false;
    };

    auto addToLine = [&](const char* bytes, qint64 size) {
        if (size <= 0)
            return;
        endsWithCR = bytes[size - 1] == '\r';
        if (!overlong) {
            const qint64 room = maxLineBytes - line.size();
            if (size <= room) {
                line.append(bytes, size);
                return;
            }
            line.append(bytes, room);
            bytes += room;
            size -= room;
            overlong = true;
            // Where the kept part ends, the decoding must not change.
            const QByteArray around = line.right(maxContinuation) + bytes[0];
            const qsizetype back = around.size() - 1 - safeCut(around.constData(), around.size() - 1);
            tail = line.right(back);
            line.chop(back);
        }
        tail.append(bytes, size);
        // Count the tail in pieces; the last bytes stay, as they may be the
        // "\r" of the terminator.
        if (tail.size() > blockSize + heldBack) {
            const qsizetype cut = safeCut(tail.constData(), tail.size() - heldBack);
            if (cut > 0) {
                skippedChars += utf8Length(decoder, tail.constData(), cut);
                tail.remove(0, cut);
            }
        }
    };

    auto pending = [&] { return !line.isEmpty() || overlong; };

    // Matches the whole lines of [begin, end), each ended by "\n"; false
    // when a stop was requested. With a prefilter only the lines it points
    // at are decoded and matched.
    auto scanLines = [&](const char* begin, const char* end) {
        if (!usePrefilter) {
            while (begin < end) {
                const char* newline =
                    static_cast<const char*>(std::memchr(begin, '\n', size_t(end - begin)));
                if (lineNumber % pollInterval == 0 && stopRequested())
                    return false;
                addToLine(begin, newline - begin);
                finishLine(true);
                // A stop that came while a long line was matched ends here.
                if (stopped)
                    return false;
                begin = newline + 1;
            }
            return true;
        }
        FifPrefilter::Cursor cursor;
        while (begin < end) {
            const char* candidate = prefilter.find(begin, end, cursor);
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
            addToLine(lineStart, newline - lineStart);
            finishLine(true);
            if (stopped)
                return false;
            begin = newline + 1;
        }
        uncountedFrom = begin;
        uncountedTo = end;
        return true;
    };

    bool firstBlock = true;
    int current = 0;
    while (true) {
        // A single line may span many blocks; a stop must not wait for its end.
        if (!firstBlock && stopRequested())
            return hasHit;
        firstBlock = false;
        // Read into the buffer not holding uncounted lines.
        QByteArray& buffer = buffers[current];
        current = 1 - current;
        if (buffer.size() != blockSize)
            buffer.resize(blockSize);
        const qint64 got = device.read(buffer.data(), blockSize);
        if (settle() && stopRequested())
            return hasHit;
        if (got <= 0)
            break;
        const char* data = buffer.constData();
        const char* end = data + got;
        // The end of a line begun in an earlier block.
        if (pending()) {
            const char* newline =
                static_cast<const char*>(std::memchr(data, '\n', size_t(end - data)));
            if (!newline) {
                addToLine(data, end - data);
                continue;
            }
            if (lineNumber % pollInterval == 0 && stopRequested())
                return hasHit;
            addToLine(data, newline - data);
            finishLine(true);
            if (stopped)
                return hasHit;
            data = newline + 1;
        }
        const char* lastNewline =
            static_cast<const char*>(memrchr(data, '\n', size_t(end - data)));
        const char* whole = lastNewline ? lastNewline + 1 : data;
        if (!scanLines(data, whole))
            return hasHit;
        addToLine(whole, end - whole);
    }
    if (pending()) {
        if (lineNumber % pollInterval == 0 && stopRequested())
            return hasHit;
        finishLine(false);
    }
    return hasHit;
}

bool FifLineScanner::scanDecoded(QIODevice& device, QStringConverter::Encoding encoding,
                                 int unitBytes, const MatchSink& sink,
                                 const StopPoll& shouldStop)
{
    bool hasHit = false;
    // The byte-order mark has been skipped; a U+FEFF that follows it, or that
    // starts a later block, is text.
    QStringDecoder decoder(encoding, QStringDecoder::Flag::Stateless
                                         | QStringDecoder::Flag::ConvertInitialBom);
    // Stateless decoding would spoil a code unit split between reads, so
    // only whole code units are decoded and the rest is carried over.
    QByteArray carry;
    QString line;
    bool overlong = false;
    qint64 skippedChars = 0;
    bool endsWithCR = false;
    const qint64 maxLineChars = qMax<qint64>(maxLineBytes / 2, 1);

    auto stopRequested = [&] { return shouldStop && shouldStop(); };

    auto finishLine = [&](bool hasNewline) {
        int terminator = hasNewline ? 1 : 0;
        if (hasNewline && endsWithCR) {
            terminator = 2;
            // Once a line is over-long, its last characters are skipped ones.
            if (overlong)
                --skippedChars;
            else
                line.chop(1);
        }
        if (matchLine(line, terminator, skippedChars, sink, shouldStop))
            hasHit = true;
        line.clear();
        overlong = false;
        skippedChars = 0;
        endsWithCR = false;
    };

    auto addToLine = [&](QStringView chars) {
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
                ++skippedChars;
            }
        }
        skippedChars += chars.size() - take;
    };

    bool firstBlock = true;
    while (true) {
        if (!firstBlock && stopRequested())
            return hasHit;
        firstBlock = false;
        const QByteArray block = device.read(blockSize);
        if (block.isEmpty())
            break;
        QByteArray bytes = carry + block;
        carry.clear();
        const qsizetype odd = bytes.size() % unitBytes;
        if (odd) {
            carry = bytes.right(odd);
            bytes.chop(odd);
        }
        const QString text = decoder.decode(bytes);
        const QStringView view(text);
        qsizetype start = 0;
        while (start < view.size()) {
            const qsizetype newline = view.indexOf(QLatin1Char('\n'), start);
            if (newline < 0) {
                addToLine(view.mid(start));
                break;
            }
            if (lineNumber % pollInterval == 0 && stopRequested())
                return hasHit;
            addToLine(view.mid(start, newline - start));
            finishLine(true);
            if (stopped)
                return hasHit;
            start = newline + 1;
        }
    }
    // A file that ends inside a code unit ends with an undecodable character.
    if (!carry.isEmpty()) {
        const QChar replacement(QChar::ReplacementCharacter);
        addToLine(QStringView(&replacement, 1));
    }
    if (!line.isEmpty() || overlong) {
        if (lineNumber % pollInterval == 0 && stopRequested())
            return hasHit;
        finishLine(false);
    }
    return hasHit;
}

} // namespace Orba
} // namespace Gui
