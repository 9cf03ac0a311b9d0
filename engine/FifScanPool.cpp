#include "FifScanPool.h"

#include "FifFileScanner.h"
#include "FifJob.h"

#include <chrono>
#include <system_error>

namespace Gui {
namespace Orba {

FifScanPool::FifScanPool(FifJob* owner, const QRegExp& expression, int threadCount,
                         Receiver& reports, const Limits& bounds)
    : job(owner)
    , receiver(reports)
    , limits(bounds)
{
    // The scanners are built here, before any thread starts: each thread
    // then uses only its own, and the regular-expression engine Qt shares
    // between copies behind a lock of its own is complete before it does.
    const int count = qMax(threadCount, 1);
    for (int i = 0; i < count; ++i)
        scanners.push_back(std::make_unique<FifFileScanner>(expression));
    if (count == 1)
        return;
    for (auto& scanner : scanners) {
        try {
            threads.emplace_back([this, &scanner] { runThread(*scanner); });
        } catch (const std::system_error&) {
            break;  // as many threads as the system gives
        }
    }
    maxFiles = size_t(qMax(limits.filesPerThread, 1)) * qMax<size_t>(threads.size(), 1);
}

FifScanPool::FifScanPool(FifJob* owner, const QRegExp& expression, int threadCount,
                         Receiver& reports)
    : FifScanPool(owner, expression, threadCount, reports, Limits())
{
}

FifScanPool::~FifScanPool()
{
    {
        std::lock_guard<std::mutex> guard(lock);
        if (!noMoreFiles)
            stopping = true;
        noMoreFiles = true;
        workAdded.notify_all();
    }
    for (std::thread& thread : threads)
        thread.join();
}

bool FifScanPool::add(const QString& path)
{
    std::unique_lock<std::mutex> guard(lock);
    while (files.size() >= maxFiles && !stopping) {
        walkWaits = true;
        waitOn(roomMade, guard);
    }
    if (stopping)
        return false;
    files.emplace_back();
    files.back().path = path;
    if (!threads.empty()) {
        if (idleThreads > 0)
            workAdded.notify_one();
        return true;
    }
    // No thread of its own: the file is scanned here, at the head at once.
    File& file = files.back();
    ++taken;
    file.state = File::Opening;
    guard.unlock();
    scanFile(file, *scanners.front());
    return !shouldStop();
}

void FifScanPool::finish()
{
    {
        std::unique_lock<std::mutex> guard(lock);
        noMoreFiles = true;
        workAdded.notify_all();
        while (!files.empty() && !stopping) {
            walkWaits = true;
            waitOn(roomMade, guard);
        }
    }
    for (std::thread& thread : threads)
        thread.join();
    threads.clear();
}

bool FifScanPool::shouldStop()
{
    if (stopping.load(std::memory_order_relaxed))
        return true;
    if (!job || !job->shouldStop())
        return false;
    std::lock_guard<std::mutex> guard(lock);
    noteStop();
    return true;
}

void FifScanPool::noteStop()
{
    stopping = true;
    workAdded.notify_all();
    roomMade.notify_all();
    headMoved.notify_all();
}

void FifScanPool::waitOn(std::condition_variable& condition, std::unique_lock<std::mutex>& guard)
{
    // Normally a thread that polls the stop flag notes the stop for all;
    // the timeout covers a stop that comes while no thread polls.
    if (condition.wait_for(guard, std::chrono::milliseconds(50)) == std::cv_status::timeout
        && job && job->shouldStop())
        noteStop();
}

void FifScanPool::runThread(FifFileScanner& scanner)
{
    std::unique_lock<std::mutex> guard(lock);
    for (;;) {
        while (!stopping && taken == files.size() && !noMoreFiles) {
            ++idleThreads;
            waitOn(workAdded, guard);
            --idleThreads;
        }
        if (stopping || taken == files.size())
            return;
        File& file = files[taken++];
        file.state = File::Opening;
        guard.unlock();
        scanFile(file, scanner);
        guard.lock();
    }
}

void FifScanPool::scanFile(File& file, FifFileScanner& scanner)
{
    const auto poll = [this] { return shouldStop(); };
    const bool isText = scanner.open(file.path, poll);
    {
        std::lock_guard<std::mutex> guard(lock);
        file.isText = isText;
        file.state = isText ? File::Scanning : File::Done;
        if (isHead(file))
            advance();
    }
    // Done, the file may be gone now.
    if (!isText)
        return;
    const QString& path = file.path;
    const bool hasHit = scanner.scan(
        [&](const FifLineScanner::Match& match) {
            FifHit hit(path, match.line, match.text, match.offset, match.rawOffset, job);
            hit.column = match.column;
            hit.length = match.length;
            hitFound(file, hit);
        },
        poll);
    std::lock_guard<std::mutex> guard(lock);
    file.hasHit = hasHit;
    file.state = File::Done;
    if (isHead(file))
        advance();
}

void FifScanPool::hitFound(File& file, const FifHit& hit)
{
    std::unique_lock<std::mutex> guard(lock);
    if (isHead(file) && file.started) {
        receiver.hitFound(hit);
        return;
    }
    file.held.append(hit);
    ++heldHits;
    heldChars += hit.text.size();
    // The head never waits here, so this ends; advance() reports what is
    // held when the file comes to the head.
    while ((heldHits > limits.heldHits || heldChars > limits.heldChars) && !isHead(file)
           && !stopping) {
        ++heldWaiters;
        waitOn(headMoved, guard);
        --heldWaiters;
    }
}

void FifScanPool::advance()
{
    while (!files.empty()) {
        File& head = files.front();
        if (head.state == File::Queued || head.state == File::Opening)
            return;
        if (head.isText && !head.started) {
            if (stopping)
                return;  // nothing new after a stop
            head.started = true;
            receiver.fileStarted(head.path);
        }
        if (!head.held.isEmpty()) {
            for (const FifHit& hit : qAsConst(head.held)) {
                receiver.hitFound(hit);
                heldChars -= hit.text.size();
            }
            heldHits -= head.held.size();
            head.held.clear();
        }
        if (head.state != File::Done)
            return;
        if (head.started)
            receiver.fileEnded(head.hasHit);
        files.pop_front();
        --taken;
        if (heldWaiters > 0)
            headMoved.notify_all();
        // The walk resumes once half the room is free, rather than for
        // every file; finish() once all is reported.
        if (walkWaits && files.size() <= maxFiles / 2 && (!noMoreFiles || files.empty())) {
            walkWaits = false;
            roomMade.notify_one();
        }
    }
}

} // namespace Orba
} // namespace Gui
