#pragma once

#include "FifHit.h"

#include <QObject>
#include <QString>
#include <QTimer>

#include <condition_variable>
#include <deque>
#include <mutex>

namespace Gui {
namespace Orba {

class FifJob;

// Carries a search's events from its threads to the job in the job's own
// (GUI) thread, in the order they were posted. A queued signal per file
// woke the GUI thread once per file; here events wait in one queue, a
// wake-up is posted only when none is pending, and while events keep coming
// the GUI thread takes them every few milliseconds on a timer.
//
// The queue holds a bounded amount of work for the GUI thread: a search
// thread that finds it full waits until the GUI thread has taken some, so
// that neither memory nor the time to deliver the rest at the end grows
// when a search is faster than its views. A stop lifts the bound.
class FifOutbox : public QObject
{
    Q_OBJECT

public:
    explicit FifOutbox(FifJob* job);
    ~FifOutbox() override;

    // Any thread; events posted from the job's own thread are delivered at
    // once, after those waiting.
    void postSearching(const QString& file);
    void postHits(const FifHitList& hits);
    // While set, posting does not wait for room.
    void setInterrupted(bool interrupted);

    // GUI thread: delivers every event waiting.
    void deliverAll();

    // The work the queue holds at most before posting waits: hits and files.
    // Room for the hits found while a large view relayouts its rows (tens of
    // milliseconds at a million rows), so that the search does not stall
    // behind every relayout; a few megabytes at most.
    static constexpr qsizetype capacity = 16384;
    // How often the GUI thread takes events while they keep coming, and for
    // how long at most before it lets its event loop run.
    static constexpr int intervalMs = 5;
    static constexpr int sliceMs = 10;

private:
    struct Event
    {
        enum Kind { Searching, Hits };
        Kind kind = Searching;
        qsizetype weight = 0;  // the hits it carries, or 1
        QString file;
        FifHitList hits;
    };
    enum Outcome { Idle, Emptied, Cut };

    void post(Event&& event);
    // Delivers in order for at most `sliceNs`, or until the queue is empty
    // when it is negative: nothing was waiting, the queue was emptied, or
    // the time was up first.
    Outcome deliver(qint64 sliceNs);
    void onWake();

    FifJob* const job;
    QTimer timer;
    bool delivering = false;  // GUI thread only

    std::mutex lock;
    std::condition_variable roomMade;
    std::deque<Event> events;
    qsizetype weight = 0;  // hits and files in `events`
    int waiting = 0;       // posters waiting for room
    bool wakePending = false;
    bool interrupted = false;
};

} // namespace Orba
} // namespace Gui
