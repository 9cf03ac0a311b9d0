#include "FifLineScanner.h"

#include <QIODevice>
#include <QStringDecoder>

#include <climits>
#include <cstring>

namespace Gui {
namespace Orba {

namespace {

constexpr qint64 blockSize = 256 * 1024;

int clampToInt(qint64 value)
{
    return value > INT_MAX ? INT_MAX : int(value);
}

// A U+FEFF inside the text is a character like any other. QString::fromUtf8
// and Qt's decoders drop one at the start of what they are given, which would
// lose it from every line (or block) that begins with it; the file's own
// byte-order mark is skipped before decoding starts.
QString decodeUtf8(const char* bytes, qsizetype size)
{
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless
                                                     | QStringDecoder::Flag::ConvertInitialBom);
    return decoder.decode(QByteArrayView(bytes, size));
}

bool isContinuationByte(char c)
{
    return (uchar(c) & 0xC0) == 0x80;
}

// Characters that `bytes` decode to. Long runs are decoded in pieces cut
// before a byte that starts a sequence, so no sequence is split.
qint64 utf8Length(const char* bytes, qint64 size)
{
    qint64 length = 0;
    while (size > 0) {
        qint64 piece = qMin<qint64>(size, 1024 * 1024);
        while (piece < size && piece > 1 && isContinuationByte(bytes[piece]))
            --piece;
        length += decodeUtf8(bytes, piece).size();
        bytes += piece;
        size -= piece;
    }
    return length;
}

} // namespace

FifLineScanner::FifLineScanner(const QRegExp& expression)
    : rx(expression)
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
    const QByteArray head = device.peek(3);
    if (head.startsWith("\xFF\xFE") || head.startsWith("\xFE\xFF")) {
        device.skip(2);
        return scanUtf16(device, head.at(0) == '\xFE', sink, shouldStop);
    }
    if (head.startsWith("\xEF\xBB\xBF"))
        device.skip(3);
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
    QByteArray block;
    QByteArray line;          // the kept part of the line being read
    qint64 skippedChars = 0;  // characters of an overlong line beyond the kept part
    QByteArray pendingTail;   // bytes of an overlong line not yet counted

    auto finishLine = [&](bool hasNewline) {
        int terminator = 0;
        if (hasNewline) {
            terminator = 1;
            // The "\r" of "\r\n" may sit in the kept part or in the tail.
            if (!pendingTail.isEmpty() && pendingTail.endsWith('\r')) {
                pendingTail.chop(1);
                terminator = 2;
            } else if (pendingTail.isEmpty() && skippedChars == 0 && line.endsWith('\r')) {
                line.chop(1);
                terminator = 2;
            }
        }
        if (!pendingTail.isEmpty()) {
            skippedChars += utf8Length(pendingTail.constData(), pendingTail.size());
            pendingTail.clear();
        }
        if (matchLine(decodeUtf8(line.constData(), line.size()), terminator, skippedChars,
                      sink, shouldStop))
            hasHit = true;
        line.clear();
        skippedChars = 0;
    };

    // Adds bytes of the current line, keeping at most maxLineBytes of them.
    auto addToLine = [&](const char* bytes, qint64 size) {
        const qint64 room = maxLineBytes - line.size();
        if (skippedChars == 0 && pendingTail.isEmpty() && size <= room) {
            line.append(bytes, size);
            return;
        }
        if (skippedChars == 0 && pendingTail.isEmpty()) {
            // Cut before a byte that starts a sequence, so the kept part
            // decodes as it would within the whole line.
            qint64 keep = room;
            while (keep > 0 && isContinuationByte(bytes[keep]))
                --keep;
            line.append(bytes, keep);
            bytes += keep;
            size -= keep;
        }
        pendingTail.append(bytes, size);
        // Count the tail in pieces; keep the last bytes back, as they may
        // be the "\r" of the terminator or part of a sequence.
        if (pendingTail.size() > blockSize) {
            qint64 cut = pendingTail.size() - 8;
            while (cut > 0 && isContinuationByte(pendingTail.at(cut)))
                --cut;
            skippedChars += utf8Length(pendingTail.constData(), cut);
            pendingTail.remove(0, cut);
        }
    };

    while (true) {
        block = device.read(blockSize);
        if (block.isEmpty())
            break;
        const char* data = block.constData();
        const char* end = data + block.size();
        while (data < end) {
            const char* newline =
                static_cast<const char*>(std::memchr(data, '\n', size_t(end - data)));
            if (!newline) {
                addToLine(data, end - data);
                break;
            }
            if (lineNumber % pollInterval == 0 && shouldStop && shouldStop())
                return hasHit;
            addToLine(data, newline - data);
            finishLine(true);
            if (stopped)
                return hasHit;
            data = newline + 1;
        }
    }
    if (!line.isEmpty() || !pendingTail.isEmpty() || skippedChars > 0) {
        if (!(lineNumber % pollInterval == 0 && shouldStop && shouldStop()))
            finishLine(false);
    }
    return hasHit;
}

bool FifLineScanner::scanUtf16(QIODevice& device, bool bigEndian, const MatchSink& sink,
                               const StopPoll& shouldStop)
{
    bool hasHit = false;
    QStringDecoder decoder(bigEndian ? QStringDecoder::Utf16BE : QStringDecoder::Utf16LE,
                           QStringDecoder::Flag::Stateless
                               | QStringDecoder::Flag::ConvertInitialBom);
    // Stateless would lose a code unit split across reads, so keep whole
    // code units: read an even number of bytes and carry an odd one over.
    QByteArray carry;
    QString line;
    qint64 skippedChars = 0;

    auto finishLine = [&](bool hasNewline) {
        int terminator = 0;
        if (hasNewline) {
            terminator = 1;
            if (line.endsWith(QLatin1Char('\r')) && skippedChars == 0) {
                line.chop(1);
                terminator = 2;
            }
        }
        if (matchLine(line, terminator, skippedChars, sink, shouldStop))
            hasHit = true;
        line.clear();
        skippedChars = 0;
    };

    const qint64 maxLineChars = maxLineBytes / 2;
    while (true) {
        QByteArray bytes = carry + device.read(blockSize);
        if (bytes.isEmpty())
            break;
        carry.clear();
        if (bytes.size() % 2) {
            carry = bytes.right(1);
            bytes.chop(1);
        }
        if (bytes.isEmpty())
            break;
        const QString text = decoder.decode(bytes);
        qsizetype start = 0;
        while (start < text.size()) {
            const qsizetype newline = text.indexOf(QLatin1Char('\n'), start);
            const qsizetype stop = newline < 0 ? text.size() : newline;
            const qsizetype room = maxLineChars - line.size();
            const qsizetype take = skippedChars ? 0 : qMin<qsizetype>(room, stop - start);
            line.append(QStringView(text).mid(start, take));
            skippedChars += (stop - start) - take;
            if (newline < 0)
                break;
            if (lineNumber % pollInterval == 0 && shouldStop && shouldStop())
                return hasHit;
            finishLine(true);
            if (stopped)
                return hasHit;
            start = newline + 1;
        }
    }
    // An odd byte at the end decodes as a replacement character.
    if (!carry.isEmpty())
        line.append(QChar::ReplacementCharacter);
    if (!line.isEmpty() || skippedChars > 0) {
        if (!(lineNumber % pollInterval == 0 && shouldStop && shouldStop()))
            finishLine(false);
    }
    return hasHit;
}

} // namespace Orba
} // namespace Gui
