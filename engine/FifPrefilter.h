#pragma once

#include <QByteArray>
#include <QList>
#include <QStringList>
#include <QtCore5Compat/QRegExp>

namespace Gui {
namespace Orba {

// Finds, in raw UTF-8 bytes, where a line may match an expression, so that the
// scan decodes and matches only those lines and passes over the rest unread.
//
// It looks for a piece of ASCII text that every match must contain (the
// literal itself, the longest run of a wildcard pattern between its '*' and
// '?', or a run of plain characters that a simple regular expression
// requires). ASCII characters in UTF-8 are single bytes that occur nowhere
// else, so a line whose bytes lack that piece cannot match. Without case
// QRegExp also equates "k" with U+212A KELVIN SIGN and "s" with U+017F LATIN
// SMALL LETTER LONG S; a line holding one of those is always a candidate.
// Expressions without such a piece (non-ASCII text, alternatives, "*") get an
// inactive prefilter: every line is then matched.
class FifPrefilter
{
public:
    explicit FifPrefilter(const QRegExp& expression);

    bool isActive() const { return !needle.isEmpty(); }
    // The piece every match contains; empty when inactive.
    QByteArray getNeedle() const { return needle; }
    // Whether the needle is the whole expression (a literal of ASCII
    // characters): in a line of ASCII characters the first place found is
    // then the first match, and the needle's length its length.
    bool isExact() const { return exact; }

    // Remembers where the special characters were last seen, so that a
    // buffer is searched for them once, not once per candidate.
    struct Cursor
    {
        const char* end = nullptr;
        const char* nextSpecial = nullptr;  // null: not looked for yet
    };

    // The first byte in [begin, end) of a possible match: every line lying in
    // the range whose text matches holds a byte at or after the result. `end`
    // when no line in the range can match. An inactive prefilter returns
    // `begin`. The cursor must be reset (default-made) for each new buffer.
    const char* find(const char* begin, const char* end, Cursor& cursor) const;

    // The piece of text that every match of the regular expression `pattern`
    // (QRegExp's RegExp2 syntax) contains; empty when none can be told.
    static QString requiredLiteral(const QString& pattern);

private:
    const char* findNeedle(const char* begin, const char* end) const;
    const char* findSpecial(const char* begin, const char* end) const;

    QByteArray needle;  // lower case when case is ignored
    // 0x20 where the needle's byte is a letter compared without case.
    QByteArray foldMask;
    QList<QByteArray> specials;  // UTF-8 of the non-ASCII equivalents
    bool exact = false;
};

} // namespace Orba
} // namespace Gui
