#include "FifHit.h"
#include "FifHitsModel.h"
#include "FifInput.h"
#include "FifJob.h"
#include "FifManager.h"
#include "MainWindow.h"

#include <QtTest>

#include <memory>
#include <new>

using namespace Gui::Orba;

class tst_FifManager : public QObject
{
    Q_OBJECT

private slots:
    void metaTypesComeWithTheFirstManager()
    {
        // The list's own name exists only once a manager has registered it.
        QVERIFY(!QMetaType::fromName("Gui::Orba::FifHitList").isValid());
        MainWindow window;
        FifManager::getInstance(&window);
        QCOMPARE(QMetaType::fromName("Gui::Orba::FifHit").id(), qMetaTypeId<FifHit>());
        QCOMPARE(QMetaType::fromName("Gui::Orba::FifHitList").id(), qMetaTypeId<FifHitList>());
        QCOMPARE(QMetaType::fromName("Gui::Orba::FifInput").id(), qMetaTypeId<FifInput>());
    }

    void queuedCallsCarryTheTypesByName()
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        const FifHitList hits{FifHit("a.txt", 1, "one", 0, 0, job),
                              FifHit("b.txt", 2, "two", 0, 0, job)};
        QVERIFY(QMetaObject::invokeMethod(job, "appendHits", Qt::QueuedConnection,
                                          QGenericArgument("Gui::Orba::FifHitList", &hits)));
        const FifHit hit("c.txt", 3, "three", 0, 0, job);
        QVERIFY(QMetaObject::invokeMethod(job, "appendHit", Qt::QueuedConnection,
                                          QGenericArgument("Gui::Orba::FifHit", &hit)));
        QTRY_COMPARE(job->getLineHitCount(), 3);
    }

    void oneManagerPerWindow()
    {
        MainWindow first;
        MainWindow second;
        FifManager* a = FifManager::getInstance(&first);
        FifManager* b = FifManager::getInstance(&second);
        QVERIFY(a && b && a != b);
        QCOMPARE(FifManager::getInstance(&first), a);
        QCOMPARE(a->parent(), &first);
        QCOMPARE(b->getMainWindow(), &second);
        QCOMPARE(a->getJobCount(), 0);

        // A manager made directly is not entered in the map, nor removes
        // the entry when it goes.
        delete new FifManager(&first);
        QCOMPARE(FifManager::getInstance(&first), a);
        // A deleted manager leaves the map: the window gets a new one.
        QPointer<FifManager> gone = a;
        delete a;
        FifManager* again = FifManager::getInstance(&first);
        QVERIFY(again && !gone);
        QCOMPARE(again->parent(), &first);

        QObject notAWindow;
        FifManager orphan;
        orphan.setParent(&notAWindow);
        QVERIFY(!orphan.getMainWindow());
        orphan.setParent(nullptr);
    }

    void getJobGrowsOneSlotAtATime()
    {
        FifManager manager;
        QVERIFY(!manager.getJob(-1));
        QCOMPARE(manager.getJobCount(), 0);

        FifJob* zero = manager.getJob(3); // makes slot 0, and only it
        QVERIFY(zero);
        QCOMPARE(manager.getJobCount(), 1);
        QCOMPARE(manager.getJob(0), zero);
        QCOMPARE(manager.getJobCount(), 1);

        FifJob* one = manager.getJob(7);
        QVERIFY(one && one != zero);
        QCOMPARE(manager.getJobCount(), 2);
        QCOMPARE(manager.getJob(1), one);
        QVERIFY(!manager.getJob(-5));
        QCOMPARE(manager.getJobCount(), 2);

        QCOMPARE(one->getManager(), &manager);
    }

    void replaceJob_data()
    {
        QTest::addColumn<int>("slotsBefore");
        QTest::addColumn<int>("index");
        QTest::addColumn<bool>("returnsNull");
        QTest::addColumn<bool>("returnsNewJob"); // one the call itself made
        QTest::addColumn<int>("slotsAfter");
        QTest::addColumn<int>("slotHoldingJob"); // -1: nowhere

        QTest::newRow("slot 0 is fixed") << 1 << 0 << true << false << 1 << -1;
        QTest::newRow("negative") << 1 << -1 << true << false << 1 << -1;
        QTest::newRow("next slot") << 1 << 1 << false << true << 2 << 1;
        QTest::newRow("past the next slot") << 1 << 3 << false << true << 2 << -1;
        QTest::newRow("existing slot") << 3 << 2 << false << false << 3 << 2;
        QTest::newRow("new manager") << 0 << 1 << false << true << 1 << -1;
    }

    void replaceJob()
    {
        QFETCH(int, slotsBefore);
        QFETCH(int, index);
        QFETCH(bool, returnsNull);
        QFETCH(bool, returnsNewJob);
        QFETCH(int, slotsAfter);
        QFETCH(int, slotHoldingJob);

        FifManager manager;
        QList<FifJob*> before;
        for (int i = 0; i < slotsBefore; ++i)
            before << manager.getJob(i);
        auto* job = new FifJob(&manager);

        FifJob* old = manager.replaceJob(index, job);
        QCOMPARE(old == nullptr, returnsNull);
        if (old) {
            QCOMPARE(before.contains(old), !returnsNewJob);
            QCOMPARE(old->parent(), &manager); // handed back, still owned
        }
        QCOMPARE(manager.getJobCount(), slotsAfter);
        for (int i = 0; i < manager.getJobCount(); ++i) {
            if (i == slotHoldingJob)
                QCOMPARE(manager.getJob(i), job);
            else
                QVERIFY(manager.getJob(i) != job);
        }
        if (slotsBefore > 0)
            QCOMPARE(manager.getJob(0), before.at(0));
        if (!returnsNull && slotHoldingJob < 0)
            QCOMPARE(manager.getJob(slotsAfter - 1), old); // the slot the call appended
    }

    void slotOfADestroyedJobGetsANewOne()
    {
        FifManager manager;
        manager.getJob(0);
        auto* mine = new FifJob(&manager);
        manager.replaceJob(1, mine);
        delete mine;
        FifJob* fresh = manager.getJob(1);
        QVERIFY(fresh);
        QCOMPARE(fresh->getManager(), &manager);
        QCOMPARE(manager.getJobCount(), 2);
        QCOMPARE(manager.getJob(1), fresh);
    }

    void jobsAndHitsKnowTheirWindow()
    {
        MainWindow window;
        FifManager* manager = FifManager::getInstance(&window);
        FifJob* job = manager->getJob(0);
        QCOMPARE(job->getManager(), manager);
        QCOMPARE(job->getMainWindow(), &window);
        FifManager loose;
        QCOMPARE(loose.getJob(0)->getMainWindow(), nullptr);
        FifJob stray(nullptr);
        QObject other;
        stray.setParent(&other);
        QVERIFY(!stray.getManager());
        QVERIFY(!stray.getMainWindow());
        stray.setParent(nullptr);

        QCOMPARE(FifHit("a", 0, "t", 0, 0, job).getMainWindow(), &window);
        QCOMPARE(FifHit("a", -1, "t", 0, 0, job).getMainWindow(), nullptr);
        QCOMPARE(FifHit("a", 1, "t", 0, 0, nullptr).getMainWindow(), nullptr);
        QCOMPARE(FifHit("a", 1, "t", 0, 0, &stray).getMainWindow(), nullptr);
        auto* direct = new FifManager(&window);
        const FifHit orphaned("a", 1, "t", 0, 0, direct->getJob(0));
        QCOMPARE(orphaned.getMainWindow(), &window);
        delete direct; // and its job with it
        QCOMPARE(orphaned.getMainWindow(), nullptr);
    }

    void deletingTheWindowRemovesItsManager()
    {
        auto window = std::make_unique<MainWindow>();
        QPointer<FifManager> manager = FifManager::getInstance(window.get());
        QPointer<FifJob> job = manager->getJob(0);
        QPointer<FifHitsModel> model = job->getHitsModel();
        window.reset();
        QVERIFY(!manager);
        QVERIFY(!job);
        QVERIFY(!model);
    }

    void closingTheWindowRemovesItsManager()
    {
        auto* window = new MainWindow;
        window->setAttribute(Qt::WA_DeleteOnClose);
        QPointer<MainWindow> windowGuard(window);
        QPointer<FifManager> manager = FifManager::getInstance(window);
        window->show();
        QVERIFY(QTest::qWaitForWindowExposed(window));
        window->close();
        QTRY_VERIFY(!windowGuard);
        QVERIFY(!manager);
    }

    void windowAtTheSameAddressGetsANewManager()
    {
        // Two windows one after the other in the same storage: the map must
        // not hand the second one the first one's (destroyed) manager.
        alignas(MainWindow) unsigned char storage[sizeof(MainWindow)];
        auto* first = new (storage) MainWindow;
        QPointer<FifManager> old = FifManager::getInstance(first);
        first->~MainWindow();
        QVERIFY(!old);

        auto* second = new (storage) MainWindow;
        QCOMPARE(static_cast<void*>(second), static_cast<void*>(first));
        FifManager* fresh = FifManager::getInstance(second);
        QVERIFY(fresh);
        QCOMPARE(fresh->getMainWindow(), second);
        QCOMPARE(fresh->getJobCount(), 0);
        QCOMPARE(FifManager::getInstance(second), fresh);
        second->~MainWindow();
    }

    void nullWindowIsAnOrdinaryKey()
    {
        QPointer<FifManager> manager = FifManager::getInstance(nullptr);
        QVERIFY(manager);
        QCOMPARE(FifManager::getInstance(nullptr), manager.data());
        QVERIFY(!manager->parent());
        QVERIFY(!manager->getMainWindow());
        QCOMPARE(manager->getJob(0)->getMainWindow(), nullptr);

        MainWindow window;
        QVERIFY(FifManager::getInstance(&window) != manager);

        delete manager.data();
        FifManager* again = FifManager::getInstance(nullptr);
        QVERIFY(again);
        QCOMPARE(again->getJobCount(), 0);
        delete again;
    }

    void destroyingAManagerStopsItsSearch()
    {
        auto* manager = new FifManager;
        QTemporaryDir dir;
        for (int i = 0; i < 200; ++i) {
            QFile file(dir.filePath(QString("f%1.txt").arg(i)));
            QVERIFY(file.open(QIODevice::WriteOnly));
            file.write(QByteArray(20000, 'x') + "\nneedle\n");
        }
        QPointer<FifJob> job = manager->getJob(0);
        FifInput request;
        request.what = "needle";
        request.where = dir.path();
        QVERIFY(job->start(request));
        delete manager; // must not leave the search running on a dead job
        QVERIFY(!job);
    }
};

QTEST_MAIN(tst_FifManager)
#include "tst_fifmanager.moc"
