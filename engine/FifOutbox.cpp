#include "FifOutbox.h"

#include "FifJob.h"

#include <QElapsedTimer>
#include <QPointer>
#include <QThread>

namespace Gui {
namespace Orba {

FifOutbox::FifOutbox(FifJob* owner)
    : QObject(owner)
    , job(owner)
{
    timer.setSingleShot(true);
    connect(&timer, &QTimer::timeout, this, &FifOutbox::onWake);
}

FifOutbox::~FifOutbox() = default;

void FifOutbox::postSearching(const QString& file)
{
    post(Event{Event::Searching, 1, file, FifHitList()});
}

void FifOutbox::postHits(const FifHitList& hits)
{
    post(Event{Event::Hits, hits.size(), QString(), hits});
}

void FifOutbox::post(Event&& event)
{
    const bool here = QThread::currentThread() == thread();
    bool wake = false;
    bool full = false;
    {
        std::lock_guard<std::mutex> guard(lock);
        weight += event.weight;
        events.push_back(std::move(event));
        if (!here && !wakePending) {
            wakePending = true;
            wake = true;
        }
        full = weight > capacity;
    }
    if (here) {
        deliverAll();
        return;
    }
    if (wake)
        QMetaObject::invokeMethod(this, &FifOutbox::onWake, Qt::QueuedConnection);
    if (!full)
        return;
    // Resumes at half the bound, so that a poster is not woken for every
    // event the GUI thread takes.
    std::unique_lock<std::mutex> guard(lock);
    ++waiting;
    roomMade.wait(guard, [this] { return weight <= capacity / 2 || interrupted; });
    --waiting;
}

void FifOutbox::setInterrupted(bool value)
{
    std::lock_guard<std::mutex> guard(lock);
    interrupted = value;
    if (value)
        roomMade.notify_all();
}

void FifOutbox::deliverAll()
{
    if (!delivering)
        deliver(-1);
}

void FifOutbox::onWake()
{
    if (delivering) {
        // A receiver runs an event loop of its own; the delivery it
        // interrupted goes on when it returns.
        timer.start(intervalMs);
        return;
    }
    QPointer<FifOutbox> alive(this);
    const Outcome outcome = deliver(qint64(sliceMs) * 1000000);
    if (!alive || outcome == Idle)
        return;
    // Cut short, the rest follows after the event loop had its turn;
    // emptied, events that come meanwhile are taken in a few milliseconds.
    timer.start(outcome == Cut ? 0 : intervalMs);
}

FifOutbox::Outcome FifOutbox::deliver(qint64 sliceNs)
{
    QElapsedTimer clock;
    clock.start();
    // A receiver may delete the job, and this with it.
    QPointer<FifOutbox> alive(this);
    delivering = true;
    Outcome outcome = Idle;
    for (;;) {
        Event event;
        {
            std::lock_guard<std::mutex> guard(lock);
            if (events.empty()) {
                // Found idle by a wake-up: the next event posts a new one.
                if (outcome == Idle && sliceNs >= 0)
                    wakePending = false;
                break;
            }
            event = std::move(events.front());
            events.pop_front();
            weight -= event.weight;
            if (waiting > 0 && weight <= capacity / 2)
                roomMade.notify_all();
        }
        outcome = Emptied;
        switch (event.kind) {
        case Event::Searching:
            emit job->searching(event.file);
            break;
        case Event::Hits:
            job->appendHits(event.hits);
            break;
        }
        if (!alive)
            return outcome;
        if (sliceNs >= 0 && clock.nsecsElapsed() >= sliceNs) {
            outcome = Cut;
            break;
        }
    }
    delivering = false;
    return outcome;
}

} // namespace Orba
} // namespace Gui
