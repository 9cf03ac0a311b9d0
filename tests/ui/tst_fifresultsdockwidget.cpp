#include "DockTest.h"
#include "FifHitsView.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "JobRunner.h"
#include "MainWindow.h"
#include "TestTree.h"

#include <QToolBar>
#include <QTreeView>
#include <QtTest>

using namespace Gui::Orba;

namespace {

bool runJob(FifJob* job, const FifInput& request)
{
    return JobRunner::run(job, request);
}

} // namespace

class tst_FifResultsDockWidget : public QObject
{
    Q_OBJECT

private slots:
    void objectNames()
    {
        QCOMPARE(FifResultsDockWidget::Results1ObjectName(), QString("FifResults1DockWidget"));
        QCOMPARE(FifResultsDockWidget::Results2ObjectName(), QString("FifResults2DockWidget"));

        MainWindow window;
        auto* first = new FifResultsDockWidget(&window);
        QCOMPARE(first->objectName(), QString("FifResults1DockWidget"));
        auto* second = new FifResultsDockWidget(&window);
        QCOMPARE(second->objectName(), QString("FifResults2DockWidget"));

        QTest::ignoreMessage(QtDebugMsg, "Internal Error: Not support two Find-In-File Results");
        auto* third = new FifResultsDockWidget(&window);
        QCOMPARE(third->objectName(), QString("FifResults2DockWidget"));
        QVERIFY(viewOf(third)); // works like the others
        QCOMPARE(viewOf(third)->getJob(), viewOf(first)->getJob());
    }

    void firstNameIsFreedWithItsDock()
    {
        MainWindow window;
        auto* first = new FifResultsDockWidget(&window);
        auto* second = new FifResultsDockWidget(&window);
        delete first;
        auto* again = new FifResultsDockWidget(&window);
        QCOMPARE(again->objectName(), QString("FifResults1DockWidget"));
        QCOMPARE(second->objectName(), QString("FifResults2DockWidget"));

        // Both names taken again: a fourth is a duplicate.
        QTest::ignoreMessage(QtDebugMsg, "Internal Error: Not support two Find-In-File Results");
        new FifResultsDockWidget(&window);
    }

    // A dock of another window does not take a name of this one.
    void namesPerWindow()
    {
        MainWindow one;
        MainWindow two;
        new FifResultsDockWidget(&one);
        auto* other = new FifResultsDockWidget(&two);
        QCOMPARE(other->objectName(), QString("FifResults1DockWidget"));
    }

    void builtInTheMainWindow()
    {
        MainWindow window;
        auto* dock = new FifResultsDockWidget(&window);
        QCOMPARE(dock->parent(), &window);
        QCOMPARE(dock->windowTitle(), QString("Find in Files Results"));
        QCOMPARE(window.dockWidgetArea(dock), Qt::BottomDockWidgetArea);
        FifHitsView* view = viewOf(dock);
        QVERIFY(view);
        QCOMPARE(view->parent(), dock);
        QCOMPARE(view->getJob(), FifManager::getInstance(&window)->getJob(0));
        QCOMPARE(FifManager::getInstance(&window)->getJobCount(), 1);

        QPointer<FifHitsView> guard(view);
        delete dock;
        QVERIFY(guard.isNull()); // the view goes with its dock
    }

    // Both docks of a window start on job 0 and show the same hits.
    void twoDocksShareJobZero()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "one needle\ntwo\nneedle three\n"));
        MainWindow window;
        auto* first = new FifResultsDockWidget(&window);
        auto* second = new FifResultsDockWidget(&window);
        FifJob* job = viewOf(first)->getJob();
        QCOMPARE(viewOf(second)->getJob(), job);

        FifInput request;
        request.what = "needle";
        request.where = dir.path();
        QVERIFY(runJob(job, request));
        for (QDockWidget* dock : {static_cast<QDockWidget*>(first), static_cast<QDockWidget*>(second)}) {
            auto* tree = viewOf(dock)->findChild<QTreeView*>("treeView");
            QVERIFY(tree);
            QCOMPARE(tree->model()->rowCount(), 2);
        }
    }

    void followsIconSize()
    {
        MainWindow window;
        auto* dock = new FifResultsDockWidget(&window);
        window.setIconSize(QSize(41, 41));
        QCOMPARE(viewOf(dock)->getToolBar()->iconSize(), QSize(41, 41));
        window.setIconSize(QSize(17, 17));
        QCOMPARE(viewOf(dock)->getToolBar()->iconSize(), QSize(17, 17));
    }

    // The start of a search shows and raises every dock on the job, in the
    // order in which their views were attached: the last one ends in front.
    void startRaisesInAttachOrder()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "needle\n"));
        MainWindow window;
        auto* first = new FifResultsDockWidget(&window);
        auto* second = new FifResultsDockWidget(&window);
        window.tabifyDockWidget(first, second);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        first->raise();
        QTRY_VERIFY(inFront(first) && !inFront(second));

        FifJob* job = viewOf(first)->getJob();
        FifInput request;
        request.what = "needle";
        request.where = dir.path();
        QVERIFY(runJob(job, request));
        QTRY_VERIFY(inFront(second));
        QVERIFY(!inFront(first));

        // Attach the first dock's view again: it is now the later one.
        FifJob* other = FifManager::getInstance(&window)->getJob(1);
        viewOf(first)->setJob(other);
        viewOf(first)->setJob(job);
        QVERIFY(runJob(job, request));
        QTRY_VERIFY(inFront(first));
        QVERIFY(!inFront(second));
    }

    // A hidden dock is shown by the start of a search on its job.
    void startShowsHiddenDock()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "needle\n"));
        MainWindow window;
        auto* dock = new FifResultsDockWidget(&window);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        dock->close();
        QVERIFY(!dock->isVisible());
        FifInput request;
        request.what = "needle";
        request.where = dir.path();
        QVERIFY(runJob(viewOf(dock)->getJob(), request));
        QVERIFY(dock->isVisible());
    }

    // Without a main window there is no job and nothing to dock in: the
    // dock holds an empty view and keeps its base name.
    void builtWithoutMainWindow()
    {
        FifResultsDockWidget dock(nullptr);
        QCOMPARE(dock.objectName(), QString("FifResultsDockWidget"));
        QVERIFY(viewOf(&dock));
        QVERIFY(!viewOf(&dock)->getJob());
        QAction next;
        dock.linkSharedActions(&next, nullptr, nullptr); // no window: nothing happens
        dock.show();
        dock.hide();
        QVERIFY(next.isEnabled());
    }

    // Only a dock whose parent is a main window hands over its actions.
    void linkWithoutMainWindowDoesNothing()
    {
        MainWindow window;
        auto* dock = new FifResultsDockWidget(&window);
        QWidget elsewhere;
        dock->setParent(&elsewhere);
        QAction next;
        dock->linkSharedActions(&next, nullptr, nullptr);
        dock->show();
        dock->hide();
        QVERIFY(next.isEnabled()); // no mapper wrote to it
    }
};

QTEST_MAIN(tst_FifResultsDockWidget)
#include "tst_fifresultsdockwidget.moc"
