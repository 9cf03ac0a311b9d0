#include "FifFileScanner.h"

#include "FifFileDevice.h"
#include "FifTextTest.h"

#include <QFile>
#include <QTextStream>

namespace Gui {
namespace Orba {

FifFileScanner::FifFileScanner(const QRegExp& expression)
    : scanner(expression)
{
}

FifFileScanner::~FifFileScanner() = default;

bool FifFileScanner::open(const QString& path, const StopPoll& shouldStop)
{
    file.reset();  // it may hold the head buffer
    auto opened = std::make_unique<FifFileDevice>(path, &headBuffer);
    // A file that cannot be read cannot be opened either: open() answers
    // for the permission without a call of its own.
    if (!opened->open(QIODevice::ReadOnly) || !isTextFile(*opened, shouldStop))
        return false;
    file = std::move(opened);
    return true;
}

bool FifFileScanner::scan(const MatchSink& sink, const StopPoll& shouldStop)
{
    if (!file)
        return false;
    const bool hasHit = scanner.scan(*file, sink, shouldStop);
    file.reset();
    return hasHit;
}

bool FifFileScanner::isTextFile(FifFileDevice& file, const StopPoll& shouldStop)
{
    // The bytes themselves tell what decoding them through a QTextStream
    // would; only files of a UTF-16 or UTF-32 byte-order mark need decoding.
    FifTextTest test;
    const QByteArray& head = file.head();
    FifTextTest::Verdict verdict = test.feed(head.constData(), head.size());
    if (verdict == FifTextTest::Undecided && head.size() == FifFileDevice::headSize) {
        QByteArray more(FifFileDevice::blockSize, Qt::Uninitialized);
        qint64 position = head.size();
        while (verdict == FifTextTest::Undecided) {
            // Twenty lines may take the whole of a big file.
            if (shouldStop && shouldStop())
                return false;
            const qint64 got = file.readAt(more.data(), more.size(), position);
            if (got <= 0)
                break;
            position += got;
            verdict = test.feed(more.constData(), got);
        }
    }
    verdict = test.finish();
    if (verdict == FifTextTest::OtherEncoding)
        return isTextByStream(file.filePath());
    return verdict == FifTextTest::Text;
}

bool FifFileScanner::isTextByStream(const QString& path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return false;
    // Read in pieces rather than by readLine(), so that one huge first line
    // does not have to fit in memory. Only "\n" ends a line, as for
    // readLine(); line breaks are white space and never decide the answer.
    QTextStream stream(&file);
    int lines = 0;
    while (!stream.atEnd()) {
        const QString piece = stream.read(4096);
        if (piece.isEmpty())
            break;
        for (const QChar c : piece) {
            if (c == QLatin1Char('\n')) {
                if (++lines == FifTextTest::linesExamined)
                    return true;
            } else if (c.category() == QChar::Other_Control && !c.isSpace()) {
                return false;
            }
        }
    }
    return true;
}

} // namespace Orba
} // namespace Gui
