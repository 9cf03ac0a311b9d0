#include "FifHit.h"
#include "FifJob.h"
#include "FifManager.h"

#include <QDir>
#include <QtTest>

using namespace Gui::Orba;

class tst_FifHit : public QObject
{
    Q_OBJECT

private slots:
    void defaultHitIsInvalid()
    {
        const FifHit hit;
        QVERIFY(!hit.isValid());
        QVERIFY(hit.toString().isEmpty());
        QVERIFY(hit.getCanonicalFilePath().isEmpty());
        QCOMPARE(hit.line, -1);
        QCOMPARE(hit.offset, -1);
        QCOMPARE(hit.rawOffset, -1);
        QVERIFY(!hit.job);
    }

    void constructorArgumentOrder()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        const FifHit hit("src/main.cpp", 12, "  int x;", 40, 52, job);
        QCOMPARE(hit.file, QStringLiteral("src/main.cpp"));
        QCOMPARE(hit.line, 12);
        QCOMPARE(hit.text, QStringLiteral("  int x;"));
        QCOMPARE(hit.offset, 40);
        QCOMPARE(hit.rawOffset, 52);
        QCOMPARE(hit.job.data(), job);
    }

    void validityFollowsLineAndJob_data()
    {
        QTest::addColumn<int>("line");
        QTest::addColumn<bool>("valid");
        QTest::newRow("line 0") << 0 << true;
        QTest::newRow("line 1") << 1 << true;
        QTest::newRow("line -1") << -1 << false;
    }

    void validityFollowsLineAndJob()
    {
        QFETCH(int, line);
        QFETCH(bool, valid);
        FifManager manager;
        const FifHit hit("a", line, "t", 0, 0, manager.getJob(0));
        QCOMPARE(hit.isValid(), valid);
        QCOMPARE(FifHit("a", line, "t", 0, 0, nullptr).isValid(), false);
    }

    void toStringKeepsTextAndPercentSigns()
    {
        FifManager manager;
        const FifHit hit("src/a%2b.cpp", 12, "  int x; // 100%1", 0, 0, manager.getJob(0));
        QCOMPARE(hit.toString(),
                 QDir::toNativeSeparators("src/a%2b.cpp") + " (12):   int x; // 100%1");
    }

    void hitOfDestroyedJobIsInvalidButSafe()
    {
        auto* manager = new FifManager;
        FifHit hit("f.txt", 3, "text", 1, 1, manager->getJob(0));
        FifHit copy = hit;
        QVERIFY(hit.isValid());
        delete manager;
        QVERIFY(!hit.isValid());
        QVERIFY(!copy.isValid());
        QVERIFY(copy.toString().isEmpty());
        QVERIFY(!copy.getMainWindow());
        FifHit third(copy);
        third = hit;
        third = third;
        QCOMPARE(third.text, QStringLiteral("text"));
    }

    void variantCast()
    {
        FifManager manager;
        const FifHit hit("f", 2, "t", 3, 4, manager.getJob(0));
        const QVariant variant = QVariant::fromValue(hit);
        QCOMPARE(QString(variant.metaType().name()), QStringLiteral("Gui::Orba::FifHit"));
        QCOMPARE(variant.value<FifHit>().rawOffset, 4);
        QVERIFY(!QVariant(QStringLiteral("x")).value<FifHit>().isValid());
    }
};

QTEST_GUILESS_MAIN(tst_FifHit)
#include "tst_fifhit.moc"
