#pragma once

// Runs a search job to its end from a test, as a bool for helpers that
// report failure to their caller. The end is noticed through a queued
// connection: finished() is emitted on the job's thread, where a QSignalSpy
// would record it while the test thread reads it.

#include "FifInput.h"
#include "FifJob.h"

#include <QCoreApplication>
#include <QEventLoop>
#include <QTest>
#include <QTimer>

namespace JobRunner {

// Waits until `job`, already started, has ended and its hits have arrived.
// Create it before the job is started.
class EndWatcher
{
public:
    explicit EndWatcher(Gui::Orba::FifJob* job)
        : job(job)
    {
        QObject::connect(job, &QThread::finished, &loop,
                         [this] {
                             ended = true;
                             loop.quit();
                         },
                         Qt::QueuedConnection);
    }

    bool wait(int timeoutMs = 10000)
    {
        if (!ended) {
            QTimer::singleShot(timeoutMs, &loop, &QEventLoop::quit);
            loop.exec();
        }
        if (!ended || !QTest::qWaitFor([this] { return !job->isRunning(); }, timeoutMs))
            return false;
        QCoreApplication::processEvents();
        return true;
    }

private:
    Gui::Orba::FifJob* job;
    QEventLoop loop;
    bool ended = false;
};

// Starts `request` on `job` and waits for its end.
inline bool run(Gui::Orba::FifJob* job, const Gui::Orba::FifInput& request,
                int timeoutMs = 10000)
{
    EndWatcher watcher(job);
    return job->start(request) && watcher.wait(timeoutMs);
}

} // namespace JobRunner
