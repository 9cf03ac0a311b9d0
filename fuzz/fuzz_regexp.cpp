// PCRE2's verdict on lines of ASCII characters against QRegExp's, on expressions built from the syntax the
// translation takes (and some it refuses), and the scanner's hits with their column and length against
// QRegExp on whole lines.
// Input: byte 0 picks case, whole words and the syntax, byte 1 how many of the next bytes build the
// expression; each byte after those is a piece of the file (ASCII and not, line breaks, broken UTF-8).

#include "FifAsciiMatcher.h"
#include "FifInput.h"
#include "FifLineScanner.h"
#include "FifReference.h"

#include <QBuffer>

#if defined(__has_feature) && __has_feature(address_sanitizer)
#include <sanitizer/lsan_interface.h>
#define FIF_IGNORE_LEAKS __lsan::ScopedDisabler qtLeaks
#else
#define FIF_IGNORE_LEAKS
#endif

#include <cstdio>
#include <cstdlib>

using namespace Gui::Orba;

namespace {

struct Bytes
{
    const uint8_t* data;
    size_t size;
    size_t at = 0;
    bool more() const { return at < size; }
    int next(qsizetype choices) { return more() ? int(data[at++] % choices) : 0; }
};

void check(bool ok, const char* what, const QString& pattern, const QByteArray& bytes)
{
    if (!ok) {
        std::fprintf(stderr, "%s: /%s/ on %s\n", what, pattern.toUtf8().constData(), bytes.toHex().constData());
        std::abort();
    }
}

QString expression(Bytes& in, int depth)
{
    static const QStringList characters = {"a", "b", "k", "K", "s", "S", "i", "_", "0", "7", " ", "-", "\\.", ".",
                                           "\t", "\r", "\\r", "\\t", "\\x41", "\\x006b", "\\x212A", "\\0101", "\\\\",
                                           "\\d", "\\D", "\\s", "\\S", "\\w", "\\W", "[a-c]", "[^a-c]", "[k]", "[^\\w]",
                                           "[\\d_]", "[R-T]", "[^é]", "[\\x212a]", "[K-k]", "é", "\u212A", "\u017F",
                                           "\u0130", "\u0131", "ß", "\\1", "\\q", "[]a]"};
    static const QStringList opening = {"(", "(?:", "(?=", "(?!"}, anchors = {"^", "$", "\\b", "\\B"},
                             quantifiers = {"*", "+", "?", "{2}", "{1,3}", "{,2}", "{2,}", "{0}"};
    QString out;
    for (int items = 1 + in.next(6); items > 0 && in.more(); --items) {
        const int kind = in.next(12);
        QString item = kind < 7 ? characters.at(in.next(characters.size())) : anchors.at(in.next(anchors.size()));
        if (kind == 9 && depth < 4)
            item = opening.at(in.next(opening.size())) + expression(in, depth + 1) + ")";
        if (kind == 10)
            item = "|";
        else if (in.next(3) == 0)
            item += quantifiers.at(in.next(quantifiers.size()));
        out += item;
    }
    return out;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    Bytes in{data + 2, qMin<size_t>(data[1], size - 2)};
    FifInput request;
    request.what = expression(in, 0);
    request.matchCase = data[0] & 1 ? Qt::CaseSensitive : Qt::CaseInsensitive;
    request.matchWord = data[0] & 2;
    request.matchType = (data[0] >> 2) % 4 == 3 ? QRegExp::Wildcard : (data[0] >> 2) % 4 == 2 ? QRegExp::FixedString
                                                                                              : QRegExp::RegExp2;
    {
        // Qt's QRegExp leaks parts of its engine when it rejects some expressions ("(?!${21", "a(?=b)c{2}{0}").
        FIF_IGNORE_LEAKS;
        if (!request.isValid())
            return 0;
    }
    const QRegExp rx = request.getRegExp();

    static const QList<QByteArray> pieces = {"a", "b", "k", "K", "s", "S", "i", "I", "_", "0", "7", " ", "-", ".",
                                             "\t", "\r", "ab", "\\", "\xc3\xa9", "\xe2\x84\xaa", "\xc5\xbf",
                                             "\xc4\xb0", "\xc4\xb1", "\xf0\x9f\x98\x80", "\xff", "\n", "\n", "\r\n"};
    QByteArray bytes;
    for (size_t i = 2 + in.size; i < size; ++i)
        bytes += pieces.at(data[i] % pieces.size());

    const FifAsciiMatcher matcher(rx);
    for (QByteArray line : bytes.split('\n')) {
        line.chop(line.endsWith('\r') ? 1 : 0);
        const FifAsciiMatcher::Verdict verdict = matcher.match(line.constData(), line.size());
        const bool matches = QRegExp(rx).indexIn(QString::fromUtf8(line), 0, QRegExp::CaretAtZero) >= 0;
        check(verdict == FifAsciiMatcher::Unknown || (verdict == FifAsciiMatcher::Match) == matches, "verdict",
              request.what, line);
    }

    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    QList<FifReference::Match> hits;
    FifLineScanner(rx).scan(
        buffer,
        [&](const FifLineScanner::Match& m) {
            QRegExp whole(rx);
            check(whole.indexIn(m.text, 0, QRegExp::CaretAtZero) == m.column && whole.matchedLength() == m.length,
                  "column and length", request.what, bytes);
            hits.append({m.line, m.offset, m.rawOffset, m.text});
        },
        [] { return false; });
    check(hits == FifReference::matches(bytes, rx), "hits", request.what, bytes);
    return 0;
}
