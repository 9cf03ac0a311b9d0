// The text test and the line scanner on arbitrary file contents, checked against FifReference's
// plain reading of the same bytes.
// Input: byte 0 picks the expression, byte 1 when the scan is stopped; the rest is the file.

#include "FifLineScanner.h"
#include "FifReference.h"
#include "FifWorker.h"

#include <QBuffer>
#include <QFile>
#include <QFileInfo>

#include <cstdio>
#include <cstdlib>
#include <unistd.h>

using namespace Gui::Orba;

static void check(bool ok, const char* what, const QByteArray& bytes)
{
    if (!ok) {
        std::fprintf(stderr, "%s: %s\n", what, bytes.toHex().constData());
        std::abort();
    }
}

// The hits of a scan whose stop poll says true from its `stopAt`th call on, and how many there were
// when it first did (-1: never).
static QList<FifReference::Match> scan(const QByteArray& bytes, const QRegExp& rx, int stopAt, qsizetype& hitsAtStop)
{
    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    QList<FifReference::Match> hits;
    int polls = 0;
    hitsAtStop = -1;
    const bool hasHit = FifLineScanner(rx).scan(
        buffer, [&](const FifLineScanner::Match& m) { hits.append({m.line, m.offset, m.rawOffset, m.text}); },
        [&] {
            if (++polls >= stopAt && hitsAtStop < 0)
                hitsAtStop = hits.size();
            return polls >= stopAt;
        });
    check(hasHit == !hits.isEmpty(), "hasHit", bytes);
    return hits;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    static const QStringList patterns = {"a", "^", "b+$", "a+\\bx|(b)\\1$", "\r", "[^\\x0001-\\x007f]", "ab",
                                         QString(QChar(0)), QString(QChar(0xFEFF)), QString(QChar(0xFFFD))};
    const int pick = data[0] % 10;  // the 2nd to 4th and the 6th are regular expressions
    const QRegExp rx(patterns.at(pick), data[0] & 0x80 ? Qt::CaseSensitive : Qt::CaseInsensitive,
                     pick == 1 || pick == 2 || pick == 3 || pick == 5 ? QRegExp::RegExp2 : QRegExp::FixedString);
    const QByteArray bytes(reinterpret_cast<const char*>(data) + 2, qsizetype(size - 2));

    static const QString path = QStringLiteral("/tmp/fif_fuzz_scanner.%1").arg(::getpid());
    QFile file(path);
    check(file.open(QIODevice::WriteOnly | QIODevice::Truncate) && file.write(bytes) == bytes.size(), "write", bytes);
    file.close();
    check(FifWorker::isTextFile(QFileInfo(path)) == FifReference::isText(bytes), "text test", bytes);

    const QList<FifReference::Match> want = FifReference::matches(bytes, rx);
    qsizetype hitsAtStop;
    check(scan(bytes, rx, 1 << 30, hitsAtStop) == want, "full scan", bytes);
    // Stopped at a poll: the first of the full hits, none after a poll said stop, all if none did.
    const QList<FifReference::Match> stopped = scan(bytes, rx, data[1] % 4 + 1, hitsAtStop);
    check(stopped == want.mid(0, hitsAtStop < 0 ? want.size() : hitsAtStop), "stopped scan", bytes);
    return 0;
}
