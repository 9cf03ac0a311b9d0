#include "FifWorker.h"

#include "FifFileDevice.h"
#include "FifHandOff.h"
#include "FifJob.h"
#include "FifLineScanner.h"
#include "FifTextTest.h"

#include <QFile>
#include <QFileInfo>
#include <QTextStream>

namespace Gui {
namespace Orba {

FifWorker::FifWorker(FifJob* owner)
    : job(owner)
{
    if (job)
        input = job->getInput();
    scanner = std::make_unique<FifLineScanner>(input.getRegExp());
    if (!job)
        return;
    connect(this, &FifWorker::searching, job, &FifJob::searching);
    connect(this, qOverload<const FifHit&>(&FifWorker::found), job, &FifJob::appendHit);
    connect(this, qOverload<const FifHitList&>(&FifWorker::found), job, &FifJob::appendHits);
}

FifWorker::~FifWorker()
{
    openedFile.reset();
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
    for (const QDir& folder : qAsConst(folders)) {
        if (job && job->shouldStop())
            return;
        searchFolder(folder);
    }
}

void FifWorker::addFolder(QDir& folder, QList<QDir>& folders)
{
    folder.setNameFilters(
        input.filter.split(QObject::tr(";"), Qt::SkipEmptyParts, Qt::CaseSensitive));
    folder.setFilter(QDir::Files | QDir::NoSymLinks | QDir::Hidden | QDir::AllDirs
                     | QDir::NoDotAndDotDot);
    folder.setSorting(QDir::NoSort);
    if (folder.exists())
        folders.append(folder);
}

void FifWorker::searchFolder(const QDir& folder)
{
    const QFileInfoList entries = folder.entryInfoList();
    for (const QFileInfo& entry : entries) {
        if (job && job->shouldStop())
            return;
        if (openTextFile(entry))
            searchFile(entry.filePath());
        openedFile.reset();
        if (input.includeSubFolders && entry.isDir()) {
            QDir subFolder = folder;
            subFolder.setPath(entry.filePath());
            if (subFolder.exists())
                searchFolder(subFolder);
        }
    }
}

bool FifWorker::isTextFile(const QFileInfo& info)
{
    if (!info.isFile())
        return false;
    // A file that cannot be read cannot be opened either: open() answers
    // for isReadable() without a call of its own.
    FifFileDevice file(info.filePath());
    return file.open(QIODevice::ReadOnly) && isTextFile(file);
}

bool FifWorker::openTextFile(const QFileInfo& info)
{
    openedFile.reset();
    if (!info.isFile())
        return false;
    auto file = std::make_unique<FifFileDevice>(info.filePath(), &headBuffer);
    if (!file->open(QIODevice::ReadOnly) || !isTextFile(*file))
        return false;
    openedPath = info.filePath();
    openedFile = std::move(file);
    return true;
}

bool FifWorker::isTextFile(FifFileDevice& file)
{
    // The bytes themselves tell what decoding them through a QTextStream
    // would; only files of a UTF-16 or UTF-32 byte-order mark need decoding.
    FifTextTest test;
    const QByteArray& head = file.head();
    FifTextTest::Verdict verdict = test.feed(head.constData(), head.size());
    if (verdict == FifTextTest::Undecided && head.size() == FifFileDevice::headSize) {
        QByteArray more(FifFileDevice::blockSize, Qt::Uninitialized);
        qint64 position = head.size();
        while (verdict == FifTextTest::Undecided) {
            const qint64 got = file.readAt(more.data(), more.size(), position);
            if (got <= 0)
                break;
            position += got;
            verdict = test.feed(more.constData(), got);
        }
    }
    verdict = test.finish();
    if (verdict == FifTextTest::OtherEncoding)
        return isTextByStream(file.filePath());
    return verdict == FifTextTest::Text;
}

bool FifWorker::isTextByStream(const QString& path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return false;
    // Read in pieces rather than by readLine(), so that one huge first line
    // does not have to fit in memory. Only "\n" ends a line, as for
    // readLine(); line breaks are white space and never decide the answer.
    QTextStream stream(&file);
    int lines = 0;
    while (!stream.atEnd()) {
        const QString piece = stream.read(4096);
        if (piece.isEmpty())
            break;
        for (const QChar c : piece) {
            if (c == QLatin1Char('\n')) {
                if (++lines == FifTextTest::linesExamined)
                    return true;
            } else if (c.category() == QChar::Other_Control && !c.isSpace()) {
                return false;
            }
        }
    }
    return true;
}

void FifWorker::searchFile(const QString& path)
{
    std::unique_ptr<FifFileDevice> file;
    if (openedFile && openedPath == path) {
        file = std::move(openedFile);
    } else {
        openedFile.reset();  // it may hold the head buffer
        file = std::make_unique<FifFileDevice>(path, &headBuffer);
        if (!file->open(QIODevice::ReadOnly))
            return;
    }
    if (job)
        job->incrementReadFileCount();
    {
        FifHandOff handOff(job);
        emit searching(path);
    }

    FifHitList batch;
    const bool hasHit = scanner->scan(
        *file,
        [&](const FifLineScanner::Match& match) {
            FifHit hit(path, match.line, match.text, match.offset, match.rawOffset, job);
            hit.column = match.column;
            hit.length = match.length;
            sendHit(hit, batch);
        },
        [this] { return job && job->shouldStop(); });

    if (hasHit && job)
        job->incrementFileHitCount();
    if (!batch.isEmpty()) {
        FifHandOff handOff(job);
        emit found(batch);
    }
}

void FifWorker::sendHit(const FifHit& hit, FifHitList& batch)
{
    // The first hits of a search go singly, so they show at once; later ones
    // in batches whose size grows with the rows the model already holds.
    const int rows = job ? job->getLineHitCount() : 0;
    if (rows < 10) {
        // Rows can drop when the view is cleared during a search; what is
        // waiting in the batch goes first so the order stays.
        if (!batch.isEmpty()) {
            {
                FifHandOff handOff(job);
                emit found(batch);
            }
            batch.clear();
        }
        FifHandOff handOff(job);
        emit found(hit);
        return;
    }
    const int limit = qBound(10, 2 * rows, 100);
    if (batch.size() > limit) {
        {
            FifHandOff handOff(job);
            emit found(batch);
        }
        batch.clear();
    }
    batch.append(hit);
}

} // namespace Orba
} // namespace Gui
