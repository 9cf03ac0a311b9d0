#include "FifRegExpTranslator.h"

#include <QStringList>

#include <algorithm>

namespace Gui {
namespace Orba {

namespace {

// Deeper nesting is left to QRegExp rather than risk PCRE2's limits.
constexpr int maxDepth = 50;
// QRegExp takes larger counts too; beyond this PCRE2's compiled code grows
// for little use.
constexpr int maxRepeat = 1000;

bool isAsciiDigit(QChar c)
{
    return c >= QLatin1Char('0') && c <= QLatin1Char('9');
}

bool isHexDigit(QChar c)
{
    return isAsciiDigit(c) || (c >= QLatin1Char('a') && c <= QLatin1Char('f'))
           || (c >= QLatin1Char('A') && c <= QLatin1Char('F'));
}

void writeByte(int c, QByteArray& out)
{
    out += "\\x{" + QByteArray::number(c, 16) + '}';
}

// Whether a character beyond ASCII occurs in `p`, as itself or written as
// \xhhhh or \0ooo.
bool namesNonAscii(const QString& p)
{
    for (qsizetype j = 0; j < p.size(); ++j) {
        if (p.at(j).unicode() >= 0x80)
            return true;
        if (p.at(j) != QLatin1Char('\\') || j + 1 >= p.size())
            continue;
        ++j;
        const bool hex = p.at(j) == QLatin1Char('x');
        if (!hex && p.at(j) != QLatin1Char('0'))
            continue;
        uint value = 0;
        for (int n = 0; n < (hex ? 4 : 3) && j + 1 < p.size(); ++n) {
            const QChar d = p.at(j + 1);
            if (hex ? !isHexDigit(d) : !(d >= QLatin1Char('0') && d <= QLatin1Char('7')))
                break;
            const char16_t c = d.unicode();
            value = value * (hex ? 16 : 8) + (isAsciiDigit(d) ? c - '0' : (c | 0x20) - 'a' + 10);
            ++j;
        }
        if (value >= 0x80)
            return true;
    }
    return false;
}

} // namespace

QByteArray FifRegExpTranslator::toPcre(const QRegExp& rx)
{
    if (!rx.isValid() || rx.patternSyntax() != QRegExp::RegExp2)
        return QByteArray();
    // Without case QRegExp equates some characters beyond ASCII with ASCII
    // letters in some places of an expression and not in others ("ſ"
    // finds "s", "ſ+" does not): such expressions are left to it.
    if (rx.caseSensitivity() == Qt::CaseInsensitive && namesNonAscii(rx.pattern()))
        return QByteArray();
    FifRegExpTranslator translator(rx);
    QByteArray out;
    if (!translator.alternatives(out, 0) || translator.i != translator.p.size())
        return QByteArray();
    return out;
}

FifRegExpTranslator::FifRegExpTranslator(const QRegExp& rx)
    : p(rx.pattern())
    , cs(rx.caseSensitivity())
{
}

// Alternatives up to the end or a ")" (left for the caller).
bool FifRegExpTranslator::alternatives(QByteArray& out, int depth)
{
    if (depth > maxDepth)
        return false;
    for (;;) {
        bool done = false;
        while (!done) {
            if (!item(out, depth, &done))
                return false;
        }
        if (i >= p.size() || p.at(i) != QLatin1Char('|'))
            return true;
        out += '|';
        ++i;
    }
}

// One item and its quantifier; `done` at the end of a branch.
bool FifRegExpTranslator::item(QByteArray& out, int depth, bool* done)
{
    if (i >= p.size() || p.at(i) == QLatin1Char('|') || p.at(i) == QLatin1Char(')')) {
        *done = true;
        return true;
    }
    const QChar c = p.at(i);
    bool quantifiable = true;
    if (c == QLatin1Char('(')) {
        ++i;
        if (p.mid(i, 2) == QLatin1String("?:") || p.mid(i, 2) == QLatin1String("?=")
            || p.mid(i, 2) == QLatin1String("?!")) {
            quantifiable = p.at(i + 1) == QLatin1Char(':');
            out += "(?" + p.mid(i + 1, 1).toLatin1();
            i += 2;
        } else if (i < p.size() && p.at(i) == QLatin1Char('?')) {
            return false;
        } else {
            out += "(?:";  // nothing refers to the capture
        }
        const bool lookahead = !quantifiable;
        lookaheads += lookahead ? 1 : 0;
        if (!alternatives(out, depth + 1) || i >= p.size() || p.at(i) != QLatin1Char(')'))
            return false;
        lookaheads -= lookahead ? 1 : 0;
        out += ')';
        ++i;
    } else if (lookaheads > 0 && (c == QLatin1Char('^') || c == QLatin1Char('$')
                                  || p.mid(i, 2).compare(QLatin1String("\\b"), Qt::CaseInsensitive) == 0)) {
        // QRegExp tests \b and \B wrongly inside a look-ahead ("a(?!\B)"
        // matches "ab"); the anchors there are left to it as well.
        return false;
    } else if (c == QLatin1Char('^') || c == QLatin1Char('$')) {
        // QRegExp reads them as anchors wherever they stand; lines hold
        // no line break, so the start and the very end are all they mean.
        out += c == QLatin1Char('^') ? "\\A" : "\\z";
        quantifiable = false;
        ++i;
    } else if (p.mid(i, 2) == QLatin1String("\\b") || p.mid(i, 2) == QLatin1String("\\B")) {
        // Both engines' word characters among ASCII are letters, digits
        // and "_" (checked where the result is compiled).
        out += p.mid(i, 2).toLatin1();
        quantifiable = false;
        i += 2;
    } else {
        const qsizetype length = characterItemLength();
        AsciiSet set;
        if (length == 0 || !characterSet(p.mid(i, length), &set))
            return false;
        writeSet(set, out);
        i += length;
    }
    if (i < p.size() && QStringLiteral("*+?{").contains(p.at(i))) {
        if (!quantifiable || !quantifier(out))
            return false;
        // Nested quantifiers mean other things to the two engines.
        if (i < p.size() && QStringLiteral("*+?{").contains(p.at(i)))
            return false;
    }
    return true;
}

qsizetype FifRegExpTranslator::characterItemLength() const
{
    const QChar c = p.at(i);
    if (c == QLatin1Char('\\'))
        return escapeLength();
    if (c == QLatin1Char('['))
        return classLength();
    if (QStringLiteral("{}]*+?").contains(c))
        return 0;
    return 1;  // "." too
}

qsizetype FifRegExpTranslator::escapeLength() const
{
    if (i + 1 >= p.size())
        return 0;
    const QChar c = p.at(i + 1);
    if (c == QLatin1Char('x') || c == QLatin1Char('0')) {
        // As QRegExp reads them: up to four hex digits, up to three octal.
        const int most = c == QLatin1Char('x') ? 4 : 3;
        qsizetype n = 0;
        while (n < most && i + 2 + n < p.size()
               && (c == QLatin1Char('x') ? isHexDigit(p.at(i + 2 + n))
                                         : p.at(i + 2 + n) >= QLatin1Char('0')
                                               && p.at(i + 2 + n) <= QLatin1Char('7')))
            ++n;
        return c == QLatin1Char('x') && n == 0 ? 0 : 2 + n;
    }
    if (QStringLiteral("dDsSwWnrtfva").contains(c))
        return 2;
    // Other letters and digits are back references or letters QRegExp
    // reads as themselves, and left to it.
    if (c.unicode() < 0x80 && !c.isLetterOrNumber())
        return 2;
    return 0;
}

qsizetype FifRegExpTranslator::classLength() const
{
    qsizetype j = i + 1;
    if (j < p.size() && p.at(j) == QLatin1Char('^'))
        ++j;
    // A "]" first is a member to QRegExp; a "[" may start a POSIX class.
    if (j < p.size() && p.at(j) == QLatin1Char(']'))
        return 0;
    for (; j < p.size(); ++j) {
        if (p.at(j) == QLatin1Char('['))
            return 0;
        if (p.at(j) == QLatin1Char(']'))
            return j + 1 - i;
        if (p.at(j) == QLatin1Char('\\'))
            ++j;  // escapes carry no "]" beyond their first character
    }
    return 0;
}

bool FifRegExpTranslator::quantifier(QByteArray& out)
{
    const QChar q = p.at(i);
    if (q != QLatin1Char('{')) {
        out += char(q.unicode());
        ++i;
        return true;
    }
    const qsizetype close = p.indexOf(QLatin1Char('}'), i);
    if (close < 0)
        return false;
    const QStringList bounds = p.mid(i + 1, close - i - 1).split(QLatin1Char(','));
    if (bounds.size() > 2 || bounds.join(QString()).isEmpty())
        return false;
    for (const QString& bound : bounds) {
        if (bound.size() > 4 || !std::all_of(bound.begin(), bound.end(), isAsciiDigit)
            || bound.toInt() > maxRepeat)
            return false;
    }
    // "{,m}" is no quantifier to this PCRE2.
    QByteArray written = bounds.at(0).isEmpty() ? QByteArray("0") : bounds.at(0).toLatin1();
    if (bounds.size() == 2)
        written += ',' + bounds.at(1).toLatin1();
    out += '{' + written + '}';
    i = close + 1;
    return true;
}

bool FifRegExpTranslator::characterSet(const QString& item, AsciiSet* set)
{
    const auto known = sets.constFind(item);
    if (known != sets.constEnd()) {
        *set = *known;
        return true;
    }
    QRegExp one(item, cs, QRegExp::RegExp2);
    if (!one.isValid())
        return false;
    static const QString ascii = [] {
        QString all;
        for (char16_t c = 0; c < 128; ++c)
            all.append(QChar(c));
        return all;
    }();
    set->reset();
    for (int at = one.indexIn(ascii); at >= 0; at = one.indexIn(ascii, at + 1)) {
        // An item stands for one character; anything else is not understood.
        if (one.matchedLength() != 1)
            return false;
        set->set(size_t(at));
    }
    sets.insert(item, *set);
    return true;
}

void FifRegExpTranslator::writeSet(const AsciiSet& set, QByteArray& out)
{
    if (set.none()) {
        out += "(?!)";
        return;
    }
    if (set.all()) {
        out += "[\\x{0}-\\x{7f}]";
        return;
    }
    if (set.count() == 1 || set.count() == 2) {
        int first = 0;
        while (!set.test(size_t(first)))
            ++first;
        const int lower = first | 0x20;
        if (set.count() == 1) {
            writeByte(first, out);
            return;
        }
        // A letter in both cases: PCRE2 looks for such a pair faster.
        if (lower >= 'a' && lower <= 'z' && set.test(size_t(lower)) && set.test(size_t(lower & ~0x20))) {
            out += "(?i:";
            out += char(lower);
            out += ')';
            return;
        }
    }
    out += '[';
    for (int c = 0; c < 128; ++c) {
        if (!set.test(size_t(c)))
            continue;
        int last = c;
        while (last + 1 < 128 && set.test(size_t(last + 1)))
            ++last;
        writeByte(c, out);
        if (last > c) {
            out += '-';
            writeByte(last, out);
        }
        c = last;
    }
    out += ']';
}

} // namespace Orba
} // namespace Gui
