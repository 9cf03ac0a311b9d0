#include "FifWorker.h"

#include "FifFileDevice.h"
#include "FifFileScanner.h"
#include "FifFolderWalker.h"
#include "FifJob.h"
#include "FifNameFilter.h"

#include <QFileInfo>
#include <QThread>

namespace Gui {
namespace Orba {

FifWorker::FifWorker(FifJob* owner)
    : job(owner)
{
    if (job)
        input = job->getInput();
    filter = std::make_unique<FifNameFilter>(
        input.filter.split(QObject::tr(";"), Qt::SkipEmptyParts, Qt::CaseSensitive));
    if (!job)
        return;
    // Direct: the job's outbox takes the events on the thread that reports
    // them and carries them to the GUI thread in their order.
    connect(this, &FifWorker::searching, job, &FifJob::postSearching, Qt::DirectConnection);
    connect(this, qOverload<const FifHit&>(&FifWorker::found), job, &FifJob::postHit,
            Qt::DirectConnection);
    connect(this, qOverload<const FifHitList&>(&FifWorker::found), job, &FifJob::postHits,
            Qt::DirectConnection);
}

FifWorker::~FifWorker()
{
    pool.reset();
    if (job)
        job->setShouldStop(false);
}

void FifWorker::searchFolders()
{
    const QString separator = QObject::tr(";");
    const QStringList parts =
        input.where.split(separator, Qt::SkipEmptyParts, Qt::CaseSensitive);
    QList<QDir> folders;
    for (const QString& part : parts) {
        QDir folder;
        if (part == QObject::tr("Current Directory"))
            folder = QDir::current();
        else if (part == QObject::tr("Home Directory"))
            folder = QDir::home();
        else if (part == QObject::tr("Root Directory"))
            folder = QDir::root();
        else
            folder = QDir(part);
        addFolder(folder, folders);
    }
    // A worker run in the job's own thread (the GUI thread) scans there too:
    // its events are delivered as they come, and nobody would take them
    // from threads of its own.
    int threads = job ? job->getThreadCount() : 1;
    if (job && QThread::currentThread() == job->thread())
        threads = 1;
    Receiver& receiver = *this;
    pool = std::make_unique<FifScanPool>(job, input.getRegExp(), threads, receiver);
    for (const QDir& folder : qAsConst(folders)) {
        if (shouldStop())
            break;
        searchFolder(folder);
    }
    pool->finish();
    pool.reset();
}

void FifWorker::addFolder(const QDir& folder, QList<QDir>& folders)
{
    if (folder.exists())
        folders.append(folder);
}

bool FifWorker::shouldStop() const
{
    return pool ? pool->shouldStop() : job && job->shouldStop();
}

void FifWorker::searchFolder(const QDir& folder)
{
    FifFolderWalker walker(*filter, input.includeSubFolders);
    walker.walk(
        folder.path(), [this](const QString& path) { return pool->add(path); },
        [this] { return shouldStop(); });
}

bool FifWorker::isTextFile(const QFileInfo& info)
{
    if (!info.isFile())
        return false;
    // A file that cannot be read cannot be opened either: open() answers
    // for isReadable() without a call of its own.
    FifFileDevice file(info.filePath());
    return file.open(QIODevice::ReadOnly) && FifFileScanner::isTextFile(file, {});
}

void FifWorker::fileStarted(const QString& path)
{
    if (job)
        job->incrementReadFileCount();
    emit searching(path);
}

void FifWorker::hitFound(const FifHit& hit)
{
    // The first hits of a search go singly, so they show at once; later ones
    // in batches whose size grows with the rows the model already holds.
    const int rows = job ? job->getLineHitCount() : 0;
    if (rows < 10) {
        // Rows can drop when the view is cleared during a search; what is
        // waiting in the batch goes first so the order stays.
        sendBatch();
        emit found(hit);
        return;
    }
    const int limit = qBound(10, 2 * rows, 100);
    if (batch.size() > limit)
        sendBatch();
    batch.append(hit);
}

void FifWorker::fileEnded(bool hasHit)
{
    if (hasHit && job)
        job->incrementFileHitCount();
    sendBatch();
}

void FifWorker::sendBatch()
{
    if (batch.isEmpty())
        return;
    emit found(batch);
    batch.clear();
}

} // namespace Orba
} // namespace Gui
