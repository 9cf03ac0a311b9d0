#include "FifJob.h"

#include "FifHandOff.h"
#include "FifHitsModel.h"
#include "FifLocker.h"
#include "FifManager.h"
#include "FifOutbox.h"
#include "FifWorker.h"

namespace Gui {
namespace Orba {

FifJob::FifJob(FifManager* manager)
    : QThread(manager)
    , outbox(new FifOutbox(this))
    , workingDir(QString())
{
    // QThread emits finished() just before it marks itself as not running.
    // Joining the thread here, ahead of every other receiver of finished(),
    // lets those receivers rely on isRunning() being false, and on having
    // received everything the search found.
    connect(this, &QThread::finished, this, [this] {
        wait();
        FifHandOff::received(this);
        outbox->deliverAll();
    });
}

FifJob::~FifJob()
{
    if (isRunning()) {
        setShouldStop(true);
        wait();
    }
    FifHandOff::received(this);
    FifLocker::forget(&lock);
}

bool FifJob::start(const FifInput& request)
{
    if (isRunning())
        return false;
    // The last run's thread has ended: what it did comes before this run,
    // also what it found that its end has not delivered yet.
    FifHandOff::received(this);
    outbox->deliverAll();

    input = request;
    FifHitsModel* model = getHitsModel();
    const int rows = model->rowCount(QModelIndex());
    if (rows > 0)
        model->removeRows(0, rows, QModelIndex());
    {
        // The thread is not running, but the lock keeps the counters' rule simple.
        FifLocker locker(&lock, FifLocker::Write);
        readFileCount = 0;
        fileHitCount = 0;
    }
    workingDir = QDir::current();
    emit aboutToStart();
    QThread::start(QThread::InheritPriority);
    return true;
}

bool FifJob::shouldStop() const
{
    return stopFlag.load(std::memory_order_acquire);
}

void FifJob::setShouldStop(bool value)
{
    // Under the lock, so that the outbox learns the flags in the order they
    // are set: a search thread waiting for room there must see a stop.
    FifLocker locker(&lock, FifLocker::Write);
    stopFlag.store(value, std::memory_order_release);
    outbox->setInterrupted(value);
}

void FifJob::setThreadCount(int count)
{
    FifLocker locker(&lock, FifLocker::Write);
    threadCount = count;
}

int FifJob::getThreadCount() const
{
    FifLocker locker(&lock, FifLocker::Read);
    return threadCount > 0 ? threadCount : qMax(QThread::idealThreadCount(), 1);
}

void FifJob::stop()
{
    setShouldStop(true);
}

int FifJob::getReadFileCount() const
{
    FifLocker locker(&lock, FifLocker::Read);
    return readFileCount;
}

int FifJob::getFileHitCount() const
{
    FifLocker locker(&lock, FifLocker::Read);
    return fileHitCount;
}

void FifJob::incrementReadFileCount()
{
    FifLocker locker(&lock, FifLocker::Write);
    ++readFileCount;
}

void FifJob::incrementFileHitCount()
{
    FifLocker locker(&lock, FifLocker::Write);
    ++fileHitCount;
}

int FifJob::getLineHitCount() const
{
    return hitsModel ? hitsModel->rowCount(QModelIndex()) : 0;
}

QString FifJob::getResultText() const
{
    return resultText(getLineHitCount(), getFileHitCount(), getReadFileCount());
}

QString FifJob::resultText(int lines, int files, int readFiles)
{
    return tr("Found %n line(s)", "", lines) + tr(" in %n file(s)", "", files)
           + tr(" out of %n file(s)", "", readFiles);
}

FifInput FifJob::getInput() const
{
    return input;
}

QDir FifJob::getWorkingDir() const
{
    return workingDir;
}

void FifJob::setWorkingDir(QDir dir)
{
    workingDir = dir;
}

FifHitsModel* FifJob::getHitsModel() const
{
    if (!hitsModel)
        hitsModel = new FifHitsModel(const_cast<FifJob*>(this));
    return hitsModel;
}

FifManager* FifJob::getManager() const
{
    return qobject_cast<FifManager*>(parent());
}

MainWindow* FifJob::getMainWindow() const
{
    FifManager* manager = getManager();
    return manager ? manager->getMainWindow() : nullptr;
}

// Rows are inserted already holding their hits rather than as placeholders
// filled by setData: one insertion per batch and one dataChanged per hit
// either way, without a lock and a variant per hit.
void FifJob::appendHit(const FifHit& hit)
{
    if (!hit.isValid())
        return;
    getHitsModel()->appendValidHits(FifHitList{hit}, 1);
}

void FifJob::appendHits(const FifHitList& hits)
{
    int count = 0;
    for (const FifHit& hit : hits)
        count += hit.isValid() ? 1 : 0;
    if (count == 0)
        return;
    getHitsModel()->appendValidHits(hits, count);
}

void FifJob::postSearching(const QString& file)
{
    outbox->postSearching(file);
}

void FifJob::postHit(const FifHit& hit)
{
    // Delivered as appendHit() would take it: a list of one.
    outbox->postHits(FifHitList{hit});
}

void FifJob::postHits(const FifHitList& hits)
{
    outbox->postHits(hits);
}

void FifJob::run()
{
    {
        FifWorker worker(this);
        worker.searchFolders();
    }
    FifHandOff::sent(this);
}

} // namespace Orba
} // namespace Gui
