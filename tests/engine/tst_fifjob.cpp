#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "TestTree.h"

#include <QAbstractItemModelTester>
#include <QAtomicInt>
#include <QtTest>

using namespace Gui::Orba;

class tst_FifJob : public QObject
{
    Q_OBJECT

private:
    QTemporaryDir tree;
    QString bigFile;

    FifInput request(const QString& what, const QString& where)
    {
        FifInput input;
        input.what = what;
        input.where = where;
        return input;
    }

private slots:
    void initTestCase()
    {
        QVERIFY(tree.isValid());
        QVERIFY(TestTree::write(tree.path(), "one/a.txt", "alpha\nbeta alpha\n"));
        QVERIFY(TestTree::write(tree.path(), "one/b.txt", "gamma\n"));
        QVERIFY(TestTree::write(tree.path(), "two/c.txt", "alpha\n"));
        // Enough lines to keep a search busy for a while.
        QByteArray lines;
        for (int i = 0; i < 200000; ++i)
            lines += "some text that every wildcard search finds " + QByteArray::number(i) + '\n';
        QVERIFY(TestTree::write(tree.path(), "big/big.txt", lines));
        bigFile = tree.path() + "/big";
    }

    void newJob()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        QCOMPARE(job->getLineHitCount(), 0);
        QCOMPARE(job->getReadFileCount(), 0);
        QCOMPARE(job->getFileHitCount(), 0);
        QVERIFY(!job->shouldStop());
        QVERIFY(job->getInput().what.isEmpty());
        QCOMPARE(job->getInput().filter, QStringLiteral("*"));
        FifHitsModel* model = job->getHitsModel();
        QVERIFY(model);
        QCOMPARE(model->parent(), job);
        QCOMPARE(job->getHitsModel(), model);
        QCOMPARE(model->rowCount(), 0);
        QCOMPARE(job->getManager(), &manager);
    }

    void counters()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        job->incrementReadFileCount();
        job->incrementReadFileCount();
        job->incrementFileHitCount();
        QCOMPARE(job->getReadFileCount(), 2);
        QCOMPARE(job->getFileHitCount(), 1);
        job->setShouldStop(true);
        QVERIFY(job->shouldStop());
        job->setShouldStop(false);
        job->stop();
        QVERIFY(job->shouldStop());
    }

    void searchAndRestart()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        new QAbstractItemModelTester(job->getHitsModel(),
                                     QAbstractItemModelTester::FailureReportingMode::QtTest, job);
        FIF_RUN_JOB(job, request("alpha", tree.path() + "/one;" + tree.path() + "/two"), 10000);
        QCOMPARE(job->getLineHitCount(), 3);
        QCOMPARE(job->getFileHitCount(), 2);
        QCOMPARE(job->getReadFileCount(), 3);

        // A new start empties the model in one removal before aboutToStart
        // and zeroes the counters.
        FifHitsModel* model = job->getHitsModel();
        QSignalSpy removed(model, &QAbstractItemModel::rowsRemoved);
        int rowsAtAboutToStart = -1;
        int readAtAboutToStart = -1;
        connect(job, &FifJob::aboutToStart, this, [&] {
            rowsAtAboutToStart = model->rowCount();
            readAtAboutToStart = job->getReadFileCount();
            QVERIFY(!job->isRunning());
        });
        FIF_RUN_JOB(job, request("gamma", tree.path() + "/one"), 10000);
        QCOMPARE(removed.count(), 1);
        QCOMPARE(rowsAtAboutToStart, 0);
        QCOMPARE(readAtAboutToStart, 0);
        QCOMPARE(job->getLineHitCount(), 1);
        QCOMPARE(job->getReadFileCount(), 2);
        QCOMPARE(job->getInput().what, QStringLiteral("gamma"));
    }

    void searchingReportsEachFile()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        QSignalSpy searching(job, &FifJob::searching);
        FIF_RUN_JOB(job, request("zzz", tree.path() + "/one"), 10000);
        QCOMPARE(searching.count(), 2);
        QStringList files;
        for (const QList<QVariant>& args : searching)
            files << QFileInfo(args.at(0).toString()).fileName();
        files.sort();
        QCOMPARE(files, QStringList({"a.txt", "b.txt"}));
    }

    void finishedSeesThreadEnded()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        bool runningAtFinished = true;
        connect(job, &QThread::finished, this, [&] { runningAtFinished = job->isRunning(); });
        FIF_RUN_JOB(job, request("alpha", tree.path()), 10000);
        QVERIFY(!runningAtFinished);
    }

    void startWhileRunningIsRefused()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifInput input = request("*", bigFile);
        input.matchType = QRegExp::Wildcard;
        QSignalSpy aboutToStart(job, &FifJob::aboutToStart);
        // Counted in this thread: finished() is emitted on the job's thread,
        // where a QSignalSpy would record it while this thread reads it.
        int finished = 0;
        connect(job, &QThread::finished, this, [&finished] { ++finished; },
                Qt::QueuedConnection);
        QVERIFY(job->start(input));
        QVERIFY(job->isRunning());
        QVERIFY(!job->start(request("other", tree.path())));
        QCOMPARE(aboutToStart.count(), 1);
        QCOMPARE(job->getInput().what, QStringLiteral("*"));
        job->stop();
        QTRY_VERIFY_WITH_TIMEOUT(finished == 1, 10000);
        QTRY_VERIFY(!job->isRunning());
        QCOMPARE(finished, 1);
        // The stop flag is clear again and the job starts at once.
        QVERIFY(!job->shouldStop());
        FIF_RUN_JOB(job, request("gamma", tree.path() + "/one"), 10000);
        QCOMPARE(job->getLineHitCount(), 1);
    }

    void stopBeforeStartEndsAtFirstPoll()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        job->stop();
        QVERIFY(job->shouldStop());
        FIF_RUN_JOB(job, request("alpha", tree.path()), 10000);
        QCOMPARE(job->getReadFileCount(), 0);
        QCOMPARE(job->getLineHitCount(), 0);
        QVERIFY(!job->shouldStop());
    }

    void appendSlots()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifHitsModel* model = job->getHitsModel();
        new QAbstractItemModelTester(model, QAbstractItemModelTester::FailureReportingMode::QtTest,
                                     job);
        QSignalSpy inserted(model, &QAbstractItemModel::rowsInserted);

        job->appendHit(FifHit("f", -1, "bad", 0, 0, job));
        job->appendHit(FifHit("f", 1, "no job", 0, 0, nullptr));
        QCOMPARE(model->rowCount(), 0);
        QCOMPARE(inserted.count(), 0);

        job->appendHit(FifHit("f", 1, "one", 0, 0, job));
        QCOMPARE(model->rowCount(), 1);

        FifHitList batch{FifHit("f", 2, "two", 0, 0, job), FifHit("f", -1, "bad", 0, 0, job),
                         FifHit("f", 3, "three", 0, 0, job)};
        inserted.clear();
        job->appendHits(batch);
        QCOMPARE(inserted.count(), 1);
        QCOMPARE(model->rowCount(), 3);
        QCOMPARE(model->data(model->index(1, 0), Qt::ToolTipRole).toString(), QStringLiteral("two"));
        QCOMPARE(model->data(model->index(2, 0), Qt::ToolTipRole).toString(),
                 QStringLiteral("three"));

        inserted.clear();
        job->appendHits(FifHitList{FifHit()});
        QCOMPARE(inserted.count(), 0);
        QCOMPARE(job->getLineHitCount(), 3);
    }

    // Views told of new rows find the hits in them at once; each hit is
    // still announced as written.
    void appendedRowsHoldTheirHitsWhenAnnounced()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifHitsModel* model = job->getHitsModel();
        new QAbstractItemModelTester(model, QAbstractItemModelTester::FailureReportingMode::QtTest,
                                     job);
        QStringList seen;
        connect(model, &QAbstractItemModel::rowsInserted, this,
                [&](const QModelIndex&, int first, int last) {
                    for (int row = first; row <= last; ++row)
                        seen << model->data(model->index(row, 0), Qt::ToolTipRole).toString();
                });
        QList<int> changedRows;
        connect(model, &QAbstractItemModel::dataChanged, this,
                [&](const QModelIndex& topLeft, const QModelIndex& bottomRight) {
                    QCOMPARE(topLeft, bottomRight);
                    changedRows << topLeft.row();
                });
        job->appendHit(FifHit("f", 1, "one", 0, 0, job));
        job->appendHits(FifHitList{FifHit("f", 2, "two", 0, 0, job), FifHit(),
                                   FifHit("f", 3, "three", 0, 0, job)});
        QCOMPARE(seen, QStringList({"one", "two", "three"}));
        QCOMPARE(changedRows, QList<int>({0, 1, 2}));
        QCOMPARE(model->data(model->index(2, 0), Qt::UserRole).value<FifHit>().line, 3);
    }

    void canonicalPathUsesWorkingDirOfStart()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        const QString before = QDir::currentPath();
        QVERIFY(QDir::setCurrent(tree.path() + "/one"));
        FIF_RUN_JOB(job, request("gamma", "."), 10000);
        QVERIFY(QDir::setCurrent(before));
        QCOMPARE(job->getLineHitCount(), 1);
        const FifHit hit =
            job->getHitsModel()->data(job->getHitsModel()->index(0, 0), Qt::UserRole).value<FifHit>();
        QVERIFY(QFileInfo(hit.file).isRelative());
        QCOMPARE(hit.getCanonicalFilePath(),
                 QFileInfo(tree.path() + "/one/b.txt").canonicalFilePath());

        // A file deleted after the search: no path, same description.
        QTemporaryDir other;
        QVERIFY(TestTree::write(other.path(), "gone.txt", "x\n"));
        FifHit gone(other.path() + "/gone.txt", 1, "x", 0, 0, job);
        const QString description = gone.toString();
        QVERIFY(!gone.getCanonicalFilePath().isEmpty());
        QVERIFY(QFile::remove(other.path() + "/gone.txt"));
        QVERIFY(gone.getCanonicalFilePath().isEmpty());
        QCOMPARE(gone.toString(), description);
    }

    void managerOfOtherParentIsNull()
    {
        QObject owner;
        auto* job = new FifJob(nullptr);
        job->setParent(&owner);
        QVERIFY(!job->getManager());
        QVERIFY(!job->getMainWindow());
    }

    void destroyingABusyJobWaitsForItsThread()
    {
        auto* manager = new FifManager;
        FifJob* job = manager->getJob(0);
        FifInput input = request("*", bigFile);
        input.matchType = QRegExp::Wildcard;
        QAtomicInt ended;
        connect(job, &QThread::finished, job, [&ended] { ended.storeRelaxed(1); },
                Qt::DirectConnection);
        QVERIFY(job->start(input));
        // Let the search get going and queue hits for the GUI thread.
        QTRY_VERIFY(job->getLineHitCount() > 100);
        QVERIFY(job->isRunning());
        delete manager;
        QCOMPARE(ended.loadRelaxed(), 1);
        // Hits queued for the destroyed job are dropped with it.
        QCoreApplication::processEvents();
    }
};

QTEST_GUILESS_MAIN(tst_FifJob)
#include "tst_fifjob.moc"
