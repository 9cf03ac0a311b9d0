// FifInput::getRegExp, isValid and toString on arbitrary requests.
// Input: byte 0 the match type, byte 1 the flags, then UTF-8 text cut at zero bytes into `what`,
// `where`, `filter` and a sample line. Matching is only tried on short texts: Qt's backtracking
// engine is exponential on some patterns by nature, which is not what this target looks for.

#include "FifInput.h"

#include <QStringList>

#include <cstdio>
#include <cstdlib>
#include <cstring>

using Gui::Orba::FifInput;

[[noreturn]] static void fail(const char* what, const FifInput& input)
{
    std::fprintf(stderr, "%s: what=%s type=%d case=%d word=%d\n", what, input.what.toUtf8().toHex().constData(),
                 input.matchType, input.matchCase, int(input.matchWord));
    std::abort();
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    auto readInt = [&](size_t at) { int value = 0; std::memcpy(&value, data + at, at + 4 <= size ? 4 : 0); return value; };
    FifInput input;
    // Mostly the dialog's three syntaxes; also every QRegExp syntax and stored values out of range.
    const int types[] = {QRegExp::FixedString, QRegExp::Wildcard, QRegExp::RegExp2, data[0] / 5 % 8, readInt(2)};
    input.matchType = types[data[0] % 5];
    input.matchCase = data[1] & 2 ? readInt(6) : data[1] & 1 ? Qt::CaseSensitive : Qt::CaseInsensitive;
    input.matchWord = data[1] & 4;
    input.includeSubFolders = data[1] & 8;
    const QStringList parts = QString::fromUtf8(reinterpret_cast<const char*>(data) + 2, qsizetype(size - 2)).split(QChar(0));
    input.what = parts.value(0);
    input.where = parts.value(1);
    input.filter = parts.value(2);
    const QString sample = parts.value(3).remove(QLatin1Char('\n')).remove(QLatin1Char('\r'));

    const QRegExp rx = input.getRegExp();
    const bool caseSensitive = input.matchCase == Qt::CaseSensitive;
    if (rx.caseSensitivity() != (caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive))
        fail("case sensitivity", input);
    if (input.isValid() != (!input.what.isEmpty() && rx.isValid()))
        fail("validity", input);
    // Literal text and wildcards are escaped, so Qt must accept them.
    const bool escaped = input.matchType == QRegExp::FixedString || input.matchType == QRegExp::Wildcard;
    if (escaped && !input.what.isEmpty() && !input.isValid())
        fail("escaped pattern rejected", input);
    const QString description = input.toString();
    if (description.isEmpty() != input.what.isEmpty() || !description.contains(input.what))
        fail("description", input);
    if (input.what.size() > 24 || sample.size() > 24)
        return 0;
    const int position = rx.indexIn(sample, 0, QRegExp::CaretAtZero);
    if (input.matchType == QRegExp::FixedString && caseSensitive && !input.matchWord && !input.what.isEmpty()
        && position != sample.indexOf(input.what))
        fail("literal match", input);
    return 0;
}
