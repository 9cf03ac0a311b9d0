#pragma once

// A plain reading of a file's bytes, written apart from the engine so that
// the scanner, the text test and whole searches can be checked against it:
// the whole file decoded at once (UTF-8, or UTF-16 or UTF-32 after their
// byte-order mark; a UTF-8 mark is dropped), cut into lines at "\n", a "\r"
// before the "\n" being part of the terminator, and each line matched from
// its start.

#include <QList>
#include <QString>
#include <QStringDecoder>
#include <QtCore5Compat/QRegExp>

namespace FifReference {

struct Line
{
    QString text;
    int terminator;  // "\n" or "\r\n" as stored: 0 (the last line), 1 or 2
};

struct Match
{
    int line;
    int offset;     // line breaks counted as one character
    int rawOffset;  // line breaks counted as stored
    QString text;
    bool operator==(const Match& o) const
    {
        return line == o.line && offset == o.offset && rawOffset == o.rawOffset && text == o.text;
    }
};

inline QString decode(const QByteArray& bytes)
{
    struct Mark { QByteArrayView bytes; QStringConverter::Encoding encoding; int unit; };
    // UTF-32's little-endian mark starts like UTF-16's, so it comes first.
    const Mark marks[] = {{QByteArrayView("\xFF\xFE\0\0", 4), QStringConverter::Utf32LE, 4},
                          {QByteArrayView("\0\0\xFE\xFF", 4), QStringConverter::Utf32BE, 4},
                          {QByteArrayView("\xFF\xFE", 2), QStringConverter::Utf16LE, 2},
                          {QByteArrayView("\xFE\xFF", 2), QStringConverter::Utf16BE, 2},
                          {QByteArrayView("\xEF\xBB\xBF", 3), QStringConverter::Utf8, 1}};
    Mark found{QByteArrayView(), QStringConverter::Utf8, 1};
    for (const Mark& mark : marks) {
        if (bytes.startsWith(mark.bytes)) {
            found = mark;
            break;
        }
    }
    QByteArray body = bytes.mid(found.bytes.size());
    const qsizetype unfinished = body.size() % found.unit;
    body.chop(unfinished);
    QStringDecoder decoder(found.encoding, QStringDecoder::Flag::Stateless
                                               | QStringDecoder::Flag::ConvertInitialBom);
    QString text = decoder.decode(body);
    if (unfinished)
        text.append(QChar::ReplacementCharacter);
    return text;
}

inline QList<Line> lines(const QByteArray& bytes)
{
    const QStringList parts = decode(bytes).split(QLatin1Char('\n'));
    QList<Line> result;
    for (qsizetype i = 0; i + 1 < parts.size(); ++i) {
        const bool crlf = parts.at(i).endsWith(QLatin1Char('\r'));
        result.append({crlf ? parts.at(i).chopped(1) : parts.at(i), crlf ? 2 : 1});
    }
    if (!parts.constLast().isEmpty())
        result.append({parts.constLast(), 0});
    return result;
}

inline QList<Match> matches(const QByteArray& bytes, QRegExp rx)
{
    QList<Match> result;
    qint64 offset = 0;
    qint64 rawOffset = 0;
    int number = 0;
    for (const Line& line : lines(bytes)) {
        ++number;
        const int position = rx.indexIn(line.text, 0, QRegExp::CaretAtZero);
        if (position >= 0)
            result.append({number, int(offset + position), int(rawOffset + position), line.text});
        offset += line.text.size() + (line.terminator ? 1 : 0);
        rawOffset += line.text.size() + line.terminator;
    }
    return result;
}

// Text unless one of the first 20 lines holds a control character that is
// not white space.
inline bool isText(const QByteArray& bytes)
{
    const QList<Line> all = lines(bytes);
    for (qsizetype i = 0; i < all.size() && i < 20; ++i) {
        for (const QChar c : all.at(i).text) {
            if (c.category() == QChar::Other_Control && !c.isSpace())
                return false;
        }
    }
    return true;
}

} // namespace FifReference
