#pragma once

#include "FifHit.h"

#include <QString>

#include <atomic>
#include <condition_variable>
#include <deque>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

class QRegExp;

namespace Gui {
namespace Orba {

class FifFileScanner;
class FifJob;

// Scans the files a walk hands in on a few threads of its own and reports
// what it finds in walk order, as one thread scanning them in turn would.
//
// Threads take files in walk order. Only the file at the head of that order
// (the oldest one not fully reported) reports as it goes; the others hold
// their hits until they come to the head. The files in flight and the hits
// held are bounded: the walk waits for room, and a thread whose file is not
// at the head waits once too many hits are held, so memory does not grow
// with the tree nor with a file of millions of hits.
//
// A stop ends the reports: the file at the head (when already reported as
// started) reports the hits found until its scan noticed the stop, and its
// end; nothing after it is reported. What was held is dropped.
class FifScanPool
{
public:
    // Takes the reports, in walk order and one at a time, on whichever of
    // the pool's threads (or the walk's) makes them, with the pool's lock
    // held: a receiver must not call back into the pool.
    class Receiver
    {
    public:
        virtual ~Receiver() = default;
        // A text file is about to be scanned.
        virtual void fileStarted(const QString& path) = 0;
        virtual void hitFound(const FifHit& hit) = 0;
        virtual void fileEnded(bool hasHit) = 0;
    };

    // Bounds of what is in flight: files per scanning thread, and the hits
    // (and their characters) held for files not at the head.
    struct Limits
    {
        int filesPerThread = 128;
        qsizetype heldHits = 16384;
        qint64 heldChars = 8 * 1024 * 1024;
    };

    // With one thread, files are scanned on the walk's thread as they are
    // handed in, and no thread is started. A stop is the job's (none
    // without a job).
    FifScanPool(FifJob* job, const QRegExp& expression, int threadCount, Receiver& receiver,
                const Limits& limits);
    FifScanPool(FifJob* job, const QRegExp& expression, int threadCount, Receiver& receiver);
    // Ends the threads (stopping them unless finish() was called) and waits
    // for them; what is still held is dropped.
    ~FifScanPool();

    // Hands in the next file of the walk; waits while the files in flight
    // are at their bound. False once the search is to stop.
    bool add(const QString& path);
    // No more files: waits until all handed in are scanned and reported, or
    // until a stop.
    void finish();
    // The job's stop flag, noted for the whole pool once seen. Not to be
    // called with the pool's lock held.
    bool shouldStop();

private:
    struct File
    {
        enum State { Queued, Opening, Scanning, Done };

        QString path;
        State state = Queued;
        bool isText = false;
        bool started = false;  // fileStarted() was reported
        bool hasHit = false;
        FifHitList held;
    };

    void runThread(FifFileScanner& scanner);
    void scanFile(File& file, FifFileScanner& scanner);
    void hitFound(File& file, const FifHit& hit);
    // Reports what the head and the files behind it have ready, taking
    // finished files off the head. Called with the lock held when the state
    // of the head changed.
    void advance();
    bool isHead(const File& file) const { return !files.empty() && &files.front() == &file; }
    void noteStop();
    // Waits for `condition`, noticing a stop of the job even when no thread
    // of the pool is there to poll it.
    void waitOn(std::condition_variable& condition, std::unique_lock<std::mutex>& guard);

    FifJob* const job;
    Receiver& receiver;
    const Limits limits;
    std::vector<std::unique_ptr<FifFileScanner>> scanners;
    std::vector<std::thread> threads;
    size_t maxFiles = 1;

    std::mutex lock;
    // Each is notified only when someone waits for it: files were added,
    // room made for the walk (or all reported), the head moved on.
    std::condition_variable workAdded;
    std::condition_variable roomMade;
    std::condition_variable headMoved;
    int idleThreads = 0;
    int heldWaiters = 0;
    bool walkWaits = false;
    // The files in flight in walk order; the first `taken` have been taken
    // by a thread. References stay valid while others come and go.
    std::deque<File> files;
    size_t taken = 0;
    qsizetype heldHits = 0;
    qint64 heldChars = 0;
    bool noMoreFiles = false;
    std::atomic<bool> stopping{false};
};

} // namespace Orba
} // namespace Gui
