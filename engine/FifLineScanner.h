#pragma once

#include "FifAsciiMatcher.h"
#include "FifFileDecoder.h"
#include "FifFileDevice.h"
#include "FifPrefilter.h"

#include <QString>
#include <QtCore5Compat/QRegExp>

#include <functional>

class QIODevice;

namespace Gui {
namespace Orba {

// Reads a text file line by line and reports the first match of each line.
// It knows nothing of jobs or signals, so it can be driven by any reader.
//
// Lines are physical lines, whatever their length; "\n" ends a line and a
// "\r" before it belongs to the terminator. Files that start with a UTF-16 or
// UTF-32 byte-order mark are read in that encoding, all others as UTF-8; a
// byte-order mark is not part of the text and is not counted. Offsets count
// the characters (UTF-16 code units) of every line as decoded.
class FifLineScanner
{
public:
    struct Match
    {
        int line;       // from 1
        int offset;     // characters before the match, line breaks counted as one
        int rawOffset;  // the same, line breaks counted as stored
        QString text;   // the line without its terminator
        int column;     // where the match starts in `text`
        int length;     // the characters it spans
    };

    // Called for every matching line.
    using MatchSink = std::function<void(const Match&)>;
    // Polled every `pollInterval` lines and before every further block read;
    // true ends the scan.
    using StopPoll = std::function<bool()>;

    // Lines up to this many bytes are matched whole; of a longer line only
    // about this many bytes are kept for matching (memory stays bounded), and
    // the numbers and offsets of later lines stay true.
    static constexpr qint64 defaultMaxLineBytes = 16 * 1024 * 1024;
    static constexpr qint64 defaultBlockSize = FifFileDevice::blockSize;
    static constexpr int pollInterval = 100;
    // Qt's regular-expression engine takes time quadratic in the line's
    // length for many patterns (a*b, .*x, nested repetition) when a line
    // holds no match. Lines longer than this are therefore matched one
    // start position at a time, with a stop poll before each, so that a
    // stop request is noticed within one position's attempt. The result
    // is the same leftmost match; see indexIn().
    static constexpr int sliceThreshold = 1024;

    explicit FifLineScanner(const QRegExp& expression,
                            qint64 maxLineBytes = defaultMaxLineBytes,
                            qint64 blockSize = defaultBlockSize);

    // Returns whether any line matched.
    bool scan(QIODevice& device, const MatchSink& sink, const StopPoll& shouldStop);

    // Whether UTF-8 lines that cannot match are passed over undecoded (the
    // default whenever the expression allows it): those without the text
    // every match holds (FifPrefilter), and lines of ASCII characters that
    // PCRE2 finds no match in (FifAsciiMatcher). Off, every line is decoded
    // and matched by QRegExp: the results are the same, only slower.
    void setPrefilterEnabled(bool enabled)
    {
        usePrefilter = enabled && (prefilter.isActive() || asciiMatcher.isActive());
    }
    bool isPrefilterEnabled() const { return usePrefilter; }

private:
    // Reads the rest of the device a block at a time and hands each block to
    // `take`, until the end (true), a stop request before a further block or
    // `take` refusing (false).
    template <typename Take>
    bool readBlocks(QIODevice& device, Take take);
    void scanUtf8(QIODevice& device, FifFileDecoder& decoder);
    void scanDecoded(QIODevice& device, FifFileDecoder& decoder);
    // Matches one line and advances the counters past it. `extraChars` are
    // characters of the line that were not kept in `text`.
    // `knownColumn`, when not -1, is where the first match starts, found
    // without QRegExp (see sift()).
    void matchLine(const QString& text, int terminatorLength, qint64 extraChars,
                   int knownColumn = -1);
    // Whether the UTF-8 line [begin, end) may match (and, when it cannot,
    // whether it is known to be ASCII: its length is then its size). No
    // match starts before `from`. Where the prefilter's needle is the whole
    // expression and the line is ASCII, the first place it is found is the
    // first match: `column` is set to it.
    enum Sifted { CannotMatch, CannotMatchAscii, MayMatch };
    Sifted sift(const char* begin, const char* end, const char* from, int* column) const;
    void advance(qint64 chars, int terminatorLength);
    // The first match in `text`, as rx.indexIn() with QRegExp::CaretAtZero
    // finds it, and its length; sets `stopped` when a stop request ends the
    // search first.
    int indexIn(const QString& text, int* length);
    bool stopRequested() const { return *stopPoll && (*stopPoll)(); }

    QRegExp rx;
    FifPrefilter prefilter;
    FifAsciiMatcher asciiMatcher;
    bool usePrefilter;
    qint64 maxLineBytes;
    qint64 blockSize;
    // Two, so that a block passed over can be counted after the next read.
    QByteArray buffers[2];
    int current = 0;
    // rx anchored at the offset searched from, when that gives the same
    // matches: a regular expression without any '^', which could otherwise
    // mean the start of the line. Invalid when lines are matched whole.
    QRegExp anchored;

    // The scan under way.
    const MatchSink* sink = nullptr;
    const StopPoll* stopPoll = nullptr;
    bool stopped = false;
    bool hasHit = false;
    qint64 lineNumber = 1;
    qint64 offset = 0;
    qint64 rawOffset = 0;
};

} // namespace Orba
} // namespace Gui
