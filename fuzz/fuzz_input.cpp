// FifInput::getRegExp, isValid and toString on arbitrary requests.
//
// Input: byte 0 the match type, byte 1 the flags, then UTF-8 text cut at zero
// bytes into `what`, `where`, `filter` and a sample line. Matching is only
// tried on short texts: Qt's backtracking engine is exponential on some
// patterns by nature, which is not what this target looks for.

#include "FifInput.h"

#include <QList>
#include <QString>
#include <QtCore5Compat/QRegExp>

#include <cstdio>
#include <cstdlib>
#include <cstring>

using Gui::Orba::FifInput;

namespace {

constexpr int maxMatchedLength = 24;

int readInt(const uint8_t* data, size_t size, size_t at)
{
    int value = 0;
    if (at + sizeof value <= size)
        std::memcpy(&value, data + at, sizeof value);
    return value;
}

// Leftmost position where the wildcard pattern (only '*' and '?' special)
// matches part of `text`, or -1: a plain dynamic programme over both strings.
int wildcardIndex(const QString& pattern, const QString& text)
{
    const qsizetype p = pattern.size();
    for (qsizetype start = 0; start <= text.size(); ++start) {
        // can[j]: pattern[0, j) matches some text[start, k) for the current k
        QList<bool> can(p + 1, false);
        can[0] = true;
        for (qsizetype j = 1; j <= p && pattern.at(j - 1) == QLatin1Char('*'); ++j)
            can[j] = true;
        if (can[p])
            return int(start);
        for (qsizetype k = start; k < text.size(); ++k) {
            QList<bool> next(p + 1, false);
            for (qsizetype j = 1; j <= p; ++j) {
                const QChar c = pattern.at(j - 1);
                if (c == QLatin1Char('*'))
                    next[j] = next[j - 1] || can[j];
                else
                    next[j] = can[j - 1] && (c == QLatin1Char('?') || c == text.at(k));
            }
            can = next;
            if (can[p])
                return int(start);
        }
    }
    return -1;
}

[[noreturn]] void fail(const char* what, const FifInput& input)
{
    std::fprintf(stderr, "%s: what=%s type=%d case=%d word=%d\n", what,
                 input.what.toUtf8().toHex().constData(), input.matchType, input.matchCase,
                 int(input.matchWord));
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    FifInput input;
    switch (data[0] % 5) {
    case 0: input.matchType = QRegExp::FixedString; break;
    case 1: input.matchType = QRegExp::Wildcard; break;
    case 2: input.matchType = QRegExp::RegExp2; break;
    case 3: input.matchType = data[0] / 5 % 8; break; // every QRegExp syntax
    default: input.matchType = readInt(data, size, 2); break;
    }
    const uchar flags = data[1];
    input.matchCase = flags & 1 ? Qt::CaseSensitive : Qt::CaseInsensitive;
    if (flags & 2)
        input.matchCase = readInt(data, size, 6);
    input.matchWord = flags & 4;
    input.includeSubFolders = flags & 8;

    const QString text = QString::fromUtf8(reinterpret_cast<const char*>(data) + 2,
                                           qsizetype(size - 2));
    const QList<QString> parts = text.split(QChar(0));
    input.what = parts.value(0);
    input.where = parts.value(1);
    input.filter = parts.value(2);
    QString sample = parts.value(3);
    sample.remove(QLatin1Char('\n'));
    sample.remove(QLatin1Char('\r'));

    const QRegExp rx = input.getRegExp();
    const bool caseSensitive = input.matchCase == Qt::CaseSensitive;
    if (rx.caseSensitivity() != (caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive))
        fail("case sensitivity", input);

    const bool valid = input.isValid();
    if (valid != (!input.what.isEmpty() && rx.isValid()))
        fail("validity", input);
    // Literal text and wildcards are escaped, so Qt must accept them.
    const bool escaped =
        input.matchType == QRegExp::FixedString || input.matchType == QRegExp::Wildcard;
    if (escaped && !input.what.isEmpty() && !valid)
        fail("escaped pattern rejected", input);

    const QString description = input.toString();
    if (description.isEmpty() != input.what.isEmpty())
        fail("description empty", input);
    if (!input.what.isEmpty() && !description.contains(input.what))
        fail("description lacks the text", input);

    if (input.what.size() > maxMatchedLength || sample.size() > maxMatchedLength)
        return 0;
    const int position = rx.indexIn(sample, 0, QRegExp::CaretAtZero);
    if (!caseSensitive || input.matchWord || input.what.isEmpty())
        return 0;
    if (input.matchType == QRegExp::FixedString && position != sample.indexOf(input.what))
        fail("literal match", input);
    if (input.matchType == QRegExp::Wildcard && position != wildcardIndex(input.what, sample))
        fail("wildcard match", input);
    return 0;
}
