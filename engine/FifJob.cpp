#include "FifJob.h"

#include "FifHandOff.h"
#include "FifHitsModel.h"
#include "FifLocker.h"
#include "FifManager.h"
#include "FifWorker.h"

namespace Gui {
namespace Orba {

FifJob::FifJob(FifManager* manager)
    : QThread(manager)
    , workingDir(QString())
{
    // QThread emits finished() just before it marks itself as not running.
    // Joining the thread here, ahead of every other receiver of finished(),
    // lets those receivers rely on isRunning() being false.
    connect(this, &QThread::finished, this, [this] {
        wait();
        FifHandOff::received(this);
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
    // The last run's thread has ended: what it did comes before this run.
    FifHandOff::received(this);

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
    FifLocker locker(&lock, FifLocker::Read);
    return stopFlag;
}

void FifJob::setShouldStop(bool value)
{
    FifLocker locker(&lock, FifLocker::Write);
    stopFlag = value;
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
    return tr("Found %n line(s)", "", getLineHitCount())
           + tr(" in %n file(s)", "", getFileHitCount())
           + tr(" out of %n file(s)", "", getReadFileCount());
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
    FifHandOff::received(this);
    if (!hit.isValid())
        return;
    getHitsModel()->appendValidHits(FifHitList{hit}, 1);
}

void FifJob::appendHits(const FifHitList& hits)
{
    FifHandOff::received(this);
    int count = 0;
    for (const FifHit& hit : hits)
        count += hit.isValid() ? 1 : 0;
    if (count == 0)
        return;
    getHitsModel()->appendValidHits(hits, count);
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
