#pragma once

#include "FifLineScanner.h"

#include <QByteArray>
#include <QString>

#include <memory>

namespace Gui {
namespace Orba {

class FifFileDevice;

// Reads the files of a search one after another on one thread: opens each
// once, tells text from binary files, and scans the lines of text files.
// Each scanning thread has its own, as a QRegExp is not to be shared.
class FifFileScanner
{
public:
    using MatchSink = FifLineScanner::MatchSink;
    using StopPoll = FifLineScanner::StopPoll;

    explicit FifFileScanner(const QRegExp& expression);
    ~FifFileScanner();

    // Opens `path` and tests it: true for a readable text file, which then
    // stays open for scan(). A stop may end the test early: false then.
    bool open(const QString& path, const StopPoll& shouldStop);
    // Reports each matching line of the file opened last and closes it;
    // returns whether any line matched.
    bool scan(const MatchSink& sink, const StopPoll& shouldStop);

    // Whether the first 20 lines of an opened file hold no control
    // character other than white space; polls for a stop before each block
    // it reads beyond the first.
    static bool isTextFile(FifFileDevice& file, const StopPoll& shouldStop);

private:
    // The test through a QTextStream, for files of a UTF-16 or UTF-32
    // byte-order mark.
    static bool isTextByStream(const QString& path);

    FifLineScanner scanner;
    std::unique_ptr<FifFileDevice> file;
    QByteArray headBuffer;  // lent to each file opened in turn
};

} // namespace Orba
} // namespace Gui
