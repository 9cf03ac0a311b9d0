#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "TestTree.h"

#include <QtTest>

using namespace Gui::Orba;

class tst_FifSmoke : public QObject
{
    Q_OBJECT

private slots:
    void searchesATree()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "alpha\nbeta\r\nalpha beta\n"));
        QVERIFY(TestTree::write(dir.path(), "sub/b.txt", "nothing\nbeta"));
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifInput request;
        request.what = "beta";
        request.where = dir.path();
        FIF_RUN_JOB(job, request, 5000);
        QCOMPARE(job->getLineHitCount(), 3);
        QCOMPARE(job->getReadFileCount(), 2);
        QCOMPARE(job->getFileHitCount(), 2);
    }
};

QTEST_MAIN(tst_FifSmoke)
#include "tst_fifsmoke.moc"
