// Repeated start/stop cycles on a large tree, and jobs destroyed while their
// search runs. Sizes are fixed; nothing here asserts a duration.

#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "TestTree.h"

#include <QPointer>
#include <QSet>
#include <QtTest>

using namespace Gui::Orba;

namespace {

constexpr int folderCount = 100;
constexpr int filesPerFolder = 100;
constexpr int cycles = 20;

// What a hit says, without the job pointer.
struct Seen
{
    QString file;
    int line;
    int offset;
    int rawOffset;
    QString text;
    bool operator==(const Seen& o) const
    {
        return file == o.file && line == o.line && offset == o.offset
               && rawOffset == o.rawOffset && text == o.text;
    }
};

QList<Seen> rowsOf(FifJob* job)
{
    QList<Seen> rows;
    FifHitsModel* model = job->getHitsModel();
    for (int row = 0; row < model->rowCount(); ++row) {
        const FifHit hit = model->data(model->index(row, 0), Qt::UserRole).value<FifHit>();
        rows.append({hit.file, hit.line, hit.offset, hit.rawOffset, hit.text});
    }
    return rows;
}

// Every file has six lines; one in four holds the needle twice, one in four
// once, the rest not at all.
QByteArray contents(int index)
{
    QByteArray bytes;
    for (int line = 1; line <= 6; ++line) {
        const bool needle = (index % 4 == 0 && (line == 2 || line == 5))
                            || (index % 4 == 1 && line == 3);
        bytes += "file " + QByteArray::number(index) + " line " + QByteArray::number(line);
        bytes += needle ? " has the Needle\n" : " has nothing\r\n";
    }
    return bytes;
}

// Runs one search; `stopAfterFiles` < 0 lets it complete, 0 stops it before
// it starts, n stops it once the n-th searched file is reported.
// Returns the files reported by searching().
QStringList runOnce(FifJob* job, const FifInput& request, int stopAfterFiles, bool* ended)
{
    QStringList searched;
    QEventLoop loop;
    *ended = false;
    QObject context;
    QObject::connect(job, &FifJob::searching, &context, [&](const QString& file) {
        searched.append(file);
        if (stopAfterFiles > 0 && searched.size() == stopAfterFiles)
            job->stop();
    });
    QObject::connect(job, &QThread::finished, &loop, [&] { *ended = true; loop.quit(); },
                     Qt::QueuedConnection);
    // A stop requested while no search runs stays set, and the next search
    // ends at its first poll.
    if (stopAfterFiles == 0)
        job->stop();
    if (!job->start(request))
        return searched;
    QTimer::singleShot(300000, &loop, &QEventLoop::quit);
    if (!*ended)
        loop.exec();
    QCoreApplication::processEvents();
    return searched;
}

} // namespace

class tst_FifStress : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void startStopCycles();
    void destroyRunningJob_data();
    void destroyRunningJob();
    void destroyManagerWithRunningJobs();
    void startRefusedWhileRunning();

private:
    QTemporaryDir dir;
    FifInput request;
};

void tst_FifStress::initTestCase()
{
    QVERIFY(dir.isValid());
    for (int folder = 0; folder < folderCount; ++folder) {
        const QString name = QStringLiteral("d%1").arg(folder, 3, 10, QLatin1Char('0'));
        QVERIFY(QDir(dir.path()).mkpath(name));
        for (int file = 0; file < filesPerFolder; ++file) {
            const int index = folder * filesPerFolder + file;
            QFile out(dir.path() + QLatin1Char('/') + name
                      + QStringLiteral("/f%1.txt").arg(file, 3, 10, QLatin1Char('0')));
            QVERIFY(out.open(QIODevice::WriteOnly));
            QVERIFY(out.write(contents(index)) > 0);
        }
    }
    request.what = QStringLiteral("needle");
    request.where = dir.path();
}

void tst_FifStress::startStopCycles()
{
    FifManager manager;
    FifJob* job = manager.getJob(0);
    const int fileCount = folderCount * filesPerFolder;

    bool ended = false;
    const QStringList fullSearched = runOnce(job, request, -1, &ended);
    QVERIFY(ended);
    const QList<Seen> full = rowsOf(job);
    QCOMPARE(fullSearched.size(), fileCount);
    QCOMPARE(job->getReadFileCount(), fileCount);
    QCOMPARE(full.size(), fileCount / 4 * 3);
    QCOMPARE(job->getFileHitCount(), fileCount / 2);
    QCOMPARE(job->getLineHitCount(), full.size());
    for (const Seen& hit : full)
        QVERIFY2(hit.text.endsWith(QLatin1String("has the Needle")), qPrintable(hit.text));

    qint64 filesChecked = fileCount;
    qint64 hitsChecked = full.size();
    int stoppedRuns = 0;
    for (int cycle = 0; cycle < cycles; ++cycle) {
        // Every fifth run is stopped before it starts, every fifth completes,
        // the others are stopped after a growing number of files.
        const int stopAfter = cycle % 5 == 0 ? 0 : cycle % 5 == 4 ? -1 : cycle * 450 + 1;
        const QStringList searched = runOnce(job, request, stopAfter, &ended);
        QVERIFY2(ended, qPrintable(QStringLiteral("cycle %1 did not end").arg(cycle)));
        QVERIFY(!job->isRunning());
        QVERIFY2(!job->shouldStop(), "the end of a run clears the stop flag");

        const QList<Seen> rows = rowsOf(job);
        QVERIFY(rows.size() <= full.size());
        for (int i = 0; i < rows.size(); ++i)
            QVERIFY2(rows.at(i) == full.at(i),
                     qPrintable(QStringLiteral("cycle %1 row %2: %3 (%4)")
                                    .arg(cycle).arg(i).arg(rows.at(i).file).arg(rows.at(i).line)));
        QCOMPARE(searched, fullSearched.mid(0, searched.size()));
        QCOMPARE(job->getReadFileCount(), searched.size());
        QSet<QString> hitFiles;
        for (const Seen& row : rows)
            hitFiles.insert(row.file);
        QCOMPARE(job->getFileHitCount(), hitFiles.size());
        QCOMPARE(job->getLineHitCount(), rows.size());
        // Rows of a file come only after searching() named it.
        if (!rows.isEmpty())
            QVERIFY(searched.contains(rows.constLast().file));

        if (stopAfter < 0) {
            QCOMPARE(rows.size(), full.size());
            QCOMPARE(job->getReadFileCount(), fileCount);
        } else if (stopAfter == 0) {
            QCOMPARE(job->getReadFileCount(), 0);
            QVERIFY(rows.isEmpty());
        } else {
            QVERIFY(searched.size() >= stopAfter);
            // The request may come after the walk's end; then it is complete.
            if (searched.size() == fileCount)
                QCOMPARE(rows.size(), full.size());
        }
        stoppedRuns += searched.size() < fileCount ? 1 : 0;
        filesChecked += searched.size();
        hitsChecked += rows.size();
    }
    qInfo("start/stop: %d cycles (%d ended early) after one full run; %lld files and %lld hits checked",
          cycles, stoppedRuns, filesChecked, hitsChecked);
}

void tst_FifStress::destroyRunningJob_data()
{
    QTest::addColumn<int>("delayMs");
    QTest::addColumn<bool>("deliverFirst");
    QTest::newRow("at once") << 0 << false;
    QTest::newRow("hits queued, none delivered") << 30 << false;
    QTest::newRow("hits delivered") << 30 << true;
    QTest::newRow("later, hits queued") << 150 << false;
}

// A job destroyed while its search runs stops it, outlives its thread, and
// nothing is delivered to it or through it afterwards.
void tst_FifStress::destroyRunningJob()
{
    QFETCH(int, delayMs);
    QFETCH(bool, deliverFirst);
    FifManager manager; // registers the value types
    auto* job = new FifJob(nullptr);
    QPointer<FifJob> alive(job);
    int searchingAfter = 0;
    int rowsAfter = 0;
    bool destroyed = false;
    QObject probe;
    connect(job, &FifJob::searching, &probe, [&] { searchingAfter += destroyed ? 1 : 0; });
    connect(job->getHitsModel(), &QAbstractItemModel::rowsInserted, &probe,
            [&] { rowsAfter += destroyed ? 1 : 0; });

    QVERIFY(job->start(request));
    if (deliverFirst)
        QTest::qWait(delayMs);
    else
        QThread::msleep(ulong(delayMs));
    FifHit kept;
    if (job->getLineHitCount() > 0)
        kept = job->getHitsModel()->data(job->getHitsModel()->index(0, 0), Qt::UserRole)
                   .value<FifHit>();
    delete job;
    destroyed = true;
    QVERIFY(alive.isNull());
    QTest::qWait(50);
    QCOMPARE(searchingAfter, 0);
    QCOMPARE(rowsAfter, 0);
    QVERIFY2(!kept.isValid(), "a hit of a destroyed job is no longer valid");
    QVERIFY(kept.getCanonicalFilePath().isEmpty());
}

void tst_FifStress::destroyManagerWithRunningJobs()
{
    auto* manager = new FifManager();
    QList<QPointer<FifJob>> jobs;
    for (int slot = 0; slot < 3; ++slot) {
        FifJob* job = manager->getJob(slot);
        QVERIFY(job->start(request));
        jobs.append(job);
    }
    QThread::msleep(20);
    delete manager;
    for (const QPointer<FifJob>& job : jobs)
        QVERIFY(job.isNull());
    QTest::qWait(50);
}

void tst_FifStress::startRefusedWhileRunning()
{
    FifManager manager;
    FifJob* job = manager.getJob(0);
    QVERIFY(job->start(request));
    FifInput other = request;
    other.what = QStringLiteral("nothing");
    // Refused while the thread runs: the running search is left alone.
    if (job->isRunning()) {
        QVERIFY(!job->start(other));
        QCOMPARE(job->getInput().what, request.what);
    }
    job->stop();
    QTRY_VERIFY_WITH_TIMEOUT(!job->isRunning(), 60000);
    QCoreApplication::processEvents();
    bool ended = false;
    runOnce(job, other, -1, &ended);
    QVERIFY(ended);
    // Every line without the needle says "nothing".
    const int fileCount = folderCount * filesPerFolder;
    QCOMPARE(job->getLineHitCount(), fileCount * 6 - fileCount / 4 * 3);
}

QTEST_MAIN(tst_FifStress)
#include "tst_fifstress.moc"
