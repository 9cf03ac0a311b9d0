// The text test and the line scanner on arbitrary file contents. Both are
// checked against a plain reading of the same bytes written here on its own:
// split at "\n", a "\r" before it belongs to the terminator, UTF-8 unless a
// UTF-16 or UTF-32 byte-order mark says otherwise, a UTF-8 byte-order mark
// skipped.
//
// Input: byte 0 picks the expression, byte 1 when the scan is stopped; the
// rest is the file.

#include "FifLineScanner.h"
#include "FifWorker.h"

#include <QBuffer>
#include <QByteArray>
#include <QFile>
#include <QFileInfo>
#include <QList>
#include <QStringDecoder>
#include <QtCore5Compat/QRegExp>

#include <cstdio>
#include <cstdlib>
#include <unistd.h>

using Gui::Orba::FifLineScanner;
using Gui::Orba::FifWorker;

namespace {

struct Line
{
    QString text;
    int terminator; // bytes or characters of "\n" / "\r\n" as stored: 0, 1 or 2
};

// The last part is what follows the last line break: a line only if not empty.
QList<Line> splitLines(const QList<QString>& parts)
{
    QList<Line> lines;
    for (qsizetype i = 0; i < parts.size(); ++i) {
        QString text = parts.at(i);
        const bool last = i == parts.size() - 1;
        if (last) {
            if (!text.isEmpty())
                lines.append({text, 0});
            continue;
        }
        int terminator = 1;
        if (text.endsWith(QLatin1Char('\r'))) {
            text.chop(1);
            terminator = 2;
        }
        lines.append({text, terminator});
    }
    return lines;
}

// UTF-8 as it stands: a U+FEFF is kept wherever it is.
QString fromUtf8(const QByteArray& bytes)
{
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless
                                                     | QStringDecoder::Flag::ConvertInitialBom);
    return decoder.decode(bytes);
}

QList<Line> referenceLines(const QByteArray& bytes)
{
    // A UTF-32 byte-order mark (checked first: "FF FE 00 00" also starts
    // like UTF-16's); an unfinished last code unit reads as U+FFFD.
    const bool utf32LE = bytes.startsWith(QByteArray("\xFF\xFE\x00\x00", 4));
    if (utf32LE || bytes.startsWith(QByteArray("\x00\x00\xFE\xFF", 4))) {
        QByteArray body = bytes.mid(4);
        const bool unfinished = body.size() % 4 != 0;
        body.chop(body.size() % 4);
        QStringDecoder decoder(utf32LE ? QStringDecoder::Utf32LE : QStringDecoder::Utf32BE,
                               QStringDecoder::Flag::Stateless
                                   | QStringDecoder::Flag::ConvertInitialBom);
        QString text = decoder.decode(body);
        if (unfinished)
            text.append(QChar::ReplacementCharacter);
        return splitLines(text.split(QLatin1Char('\n')));
    }
    if (bytes.startsWith("\xFF\xFE") || bytes.startsWith("\xFE\xFF")) {
        const bool bigEndian = bytes.at(0) == '\xFE';
        QString text;
        qsizetype i = 2;
        for (; i + 1 < bytes.size(); i += 2) {
            const uchar first = uchar(bytes.at(i));
            const uchar second = uchar(bytes.at(i + 1));
            text.append(QChar(char16_t(bigEndian ? (first << 8 | second) : (second << 8 | first))));
        }
        if (i < bytes.size())
            text.append(QChar::ReplacementCharacter);
        return splitLines(text.split(QLatin1Char('\n')));
    }
    const QByteArray body = bytes.startsWith("\xEF\xBB\xBF") ? bytes.mid(3) : bytes;
    const QList<QByteArray> parts = body.split('\n');
    QList<Line> lines;
    for (qsizetype i = 0; i < parts.size(); ++i) {
        QByteArray part = parts.at(i);
        if (i == parts.size() - 1) {
            if (!part.isEmpty())
                lines.append({fromUtf8(part), 0});
            continue;
        }
        int terminator = 1;
        if (part.endsWith('\r')) {
            part.chop(1);
            terminator = 2;
        }
        lines.append({fromUtf8(part), terminator});
    }
    return lines;
}

QList<FifLineScanner::Match> referenceMatches(const QList<Line>& lines, QRegExp rx,
                                              int lastLine)
{
    QList<FifLineScanner::Match> matches;
    qint64 offset = 0;
    qint64 rawOffset = 0;
    int number = 1;
    for (const Line& line : lines) {
        if (number > lastLine)
            break;
        const int position = rx.indexIn(line.text, 0, QRegExp::CaretAtZero);
        if (position >= 0)
            matches.append({number, int(offset + position), int(rawOffset + position), line.text});
        offset += line.text.size() + (line.terminator ? 1 : 0);
        rawOffset += line.text.size() + line.terminator;
        ++number;
    }
    return matches;
}

bool referenceIsText(const QByteArray& bytes)
{
    QStringConverter::Encoding encoding = QStringConverter::Utf8;
    qsizetype skip = 0;
    if (bytes.startsWith("\xEF\xBB\xBF")) {
        skip = 3;
    } else if (bytes.startsWith(QByteArray("\xFF\xFE\x00\x00", 4))) {
        encoding = QStringConverter::Utf32LE;
        skip = 4;
    } else if (bytes.startsWith(QByteArray("\x00\x00\xFE\xFF", 4))) {
        encoding = QStringConverter::Utf32BE;
        skip = 4;
    } else if (bytes.startsWith("\xFF\xFE")) {
        encoding = QStringConverter::Utf16LE;
        skip = 2;
    } else if (bytes.startsWith("\xFE\xFF")) {
        encoding = QStringConverter::Utf16BE;
        skip = 2;
    }
    QStringDecoder decoder(encoding, QStringDecoder::Flag::Stateless);
    const QString text = decoder.decode(bytes.mid(skip));
    QList<QString> lines = text.split(QLatin1Char('\n'));
    if (lines.constLast().isEmpty())
        lines.removeLast(); // nothing after the last line break
    for (qsizetype i = 0; i < lines.size() && i < 20; ++i) {
        for (const QChar c : lines.at(i)) {
            if (c.category() == QChar::Other_Control && !c.isSpace())
                return false;
        }
    }
    return true;
}

QRegExp expression(uchar selector)
{
    QRegExp rx;
    rx.setCaseSensitivity(selector & 0x80 ? Qt::CaseSensitive : Qt::CaseInsensitive);
    switch (selector % 10) {
    case 0: rx.setPatternSyntax(QRegExp::FixedString); rx.setPattern(QStringLiteral("a")); break;
    case 1: rx.setPatternSyntax(QRegExp::RegExp2); rx.setPattern(QStringLiteral("^")); break;
    case 2: rx.setPatternSyntax(QRegExp::RegExp2); rx.setPattern(QStringLiteral("b+$")); break;
    case 3: rx.setPatternSyntax(QRegExp::RegExp2); rx.setPattern(QStringLiteral("a+\\bx|(b)\\1$")); break;
    case 4: rx.setPatternSyntax(QRegExp::FixedString); rx.setPattern(QStringLiteral("\r")); break;
    case 5: rx.setPatternSyntax(QRegExp::RegExp2); rx.setPattern(QStringLiteral("[^\\x0001-\\x007f]")); break;
    case 6: rx.setPatternSyntax(QRegExp::FixedString); rx.setPattern(QStringLiteral("ab")); break;
    case 7: rx.setPatternSyntax(QRegExp::FixedString); rx.setPattern(QString(QChar(0))); break;
    case 8: rx.setPatternSyntax(QRegExp::FixedString); rx.setPattern(QString(QChar(0xFEFF))); break;
    default: rx.setPatternSyntax(QRegExp::FixedString); rx.setPattern(QString(QChar::ReplacementCharacter)); break;
    }
    return rx;
}

bool same(const QList<FifLineScanner::Match>& a, const QList<FifLineScanner::Match>& b)
{
    if (a.size() != b.size())
        return false;
    for (qsizetype i = 0; i < a.size(); ++i) {
        if (a[i].line != b[i].line || a[i].offset != b[i].offset
            || a[i].rawOffset != b[i].rawOffset || a[i].text != b[i].text)
            return false;
    }
    return true;
}

[[noreturn]] void fail(const char* what, const QList<FifLineScanner::Match>& got,
                       const QList<FifLineScanner::Match>& want)
{
    std::fprintf(stderr, "mismatch: %s\n", what);
    for (const auto& m : got)
        std::fprintf(stderr, "  got  line %d offset %d raw %d text %s\n", m.line, m.offset,
                     m.rawOffset, m.text.toUtf8().toHex().constData());
    for (const auto& m : want)
        std::fprintf(stderr, "  want line %d offset %d raw %d text %s\n", m.line, m.offset,
                     m.rawOffset, m.text.toUtf8().toHex().constData());
    std::abort();
}

QString scratchFile()
{
    static const QString path =
        QStringLiteral("/tmp/fif_fuzz_scanner.%1").arg(QString::number(::getpid()));
    return path;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    const uchar rxSelector = data[0];
    const int stopAtPoll = data[1] % 4 + 1;
    const QByteArray bytes(reinterpret_cast<const char*>(data) + 2, qsizetype(size - 2));

    // The text test, through a real file.
    {
        QFile file(scratchFile());
        if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate)
            || file.write(bytes) != bytes.size())
            std::abort();
        file.close();
        const bool text = FifWorker::isTextFile(QFileInfo(scratchFile()));
        if (text != referenceIsText(bytes)) {
            std::fprintf(stderr, "text test says %d for %s\n", int(text),
                         bytes.toHex().constData());
            std::abort();
        }
    }

    const QRegExp rx = expression(rxSelector);
    const QList<Line> lines = referenceLines(bytes);

    // A full scan.
    {
        QByteArray copy = bytes;
        QBuffer buffer(&copy);
        buffer.open(QIODevice::ReadOnly);
        QList<FifLineScanner::Match> got;
        FifLineScanner scanner(rx);
        const bool hasHit = scanner.scan(
            buffer, [&](const FifLineScanner::Match& m) { got.append(m); }, [] { return false; });
        const QList<FifLineScanner::Match> want = referenceMatches(lines, rx, INT_MAX);
        if (!same(got, want))
            fail("full scan", got, want);
        if (hasHit != !want.isEmpty())
            fail("hasHit", got, want);
    }

    // A scan stopped at a poll: a prefix of the full hits, and no hit once a
    // poll has asked it to stop. Polls come at least once for every 100
    // lines passed, at block reads and, on long lines, before each start
    // position tried; lines passed over together may share one poll.
    {
        QByteArray copy = bytes;
        QBuffer buffer(&copy);
        buffer.open(QIODevice::ReadOnly);
        QList<FifLineScanner::Match> got;
        int polls = 0;
        qsizetype hitsAtStop = -1;
        FifLineScanner scanner(rx);
        scanner.scan(
            buffer, [&](const FifLineScanner::Match& m) { got.append(m); },
            [&] {
                if (++polls < stopAtPoll)
                    return false;
                if (hitsAtStop < 0)
                    hitsAtStop = got.size();
                return true;
            });
        const QList<FifLineScanner::Match> full = referenceMatches(lines, rx, INT_MAX);
        const QList<FifLineScanner::Match> want = full.mid(0, got.size());
        if (!same(got, want))
            fail("stopped scan", got, want);
        if (polls < stopAtPoll && got.size() != full.size())
            fail("scan ended early without a stop", got, full);
        if (hitsAtStop >= 0 && got.size() != hitsAtStop)
            fail("hit after the stop", got, want);
    }
    return 0;
}
