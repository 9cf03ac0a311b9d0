#pragma once

#include <QByteArray>
#include <QHash>
#include <QString>
#include <QtCore5Compat/QRegExp>

#include <bitset>

namespace Gui {
namespace Orba {

// Writes a QRegExp as a PCRE2 pattern that matches a line of ASCII
// characters exactly when the QRegExp does, so that PCRE2's compiled engine
// can decide such lines.
//
// Only the plainest part of the RegExp2 syntax is taken, where both engines
// ask the same of a line: characters, escapes and classes, ".", groups
// (capturing, "(?:", and the look-aheads "(?=" and "(?!"), alternatives,
// the quantifiers * + ? and {n,m} on characters and groups, the anchors ^
// and $ and the word boundaries \b and \B (not inside a look-ahead, where
// QRegExp does not test them as it does outside). Whether a match exists
// does not depend on which of several matches an engine prefers, so greedy
// or not does not matter here. Without case, the expression must name
// ASCII characters only: QRegExp folds the others differently from place
// to place. Anything else (back references, a class holding "[" or
// starting with "]", an escaped letter QRegExp reads as itself, nested
// quantifiers) makes the translation give up.
//
// What each character item matches is not worked out from the syntax but
// asked of QRegExp itself, item by item, for each of the 128 ASCII
// characters, with the expression's own case sensitivity; the item becomes
// that set. So case folding, \w, \s, \d, ranges, negation and QRegExp's
// own escapes (\0ooo, \xhhhh) mean in the result exactly what they mean to
// QRegExp on such lines. The result is compiled without options: no "."
// nor ^ $ of PCRE2's whose meaning depends on them is used (\A and \z
// stand for ^ and $).
class FifRegExpTranslator
{
public:
    // Empty when `rx` is not a valid RegExp2 expression of that kind.
    static QByteArray toPcre(const QRegExp& rx);

private:
    using AsciiSet = std::bitset<128>;

    FifRegExpTranslator(const QRegExp& rx);

    bool alternatives(QByteArray& out, int depth);
    bool item(QByteArray& out, int depth, bool* done);
    // A character item starting at `i`: its length in the pattern, 0 when
    // none that is taken starts there.
    qsizetype characterItemLength() const;
    qsizetype escapeLength() const;
    qsizetype classLength() const;
    bool quantifier(QByteArray& out);
    bool characterSet(const QString& item, AsciiSet* set);
    static void writeSet(const AsciiSet& set, QByteArray& out);

    const QString p;
    const Qt::CaseSensitivity cs;
    qsizetype i = 0;
    int lookaheads = 0;  // look-aheads around the item read
    QHash<QString, AsciiSet> sets;
};

} // namespace Orba
} // namespace Gui
