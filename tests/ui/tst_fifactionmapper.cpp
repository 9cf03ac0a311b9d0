#include "DockTest.h"
#include "FifActionMapper.h"
#include "FifActions.h"
#include "FifHitsView.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "JobRunner.h"
#include "MainWindow.h"
#include "TestTree.h"

#include <QSemaphore>
#include <QTreeView>
#include <QtTest>

#include <memory>

using namespace Gui::Orba;

namespace {

// Makes the next step of the dock's view start from the first row: a list
// that gets the focus makes its first row current.
void forgetCurrentRow(QDockWidget* dock)
{
    if (auto* tree = dock->widget()->findChild<QTreeView*>("treeView"))
        tree->selectionModel()->clearCurrentIndex();
}

// A main window with its shared actions, shown on the offscreen screen.
struct Window
{
    MainWindow window;
    ShowNextFifHitAction next{&window};
    ShowPreviousFifHitAction previous{&window};
    StopFifJobAction stop{&window};

    FifResultsDockWidget* addDock(bool link = true)
    {
        auto* dock = new FifResultsDockWidget(&window);
        if (link)
            dock->linkSharedActions(&next, &previous, &stop);
        return dock;
    }
    bool show()
    {
        window.show();
        return QTest::qWaitForWindowExposed(&window);
    }
};

// Runs a search that finds `hits` lines on `job` and waits for its end.
bool fillJob(FifJob* job, const QString& folder, int hits)
{
    QByteArray text;
    for (int i = 0; i < hits; ++i)
        text += "needle " + QByteArray::number(i) + "\n";
    if (!TestTree::write(folder, "hits.txt", text))
        return false;
    FifInput request;
    request.what = "needle";
    request.where = folder;
    return JobRunner::run(job, request) && job->getLineHitCount() == hits;
}

} // namespace

class tst_FifActionMapper : public QObject
{
    Q_OBJECT

private slots:
    void managerHoldsOneMapper()
    {
        MainWindow window;
        FifManager* manager = FifManager::getInstance(&window);
        FifActionMapper* mapper = manager->getActionMapper();
        QVERIFY(mapper);
        QCOMPARE(manager->getActionMapper(), mapper);
        QCOMPARE(mapper->parent(), manager);
        QVERIFY(manager->children().contains(mapper));

        FifManager standalone;
        QVERIFY(standalone.getActionMapper());
        QVERIFY(standalone.getActionMapper() != mapper);
    }

    // The shown dock's view is linked: the shared next action steps it.
    void visibleDockIsLinked()
    {
        QTemporaryDir dir;
        Window w;
        auto* dock = w.addDock();
        QVERIFY(fillJob(viewOf(dock)->getJob(), dir.path(), 3));
        QVERIFY(w.show());
        QTRY_VERIFY(w.next.isEnabled());
        QVERIFY(w.previous.isEnabled());
        QVERIFY(!w.stop.isEnabled());

        forgetCurrentRow(dock);
        QSignalSpy shown(viewOf(dock), &FifHitsView::showHit);
        w.next.trigger();
        QCOMPARE(shown.count(), 1);
        QCOMPARE(shown.last().first().value<FifHit>().line, 1);
        w.next.trigger();
        w.previous.trigger();
        QCOMPARE(shown.count(), 3);
        QCOMPARE(shown.last().first().value<FifHit>().line, 1);
    }

    // Switching tabbed docks moves the link to the front one; the shared
    // next and previous actions tell whether the front dock holds rows.
    void tabSwitchMovesTheLink()
    {
        QTemporaryDir dir;
        Window w;
        auto* empty = w.addDock();
        auto* full = w.addDock();
        FifJob* otherJob = FifManager::getInstance(&w.window)->getJob(1);
        viewOf(full)->setJob(otherJob);
        QVERIFY(fillJob(otherJob, dir.path(), 2));
        w.window.tabifyDockWidget(empty, full);
        QVERIFY(w.show());

        QSignalSpy fromEmpty(viewOf(empty), &FifHitsView::showHit);
        QSignalSpy fromFull(viewOf(full), &FifHitsView::showHit);

        full->raise();
        QTRY_VERIFY(inFront(full) && !inFront(empty));
        QVERIFY(w.next.isEnabled());
        QVERIFY(w.previous.isEnabled());
        forgetCurrentRow(full);
        w.next.trigger();
        QCOMPARE(fromFull.count(), 1);
        QCOMPARE(fromEmpty.count(), 0);

        empty->raise();
        QTRY_VERIFY(inFront(empty) && !inFront(full));
        QVERIFY(!w.next.isEnabled());
        QVERIFY(!w.previous.isEnabled());
        w.next.trigger(); // reaches the empty view only, which does nothing
        QCOMPARE(fromFull.count(), 1);
        QCOMPARE(fromEmpty.count(), 0);

        full->raise();
        QTRY_VERIFY(inFront(full));
        QVERIFY(w.next.isEnabled());
        w.next.trigger();
        QCOMPARE(fromFull.count(), 2);
        QCOMPARE(fromFull.last().first().value<FifHit>().line, 2);
    }

    // Closing the only visible dock unlinks it and disables all three.
    void closingOnlyVisibleDockDisables()
    {
        QTemporaryDir dir;
        Window w;
        auto* dock = w.addDock();
        QVERIFY(fillJob(viewOf(dock)->getJob(), dir.path(), 2));
        QVERIFY(w.show());
        QTRY_VERIFY(w.next.isEnabled());
        w.stop.setEnabled(true);

        QSignalSpy shown(viewOf(dock), &FifHitsView::showHit);
        dock->close();
        QVERIFY(!dock->isVisible());
        QVERIFY(!w.next.isEnabled());
        QVERIFY(!w.previous.isEnabled());
        QVERIFY(!w.stop.isEnabled());
        w.next.trigger();
        w.previous.trigger();
        QCOMPARE(shown.count(), 0);

        dock->show(); // linked again
        QTRY_VERIFY(w.next.isEnabled());
        w.next.trigger();
        QCOMPARE(shown.count(), 1);
    }

    // A later hand-over of only a stop action keeps next and previous.
    void stopOnlyHandOverKeepsNextAndPrevious()
    {
        QTemporaryDir dir;
        Window w;
        auto* first = w.addDock();
        auto* second = new FifResultsDockWidget(&w.window);
        StopFifJobAction otherStop;
        second->linkSharedActions(nullptr, nullptr, &otherStop);
        w.window.tabifyDockWidget(first, second);
        QVERIFY(fillJob(viewOf(second)->getJob(), dir.path(), 2));
        w.stop.setEnabled(true);
        otherStop.setEnabled(true);
        QVERIFY(w.show());

        second->raise();
        QTRY_VERIFY(inFront(second) && !inFront(first));
        QVERIFY(w.next.isEnabled());
        QVERIFY(w.previous.isEnabled());
        QVERIFY(!otherStop.isEnabled()); // the mapper's stop action now
        QVERIFY(w.stop.isEnabled());     // no longer written

        forgetCurrentRow(second);
        QSignalSpy shown(viewOf(second), &FifHitsView::showHit);
        w.next.trigger();
        w.next.trigger();
        w.previous.trigger();
        QCOMPARE(shown.count(), 3);
        QCOMPARE(shown.last().first().value<FifHit>().line, 1);
    }

    // A dock that is visible when it is registered stays unlinked until its
    // visibility next changes.
    void registeredWhileVisibleStaysUnlinked()
    {
        QTemporaryDir dir;
        Window w;
        auto* dock = w.addDock(false);
        QVERIFY(fillJob(viewOf(dock)->getJob(), dir.path(), 2));
        QVERIFY(w.show());
        QTRY_VERIFY(dock->isVisible());
        dock->linkSharedActions(&w.next, &w.previous, &w.stop);

        QSignalSpy shown(viewOf(dock), &FifHitsView::showHit);
        w.next.setEnabled(true);
        w.next.trigger();
        QCOMPARE(shown.count(), 0);

        dock->hide();
        dock->show();
        QTRY_VERIFY(w.next.isEnabled());
        w.next.trigger();
        QCOMPARE(shown.count(), 1);
    }

    // With no shared actions handed over, visibility changes write nothing.
    void noSharedActionsWritesNothing()
    {
        Window w;
        auto* dock = new FifResultsDockWidget(&w.window);
        dock->linkSharedActions(nullptr, nullptr, nullptr);
        w.next.setEnabled(true);
        QVERIFY(w.show());
        dock->hide();
        dock->show();
        QVERIFY(w.next.isEnabled()); // never handed over, never written
        QVERIFY(!w.stop.isEnabled());
    }

    // Entries of destroyed docks are passed over.
    void destroyedDockIsSkipped()
    {
        QTemporaryDir dir;
        Window w;
        auto* first = w.addDock();
        auto* second = w.addDock();
        w.window.tabifyDockWidget(first, second);
        FifJob* otherJob = FifManager::getInstance(&w.window)->getJob(1);
        viewOf(second)->setJob(otherJob);
        QVERIFY(fillJob(otherJob, dir.path(), 1));
        QVERIFY(w.show());
        delete first;

        second->hide();
        QVERIFY(!w.next.isEnabled());
        second->show();
        QTRY_VERIFY(w.next.isEnabled());
        QSignalSpy shown(viewOf(second), &FifHitsView::showHit);
        w.next.trigger();
        QCOMPARE(shown.count(), 1);
    }

    // The stop action follows a visible dock whose job's thread runs.
    void stopFollowsRunningJob()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "needle\n"));
        Window w;
        auto* dock = w.addDock();
        QVERIFY(w.show());
        QTRY_VERIFY(dock->isVisible());
        FifJob* job = viewOf(dock)->getJob();

        // Hold the search thread at its start, so that it runs for certain
        // while the dock changes visibility.
        QSemaphore entered;
        QSemaphore release;
        connect(job, &QThread::started, job,
                [&] {
                    entered.release();
                    release.acquire();
                },
                Qt::DirectConnection);
        FifInput request;
        request.what = "needle";
        request.where = dir.path();
        JobRunner::EndWatcher watcher(job);
        QVERIFY(job->start(request));
        QVERIFY(entered.tryAcquire(1, 10000));
        QVERIFY(job->isRunning());

        dock->hide();
        QVERIFY(!w.stop.isEnabled()); // no visible dock
        dock->show();
        QVERIFY(w.stop.isEnabled());

        release.release();
        QVERIFY(watcher.wait());
        dock->hide();
        dock->show();
        QVERIFY(!w.stop.isEnabled());
        QVERIFY(w.next.isEnabled());
        disconnect(job, &QThread::started, job, nullptr);
    }
};

QTEST_MAIN(tst_FifActionMapper)
#include "tst_fifactionmapper.moc"
