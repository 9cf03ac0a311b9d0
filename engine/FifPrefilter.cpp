#include "FifPrefilter.h"

#include <cstring>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Gui {
namespace Orba {

namespace {

bool isAsciiLetter(char16_t c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

// Parses a regular expression just far enough to collect the runs of plain
// characters that every match must contain in sequence. Anything it does not
// fully understand makes it give up (`ok` false), so that it never claims a
// run that a match could lack.
class LiteralRuns
{
public:
    explicit LiteralRuns(const QString& pattern)
        : p(pattern)
    {
    }

    // The runs of p[from, to); false when the pattern is not understood.
    bool parse(qsizetype from, qsizetype to, QStringList& runs)
    {
        QString run;
        auto endRun = [&] {
            if (!run.isEmpty())
                runs.append(run);
            run.clear();
        };
        qsizetype i = from;
        while (i < to) {
            const char16_t c = p.at(i).unicode();
            bool literal = false;
            char16_t literalChar = 0;
            qsizetype groupFrom = -1;
            qsizetype groupTo = -1;
            if (c == '\\') {
                if (i + 1 >= to)
                    return false;
                const char16_t d = p.at(i + 1).unicode();
                if (d < 0x80 && !isAsciiLetter(d) && !(d >= '0' && d <= '9')) {
                    literal = true;
                    literalChar = d;
                } else if (!QStringLiteral("dDsSwWbBnrtfva").contains(QChar(d))) {
                    return false;  // numbers, back references and the like
                }
                i += 2;
            } else if (c == '[') {
                qsizetype j = i + 1;
                if (j < to && p.at(j) == QLatin1Char('^'))
                    ++j;
                if (j < to && p.at(j) == QLatin1Char(']'))
                    return false;
                while (j < to && p.at(j) != QLatin1Char(']')) {
                    if (p.at(j) == QLatin1Char('['))
                        return false;
                    j += p.at(j) == QLatin1Char('\\') ? 2 : 1;
                }
                if (j >= to)
                    return false;
                i = j + 1;
            } else if (c == '(') {
                const qsizetype close = matchingParenthesis(i, to);
                if (close < 0)
                    return false;
                groupFrom = i + 1;
                groupTo = close;
                if (p.mid(groupFrom, 2) == QLatin1String("?:"))
                    groupFrom += 2;
                else if (p.at(groupFrom) == QLatin1Char('?'))
                    groupFrom = -1;  // a look-ahead tells nothing certain
                i = close + 1;
            } else if (c == '.' || c == '^' || c == '$') {
                ++i;
            } else if (c == '|' || c == ')' || c == ']' || c == '}' || c == '*' || c == '+'
                       || c == '?' || c == '{') {
                return false;
            } else {
                literal = c < 0x80;
                literalChar = c;
                ++i;
            }

            // The quantifier, if any, of the atom just read.
            int least = 1;
            if (i < to) {
                const char16_t q = p.at(i).unicode();
                if (q == '*' || q == '?') {
                    least = 0;
                    ++i;
                } else if (q == '+') {
                    least = -1;  // once at least, then more
                    ++i;
                } else if (q == '{') {
                    const qsizetype close = p.indexOf(QLatin1Char('}'), i);
                    if (close < 0 || close >= to)
                        return false;
                    const QString bounds = p.mid(i + 1, close - i - 1);
                    for (QChar b : bounds) {
                        if (!b.isDigit() && b != QLatin1Char(','))
                            return false;
                    }
                    const QString low = bounds.section(QLatin1Char(','), 0, 0);
                    least = (!low.isEmpty() && low.toInt() > 0) ? -1 : 0;
                    i = close + 1;
                }
                if (least != 1 && i < to
                    && QStringLiteral("*+?{").contains(p.at(i)))
                    return false;
            }

            if (groupFrom >= 0 && least != 0) {
                endRun();
                if (!parse(groupFrom, groupTo, runs))
                    return false;
            } else if (literal && least != 0) {
                run.append(QChar(literalChar));
                if (least < 0)
                    endRun();
            } else {
                endRun();
            }
        }
        endRun();
        return true;
    }

private:
    qsizetype matchingParenthesis(qsizetype open, qsizetype to)
    {
        int depth = 0;
        bool inClass = false;
        for (qsizetype j = open; j < to; ++j) {
            const QChar c = p.at(j);
            if (c == QLatin1Char('\\')) {
                ++j;
            } else if (inClass) {
                if (c == QLatin1Char(']'))
                    inClass = false;
            } else if (c == QLatin1Char('[')) {
                inClass = true;
            } else if (c == QLatin1Char('(')) {
                ++depth;
            } else if (c == QLatin1Char(')')) {
                if (--depth == 0)
                    return j;
            }
        }
        return -1;
    }

    const QString& p;
};

inline uchar fold(uchar c, uchar mask)
{
    return c | mask;
}

} // namespace

QString FifPrefilter::requiredLiteral(const QString& pattern)
{
    // With alternatives a run may lie in a branch that a match skips; the
    // parser does not follow branches, so it gives up on any '|'.
    for (qsizetype j = 0; j < pattern.size(); ++j) {
        if (pattern.at(j) == QLatin1Char('\\'))
            ++j;
        else if (pattern.at(j) == QLatin1Char('|'))
            return QString();
    }
    QStringList runs;
    LiteralRuns parser(pattern);
    if (!parser.parse(0, pattern.size(), runs))
        return QString();
    QString longest;
    for (const QString& run : qAsConst(runs)) {
        if (run.size() > longest.size())
            longest = run;
    }
    return longest;
}

FifPrefilter::FifPrefilter(const QRegExp& rx)
{
    if (!rx.isValid())
        return;
    QString literal;
    switch (rx.patternSyntax()) {
    case QRegExp::FixedString:
        literal = rx.pattern();
        break;
    case QRegExp::RegExp2:
        literal = requiredLiteral(rx.pattern());
        break;
    default:
        return;
    }
    for (QChar c : qAsConst(literal)) {
        // Lines hold no line feed; a needle with one is left to the exact
        // path rather than reasoned about.
        if (c.unicode() >= 0x80 || c == QLatin1Char('\n') || c.unicode() == 0)
            return;
    }
    const bool caseSensitive = rx.caseSensitivity() == Qt::CaseSensitive;
    needle = literal.toLatin1();
    exact = rx.patternSyntax() == QRegExp::FixedString && !needle.isEmpty();
    foldMask = QByteArray(needle.size(), '\0');
    if (!caseSensitive) {
        bool kelvin = false;
        bool longS = false;
        for (qsizetype i = 0; i < needle.size(); ++i) {
            const char c = needle.at(i);
            if (isAsciiLetter(char16_t(c))) {
                needle[i] = char(c | 0x20);
                foldMask[i] = 0x20;
                kelvin = kelvin || needle.at(i) == 'k';
                longS = longS || needle.at(i) == 's';
            }
        }
        if (kelvin)
            specials.append(QByteArray("\xE2\x84\xAA"));  // U+212A KELVIN SIGN
        if (longS)
            specials.append(QByteArray("\xC5\xBF"));  // U+017F LATIN SMALL LETTER LONG S
    }
}

const char* FifPrefilter::find(const char* begin, const char* end, Cursor& cursor) const
{
    if (!isActive() || begin >= end)
        return begin;
    const char* hit = findNeedle(begin, end);
    if (specials.isEmpty())
        return hit;
    if (cursor.end != end || !cursor.nextSpecial || cursor.nextSpecial < begin) {
        cursor.end = end;
        cursor.nextSpecial = findSpecial(begin, end);
    }
    return qMin(hit, cursor.nextSpecial);
}

const char* FifPrefilter::findSpecial(const char* begin, const char* end) const
{
    // Looks for the lead bytes of the specials, 16 bytes at a time, and
    // compares the sequences only where one is found.
    auto specialAt = [&](const char* at) {
        for (const QByteArray& special : specials) {
            if (end - at >= special.size()
                && std::memcmp(at, special.constData(), size_t(special.size())) == 0)
                return true;
        }
        return false;
    };
    const char* at = begin;
#ifdef __SSE2__
    const __m128i leadA = _mm_set1_epi8(specials.first().at(0));
    const __m128i leadB = _mm_set1_epi8(specials.last().at(0));
    for (; at + 16 <= end; at += 16) {
        const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i*>(at));
        unsigned bits = unsigned(_mm_movemask_epi8(
            _mm_or_si128(_mm_cmpeq_epi8(x, leadA), _mm_cmpeq_epi8(x, leadB))));
        while (bits) {
            const int bit = __builtin_ctz(bits);
            if (specialAt(at + bit))
                return at + bit;
            bits &= bits - 1;
        }
    }
#endif
    for (; at < end; ++at) {
        if (specialAt(at))
            return at;
    }
    return end;
}

const char* FifPrefilter::findNeedle(const char* begin, const char* end) const
{
    const qsizetype n = needle.size();
    if (end - begin < n)
        return end;
    const uchar* text = reinterpret_cast<const uchar*>(begin);
    const uchar* pat = reinterpret_cast<const uchar*>(needle.constData());
    const uchar* mask = reinterpret_cast<const uchar*>(foldMask.constData());
    const qsizetype last = (end - begin) - n;  // the last possible start

    auto matchesAt = [&](qsizetype at) {
        for (qsizetype k = 0; k < n; ++k) {
            if (fold(text[at + k], mask[k]) != pat[k])
                return false;
        }
        return true;
    };

    qsizetype at = 0;
#ifdef __SSE2__
    // Compares the first and the last byte of the needle with 16 starts at
    // once; only starts where both agree are compared in full.
    const __m128i firstByte = _mm_set1_epi8(char(pat[0]));
    const __m128i lastByte = _mm_set1_epi8(char(pat[n - 1]));
    const __m128i firstMask = _mm_set1_epi8(char(mask[0]));
    const __m128i lastMask = _mm_set1_epi8(char(mask[n - 1]));
    for (; at + 16 <= last + 1; at += 16) {
        const __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i*>(text + at));
        const __m128i b =
            _mm_loadu_si128(reinterpret_cast<const __m128i*>(text + at + n - 1));
        const __m128i eq = _mm_and_si128(
            _mm_cmpeq_epi8(_mm_or_si128(a, firstMask), firstByte),
            _mm_cmpeq_epi8(_mm_or_si128(b, lastMask), lastByte));
        unsigned bits = unsigned(_mm_movemask_epi8(eq));
        while (bits) {
            const int bit = __builtin_ctz(bits);
            if (matchesAt(at + bit))
                return begin + at + bit;
            bits &= bits - 1;
        }
    }
#endif
    for (; at <= last; ++at) {
        if (fold(text[at], mask[0]) == pat[0] && matchesAt(at))
            return begin + at;
    }
    return end;
}

} // namespace Orba
} // namespace Gui
