#include "ApplicationBase.h"
#include "ChaseWidget.h"
#include "FifDialog.h"
#include "FifHit.h"
#include "FifHitsModel.h"
#include "FifHitsView.h"
#include "FifJob.h"
#include "FifManager.h"
#include "JobRunner.h"
#include "Settings.h"
#include "TestTree.h"

#include <QAbstractItemModelTester>
#include <QAction>
#include <QComboBox>
#include <QContextMenuEvent>
#include <QDockWidget>
#include <QFileDialog>
#include <QLabel>
#include <QLineEdit>
#include <QMainWindow>
#include <QMenu>
#include <QMessageBox>
#include <QPushButton>
#include <QToolBar>
#include <QTreeView>
#include <QtTest>

#include <functional>
#include <memory>

using namespace Gui::Orba;

namespace {

// A job that can tell how many receivers its signals have.
class ProbeJob : public FifJob
{
public:
    using FifJob::FifJob;
    int receiverCount(const char* signal) const { return receivers(signal); }
    QList<int> connections() const
    {
        return {receivers(SIGNAL(aboutToStart())), receivers(SIGNAL(searching(QString))),
                receivers(SIGNAL(finished()))};
    }
};

using JobRunner::EndWatcher;

bool runToEnd(FifJob* job, const FifInput& request)
{
    return JobRunner::run(job, request, 30000);
}

// Polls for modal widgets of type T and hands each to `answer` until it is
// gone (a dialog may not take an answer at once), counting the distinct ones.
template <typename T>
class ModalAnswerer
{
public:
    explicit ModalAnswerer(std::function<void(T*, bool)> answer) : answer(std::move(answer))
    {
        QObject::connect(&timer, &QTimer::timeout, [this] {
            auto* widget = qobject_cast<T*>(QApplication::activeModalWidget());
            if (!widget)
                return;
            const bool fresh = widget != last;
            if (fresh) {
                last = widget;
                ++seen;
            }
            this->answer(widget, fresh);
        });
        timer.start(10);
    }
    int seen = 0;

private:
    std::function<void(T*, bool)> answer;
    QPointer<T> last;
    QTimer timer;
};

// Answers every prompt with `button` and keeps the titles and texts it showed.
class PromptAnswerer : public ModalAnswerer<QMessageBox>
{
public:
    explicit PromptAnswerer(QMessageBox::StandardButton button)
        : ModalAnswerer<QMessageBox>([this, button](QMessageBox* box, bool fresh) {
              if (fresh) {
                  titles << box->windowTitle();
                  texts << box->text();
                  QCOMPARE(box->icon(), QMessageBox::Question);
                  QCOMPARE(box->standardButtons(), QMessageBox::Yes | QMessageBox::No);
              }
              box->button(button)->click();
          })
    {
    }
    QStringList titles;
    QStringList texts;
};

QAction* actionOf(const QWidget* view, const char* name)
{
    return view->findChild<QAction*>(QLatin1String(name));
}

const char* const kNavigationActions[] = {"show-next-fifhit", "show-previous-fifhit",
                                          "show-current-fifhit", "save-fifhits",
                                          "clear-fifresults"};

bool navigationEnabled(const QWidget* view, bool enabled)
{
    for (const char* name : kNavigationActions) {
        if (actionOf(view, name)->isEnabled() != enabled)
            return false;
    }
    return true;
}

QAction* chaseActionOf(const FifHitsView& view)
{
    QToolBar* bar = view.getToolBar();
    for (QAction* action : bar->actions()) {
        if (qobject_cast<ChaseWidget*>(bar->widgetForAction(action)))
            return action;
    }
    return nullptr;
}

QString found(int lines, int files, int read)
{
    return QStringLiteral("Found %1 line(s) in %2 file(s) out of %3 file(s)")
        .arg(lines)
        .arg(files)
        .arg(read);
}

bool sameHit(const FifHit& a, const FifHit& b)
{
    return a.job == b.job && a.file == b.file && a.line == b.line && a.offset == b.offset
        && a.rawOffset == b.rawOffset && a.text == b.text;
}

// A shown view on a job of its own, with the hits of the tree searched.
struct Shown
{
    explicit Shown(bool visible = true)
        : job(manager.getJob(0))
        , view(job, nullptr)
        , tester(job->getHitsModel(), QAbstractItemModelTester::FailureReportingMode::QtTest)
    {
        view.resize(600, 300);
        if (visible) {
            view.show();
            exposed = QTest::qWaitForWindowExposed(&view);
        }
    }
    QTreeView* tree() const { return view.findChild<QTreeView*>(); }
    QAbstractItemModel* model() const { return tree()->model(); }
    int current() const { return tree()->currentIndex().row(); }
    // Whether `spy` recorded the hit of `row` as its `i`th signal.
    bool emitted(const QSignalSpy& spy, int i, int row) const
    {
        return spy.size() > i
            && sameHit(spy.at(i).at(0).value<FifHit>(),
                       model()->index(row, 0).data(Qt::UserRole).value<FifHit>());
    }

    FifManager manager;
    FifJob* job;
    FifHitsView view;
    QAbstractItemModelTester tester;
    bool exposed = true;
};

} // namespace

class tst_FifHitsView : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        dir = std::make_unique<QTemporaryDir>();
        QVERIFY(dir->isValid());
        store = std::make_unique<Settings>();
        ApplicationBase::getInstance()->setSettings(store.get());
    }

    void cleanup()
    {
        ApplicationBase::getInstance()->setSettings(nullptr);
        store.reset();
        dir.reset();
    }

    void construction()
    {
        Shown s(false);
        for (QAction* action : s.view.getToolBar()->actions()) {
            if (!action->objectName().isEmpty())
                QVERIFY2(!action->icon().isNull(), qPrintable(action->objectName()));
        }
        QCOMPARE(s.view.getToolBar()->widgetForAction(s.view.getToolBar()->actions().value(7)),
                 s.view.getStatusLabel());
        QVERIFY(!chaseActionOf(s.view)->isVisible());
        // Many rows stream in: no per-row layout work.
        QVERIFY(s.tree()->uniformRowHeights());
        QVERIFY(!s.tree()->rootIsDecorated());
        QCOMPARE(s.model(), s.job->getHitsModel());
    }

    void stateTable_data()
    {
        QTest::addColumn<QString>("state");
        QTest::newRow("no job") << "no job";
        QTest::newRow("idle") << "idle";
        QTest::newRow("searching") << "searching";
    }

    void stateTable()
    {
        QFETCH(QString, state);
        makeTree(30, 2);
        FifManager manager;
        FifJob* job = state == "no job" ? nullptr : manager.getJob(0);
        QDockWidget dock;
        auto* view = new FifHitsView(job, &dock);
        dock.setWidget(view);
        dock.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dock));
        QAction* chase = chaseActionOf(*view);
        QAction* next = actionOf(view, "show-next-fifhit");
        QAction* stop = actionOf(view, "stop-fifjob");

        if (state == "searching") {
            EndWatcher watcher(job);
            QVERIFY(job->start(request()));
            // aboutToStart() has been handled before start() returned.
            QVERIFY(chase->isVisible());
            QCOMPARE(view->getStatusLabel()->text(), QStringLiteral("Searching..."));
            QVERIFY(stop->isEnabled());
            QVERIFY(!next->isEnabled());
            bool enabledOnFirstRows = false;
            bool sawRows = false;
            QStringList labels;
            QStringList files;
            QObject context;
            // Connected after the view: sees the label the view has just set.
            connect(job, &FifJob::searching, &context, [&](const QString& file) {
                files << QStringLiteral("Searching ") + file;
                labels << view->getStatusLabel()->text();
            });
            connect(job->getHitsModel(), &QAbstractItemModel::rowsInserted, &context, [&] {
                if (!sawRows)
                    enabledOnFirstRows = next->isEnabled();
                sawRows = true;
            });
            QVERIFY(watcher.wait());
            QVERIFY(sawRows);
            QVERIFY(enabledOnFirstRows);
            QCOMPARE(files.size(), 30);
            QCOMPARE(labels, files);
            QVERIFY(!chase->isVisible());
            QVERIFY(!stop->isEnabled());
            return;
        }

        QVERIFY(!chase->isVisible());
        QVERIFY(view->getStatusLabel()->text().isEmpty());
        QVERIFY(!stop->isEnabled());
        QVERIFY(actionOf(view, "find-in-files")->isEnabled());
        QVERIFY(navigationEnabled(view, false));
        if (job) {
            // Outside a search, row changes do not reach the actions.
            job->getHitsModel()->insertRows(0, 2);
            QVERIFY(navigationEnabled(view, false));
        }
    }

    void finalStatusAndClear_data()
    {
        QTest::addColumn<int>("files");
        QTest::addColumn<int>("hitsPerFile");
        QTest::addColumn<int>("plainFiles");
        QTest::newRow("several") << 3 << 4 << 37;
        QTest::newRow("one") << 1 << 1 << 0;
        QTest::newRow("nothing found") << 0 << 0 << 5;
    }

    void finalStatusAndClear()
    {
        QFETCH(int, files);
        QFETCH(int, hitsPerFile);
        QFETCH(int, plainFiles);
        const QString expected = found(files * hitsPerFile, files, files + plainFiles);
        auto s = searched(files, hitsPerFile, plainFiles);
        QVERIFY(s);

        QCOMPARE(s->view.getStatusLabel()->text(), expected);
        QVERIFY(!chaseActionOf(s->view)->isVisible());
        QVERIFY(!actionOf(&s->view, "stop-fifjob")->isEnabled());
        QVERIFY(navigationEnabled(&s->view, files * hitsPerFile > 0));

        // Starting the next run clears the status label.
        EndWatcher watcher(s->job);
        QVERIFY(s->job->start(request()));
        QVERIFY(s->view.getStatusLabel()->text().isEmpty());
        QVERIFY(watcher.wait());
        QCOMPARE(s->view.getStatusLabel()->text(), expected);

        // Clearing when idle empties the list and the status, and runs nothing.
        QAction* clear = actionOf(&s->view, "clear-fifresults");
        if (!clear->isEnabled())
            return;
        clear->trigger();
        QCOMPARE(s->model()->rowCount(), 0);
        QVERIFY(s->view.getStatusLabel()->text().isEmpty());
        QVERIFY(navigationEnabled(&s->view, false));
        QVERIFY(!s->job->isRunning());
    }

    void startShowsViewAndDock_data()
    {
        QTest::addColumn<bool>("inDock");
        QTest::newRow("in a dock") << true;
        QTest::newRow("not in a dock") << false;
    }

    void startShowsViewAndDock()
    {
        QFETCH(bool, inDock);
        makeTree(2, 1);
        FifManager manager;
        FifJob* job = manager.getJob(0);
        QMainWindow window;
        auto* dock = new QDockWidget(&window);
        std::unique_ptr<FifHitsView> ownedView(new FifHitsView(job, nullptr));
        FifHitsView* view = ownedView.get();
        if (inDock) {
            view->setParent(dock);
            ownedView.release();
            dock->setWidget(view);
        }
        window.addDockWidget(Qt::BottomDockWidgetArea, dock);
        dock->hide();
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        QVERIFY(!view->isVisible());

        EndWatcher watcher(job);
        QVERIFY(job->start(request()));
        QVERIFY(view->isVisible());
        QCOMPARE(dock->isVisible(), inDock);
        QCOMPARE(view->getStatusLabel()->text(), inDock ? QStringLiteral("Searching...") : QString());
        QVERIFY(watcher.wait());
        QCOMPARE(view->getStatusLabel()->text(), found(2, 2, 2));
    }

    void clearDuringSearch()
    {
        const int files = 40;
        const int hitsPerFile = 5;
        makeTree(files, hitsPerFile);
        Shown s;
        QAction* clear = actionOf(&s.view, "clear-fifresults");

        int seenFiles = 0;
        int removed = -1;
        bool labelClearedByClear = false;
        QString labelAfterClear;
        QObject context;
        connect(s.job, &FifJob::searching, &context, [&](const QString&) {
            ++seenFiles;
            if (removed >= 0) {
                if (labelAfterClear.isEmpty())
                    labelAfterClear = s.view.getStatusLabel()->text();
                return;
            }
            // Every hit of the files before this one has been delivered by now.
            if (seenFiles == 10) {
                removed = s.model()->rowCount();
                QVERIFY(clear->isEnabled());
                clear->trigger();
                QCOMPARE(s.model()->rowCount(), 0);
                labelClearedByClear = s.view.getStatusLabel()->text().isEmpty();
            }
        });
        QVERIFY(runToEnd(s.job, request()));

        // The line count drops by what was cleared; the file counts do not.
        QCOMPARE(removed, 9 * hitsPerFile);
        QVERIFY(labelClearedByClear);
        QVERIFY(labelAfterClear.startsWith(QStringLiteral("Searching ")));
        const int left = files * hitsPerFile - removed;
        QCOMPARE(s.model()->rowCount(), left);
        QCOMPARE(s.view.getStatusLabel()->text(), found(left, files, files));
    }

    void hiddenViewDisablesNavigation()
    {
        makeTree(3, 2);
        FifManager manager;
        FifJob* job = manager.getJob(0);
        QWidget container; // never shown, like a dock tabbed behind another
        auto* view = new FifHitsView(job, &container);
        QAction shared;
        view->linkNextAction(&shared);
        QVERIFY(runToEnd(job, request()));

        QCOMPARE(job->getHitsModel()->rowCount(), 6);
        QCOMPARE(view->getStatusLabel()->text(), found(6, 3, 3));
        QVERIFY(navigationEnabled(view, false));
        QVERIFY(!shared.isEnabled());
        // Enabled linked commands still reach the view's disabled ones.
        QSignalSpy spy(view, &FifHitsView::showHit);
        QAction sharedNext;
        view->linkNextAction(&sharedNext);
        sharedNext.trigger();
        QCOMPARE(spy.count(), 1);
        view->linkNextAction(&shared);
        QAction sharedStop;
        view->linkStopAction(&sharedStop);
        sharedStop.trigger();
        QVERIFY(job->shouldStop());
        job->setShouldStop(false);

        // Showing it later does not bring them back before the next search.
        container.show();
        QVERIFY(QTest::qWaitForWindowExposed(&container));
        QVERIFY(navigationEnabled(view, false));
        QVERIFY(runToEnd(job, request()));
        QVERIFY(navigationEnabled(view, true));
        QVERIFY(shared.isEnabled());
    }

    void replacedJob()
    {
        makeTree(2, 1);
        FifManager manager;
        auto* oldJob = new ProbeJob(&manager);
        auto* newJob = new ProbeJob(&manager);
        const QList<int> oldConnections = oldJob->connections();

        FifHitsView view(oldJob, nullptr);
        // The same job again adds no second connection.
        const QList<int> followed = oldJob->connections();
        view.setJob(oldJob);
        QCOMPARE(oldJob->connections(), followed);
        view.show();
        QVERIFY(QTest::qWaitForWindowExposed(&view));
        QAction sharedStop;
        view.linkStopAction(&sharedStop);
        view.setJob(newJob);
        QCOMPARE(view.findChild<QTreeView*>()->model(), newJob->getHitsModel());
        QCOMPARE(oldJob->connections(), oldConnections);

        sharedStop.trigger();
        QVERIFY(newJob->shouldStop());
        QVERIFY(!oldJob->shouldStop());
        newJob->setShouldStop(false);

        // A run of the old job leaves the view untouched.
        EndWatcher watcher(oldJob);
        QVERIFY(oldJob->start(request()));
        QVERIFY(!chaseActionOf(view)->isVisible());
        QVERIFY(!actionOf(&view, "stop-fifjob")->isEnabled());
        QVERIFY(watcher.wait());
        QVERIFY(view.getStatusLabel()->text().isEmpty());
        QCOMPARE(newJob->getHitsModel()->rowCount(), 0);

        QVERIFY(runToEnd(newJob, request()));
        QCOMPARE(view.getStatusLabel()->text(), found(2, 2, 2));

        // Replacing the job while its search is followed leaves the searching state.
        EndWatcher newWatcher(newJob);
        QVERIFY(newJob->start(request()));
        QVERIFY(chaseActionOf(view)->isVisible());
        view.setJob(oldJob);
        QVERIFY(!chaseActionOf(view)->isVisible());
        QVERIFY(!actionOf(&view, "stop-fifjob")->isEnabled());
        QVERIFY(!sharedStop.isEnabled());
        QVERIFY(newWatcher.wait());
        QVERIFY(view.getStatusLabel()->text().isEmpty());

        // The end of a replaced job, queued before the replacement, is ignored.
        EndWatcher lateWatcher(oldJob);
        QVERIFY(oldJob->start(request()));
        while (!oldJob->isFinished())
            QThread::msleep(1);
        view.setJob(newJob);
        QVERIFY(lateWatcher.wait());
        QVERIFY(view.getStatusLabel()->text().isEmpty());
        QVERIFY(!chaseActionOf(view)->isVisible());
    }

    void jobDeletedUnderView()
    {
        makeTree(20, 2);
        FifManager manager;
        auto* job = new FifJob(&manager);
        FifHitsView view(job, nullptr);
        view.show();
        QVERIFY(QTest::qWaitForWindowExposed(&view));
        QAction sharedStop;
        view.linkStopAction(&sharedStop);
        QVERIFY(job->start(request()));
        QVERIFY(chaseActionOf(view)->isVisible());
        delete job; // stops the search and waits for its thread

        QVERIFY(!view.getJob());
        QVERIFY(!view.findChild<QTreeView*>()->model());
        QVERIFY(!chaseActionOf(view)->isVisible());
        QVERIFY(!sharedStop.isEnabled());
        // Whatever was still queued, and every command, finds no job.
        QTest::qWait(50);
        sharedStop.trigger();
        actionOf(&view, "clear-fifresults")->trigger();
        view.next();
        view.onFifAction();
        QVERIFY(!view.getJob());
    }

    void wrapPrompts_data()
    {
        QTest::addColumn<bool>("forward");
        QTest::addColumn<bool>("yes");
        QTest::newRow("bottom, yes") << true << true;
        QTest::newRow("bottom, no") << true << false;
        QTest::newRow("top, yes") << false << true;
        QTest::newRow("top, no") << false << false;
    }

    void wrapPrompts()
    {
        QFETCH(bool, forward);
        QFETCH(bool, yes);
        auto s = searched(3, 1);
        QVERIFY(s);
        const int edge = forward ? 2 : 0;
        s->tree()->setCurrentIndex(s->model()->index(edge, 0));
        QSignalSpy spy(&s->view, &FifHitsView::showHit);
        PromptAnswerer answerer(yes ? QMessageBox::Yes : QMessageBox::No);
        actionOf(&s->view, forward ? "show-next-fifhit" : "show-previous-fifhit")->trigger();

        QCOMPARE(answerer.titles, QStringList(forward ? "Reach bottom" : "Reach top"));
        QCOMPARE(answerer.texts, QStringList(forward ? "Reach bottom, continued from top?"
                                                     : "Reach top, continued from bottom?"));
        const int target = yes ? 2 - edge : edge;
        QCOMPARE(s->current(), target);
        QCOMPARE(s->tree()->selectionModel()->selectedIndexes(),
                 QModelIndexList{s->model()->index(target, 0)});
        QCOMPARE(spy.count(), yes ? 1 : 0);
        QVERIFY(!yes || s->emitted(spy, 0, target));
    }

    void stepsGotoAndDoubleClick()
    {
        auto s = searched(4, 1);
        QVERIFY(s);
        PromptAnswerer answerer(QMessageBox::No);
        QSignalSpy spy(&s->view, &FifHitsView::showHit);

        // Without a current row, next takes the first row, previous the last and
        // goto the first.
        s->view.next();
        s->view.next();
        QCOMPARE(s->current(), 1);
        s->tree()->setCurrentIndex(QModelIndex());
        s->view.previous();
        QCOMPARE(s->current(), 3);
        s->tree()->setCurrentIndex(QModelIndex());
        QAction* gotoAction = actionOf(&s->view, "show-current-fifhit");
        gotoAction->trigger();
        QCOMPARE(s->current(), 0);
        s->tree()->setCurrentIndex(s->model()->index(2, 0));
        gotoAction->trigger();
        // Through the window, as the platform delivers it: press, release, press,
        // double-click, release. One signal only.
        const QRect rect = s->tree()->visualRect(s->model()->index(1, 0));
        QTest::mouseDClick(s->view.windowHandle(), Qt::LeftButton, Qt::NoModifier,
                           s->tree()->viewport()->mapTo(&s->view, rect.center()));
        QCOMPARE(spy.count(), 6);
        const QList<int> rows{0, 1, 3, 0, 2, 1};
        for (int i = 0; i < rows.size(); ++i)
            QVERIFY2(s->emitted(spy, i, rows[i]), qPrintable(QString::number(i)));
        QCOMPARE(s->tree()->selectionModel()->selectedIndexes(), QModelIndexList{s->model()->index(1, 0)});
        // The hit is handed out whole.
        const FifHit hit = spy.at(0).at(0).value<FifHit>();
        QCOMPARE(hit.job.data(), s->job);
        QVERIFY(hit.text.contains(QStringLiteral("needle")));
        QVERIFY(answerer.titles.isEmpty());
    }

    void unselectedCurrentRowCountsAsNone()
    {
        // Taking the focus makes the first row current without selecting it;
        // the first step must still show the first hit, not the second.
        auto s = searched(3, 1);
        QVERIFY(s);
        QSignalSpy spy(&s->view, &FifHitsView::showHit);
        s->tree()->selectionModel()->setCurrentIndex(s->model()->index(0, 0),
                                                     QItemSelectionModel::NoUpdate);
        s->view.next();
        QCOMPARE(s->current(), 0);
        QVERIFY(s->emitted(spy, 0, 0));
        s->tree()->selectionModel()->setCurrentIndex(s->model()->index(0, 0),
                                                     QItemSelectionModel::Clear);
        s->view.previous();
        QCOMPARE(s->current(), 2);
        QVERIFY(s->emitted(spy, 1, 2));
    }

    void oneRowWraps()
    {
        auto s = searched(1, 1);
        QVERIFY(s);
        QCOMPARE(s->model()->rowCount(), 1);
        QSignalSpy spy(&s->view, &FifHitsView::showHit);
        PromptAnswerer answerer(QMessageBox::Yes);

        s->view.next(); // no current row: no prompt
        QVERIFY(answerer.titles.isEmpty());
        s->view.next();
        s->view.previous();
        QCOMPARE(answerer.titles, QStringList({"Reach bottom", "Reach top"}));
        QCOMPARE(s->current(), 0);
        QCOMPARE(spy.count(), 3);
        for (int i = 0; i < spy.count(); ++i)
            QVERIFY(s->emitted(spy, i, 0));
    }

    void emptyListDoesNothing()
    {
        auto s = searched(0, 0, 2);
        QVERIFY(s);
        QAction sharedNext;
        s->view.linkNextAction(&sharedNext);
        QSignalSpy spy(&s->view, &FifHitsView::showHit);
        PromptAnswerer answerer(QMessageBox::Yes);

        s->view.next();
        s->view.previous();
        sharedNext.trigger();
        QMetaObject::invokeMethod(&s->view, "showCurrentIndex");
        QCOMPARE(spy.count(), 0);
        QVERIFY(answerer.titles.isEmpty());

        // A view without a job does nothing either.
        FifHitsView noJob(nullptr, nullptr);
        QSignalSpy noJobSpy(&noJob, &FifHitsView::showHit);
        noJob.next();
        QMetaObject::invokeMethod(&noJob, "showCurrentIndex");
        QMetaObject::invokeMethod(&noJob, "removeAllRows");
        QCOMPARE(noJobSpy.count(), 0);
        QVERIFY(!noJob.findChild<QTreeView*>()->model());
    }

    void relayWithoutDuplicates()
    {
        auto s = searched(4, 1);
        QVERIFY(s);
        QSignalSpy spy(&s->view, &FifHitsView::showHit);

        QAction sharedNext;
        QAction sharedPrevious;
        s->view.linkNextAction(&sharedNext);
        s->view.linkNextAction(&sharedNext);
        s->view.linkPreviousAction(&sharedPrevious);
        s->view.linkPreviousAction(&sharedPrevious);
        sharedNext.trigger();
        sharedNext.trigger();
        QCOMPARE(s->current(), 1);
        sharedPrevious.trigger();
        QCOMPARE(s->current(), 0);
        QCOMPARE(spy.count(), 3);

        // Another action replaces the first link.
        QAction otherNext;
        s->view.linkNextAction(&otherNext);
        sharedNext.trigger();
        QCOMPARE(spy.count(), 3);
        otherNext.trigger();
        QCOMPARE(spy.count(), 4);
        QCOMPARE(s->current(), 1);

        // Unlinked actions reach nothing; null and destroyed actions are harmless.
        QAction sharedStop;
        s->view.linkPreviousAction(&sharedPrevious);
        s->view.linkStopAction(&sharedStop);
        s->view.unlinkActions();
        otherNext.trigger();
        sharedPrevious.trigger();
        QCOMPARE(spy.count(), 4);
        sharedStop.setEnabled(true);
        sharedStop.trigger();
        QVERIFY(!s->job->shouldStop());
        s->view.linkNextAction(nullptr);
        auto* shortLived = new QAction;
        s->view.linkNextAction(shortLived);
        delete shortLived;
        s->view.unlinkActions();
        s->view.next();
        QCOMPARE(spy.count(), 5);
    }

    void linkedActionsFollowState()
    {
        makeTree(30, 3);
        Shown s;
        QAction sharedNext;
        QAction sharedPrevious;
        QAction sharedStop;
        for (QAction* shared : {&sharedNext, &sharedPrevious, &sharedStop})
            shared->setEnabled(false);
        s.view.linkNextAction(&sharedNext);
        s.view.linkPreviousAction(&sharedPrevious);
        s.view.linkStopAction(&sharedStop);

        EndWatcher watcher(s.job);
        QVERIFY(s.job->start(request()));
        QVERIFY(sharedStop.isEnabled());
        QVERIFY(watcher.wait());
        QVERIFY(!sharedStop.isEnabled());
        QVERIFY(sharedNext.isEnabled());
        QVERIFY(sharedPrevious.isEnabled());

        // Clearing recomputes every state, the stop command's included.
        sharedStop.setEnabled(true);
        actionOf(&s.view, "clear-fifresults")->trigger();
        QVERIFY(!sharedNext.isEnabled());
        QVERIFY(!sharedPrevious.isEnabled());
        QVERIFY(!sharedStop.isEnabled());
    }

    void saveThroughExportDialog()
    {
        auto s = searched(3, 2);
        QVERIFY(s);
        QCOMPARE(s->model()->rowCount(), 6);

        QTemporaryDir out;
        const QString path = out.filePath(QStringLiteral("hits.txt"));
        ModalAnswerer<QFileDialog> answerer([&](QFileDialog* dialog, bool) {
            if (dialog->objectName() != QLatin1String("ImExportFileDialog"))
                return;
            // selectFile() leaves the name field alone while it has the focus.
            dialog->selectFile(path);
            if (auto* name = dialog->findChild<QLineEdit*>(QStringLiteral("fileNameEdit")))
                name->setText(path);
            QMetaObject::invokeMethod(dialog, "accept");
        });
        actionOf(&s->view, "save-fifhits")->trigger();
        QCOMPARE(answerer.seen, 1);

        QFile file(path);
        QVERIFY(file.open(QIODevice::ReadOnly));
        QStringList rows;
        for (int row = 0; row < 6; ++row)
            rows << s->model()->index(row, 0).data().toString();
        QCOMPARE(QString::fromUtf8(file.readAll()).split('\n', Qt::SkipEmptyParts), rows);
        QVERIFY(rows.first().contains(QStringLiteral("needle")));
    }

    void contextMenuEntries()
    {
        auto s = searched(2, 1);
        QVERIFY(s);

        // The menu's separator dies with the menu: read everything while it is open.
        QList<QAction*> entries;
        QStringList texts;
        QAction* defaultAction = nullptr;
        QTimer poll;
        connect(&poll, &QTimer::timeout, [&] {
            auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
            if (!menu)
                return;
            poll.stop();
            entries = menu->actions();
            for (QAction* entry : std::as_const(entries))
                texts << (entry->isSeparator() ? QStringLiteral("--") : entry->text());
            defaultAction = menu->defaultAction();
            menu->close();
        });
        poll.start(10);
        const QPoint local(20, 60);
        QContextMenuEvent event(QContextMenuEvent::Mouse, local, s->view.mapToGlobal(local));
        QApplication::sendEvent(&s->view, &event);

        QCOMPARE(texts, QStringList({"Goto", "Show Next Result", "Show Previous Result", "--",
                                     "Stop", "Save As...", "Find in files", "Clear All"}));
        QCOMPARE(defaultAction, actionOf(&s->view, "show-current-fifhit"));
        // The entries are the view's own actions, with their enabled state.
        QCOMPARE(entries.at(4), actionOf(&s->view, "stop-fifjob"));
        QVERIFY(!entries.at(4)->isEnabled());
        QCOMPARE(entries.at(7), actionOf(&s->view, "clear-fifresults"));
        QVERIFY(entries.at(7)->isEnabled());
    }

    void findCommand()
    {
        // A fresh job opens on the manager's filters.
        Shown s(false);
        s.manager.setFilters({QStringLiteral("*.cpp;*.h"), QStringLiteral("*.txt")});
        QStringList filterItems;
        ModalAnswerer<FifDialog> answerer([&](FifDialog* dialog, bool fresh) {
            if (!fresh)
                return;
            auto* box = dialog->findChild<QComboBox*>(QStringLiteral("filter"));
            filterItems << box->currentText();
            for (int i = 0; i < box->count(); ++i)
                filterItems << box->itemText(i);
            dialog->reject();
        });
        s.view.onFifAction();
        QCOMPARE(answerer.seen, 1);
        QCOMPARE(filterItems.value(0), QStringLiteral("*.cpp;*.h"));
        QVERIFY(filterItems.contains(QStringLiteral("*.txt")));
        QVERIFY(!s.job->isRunning());
        QCOMPARE(s.job->getLineHitCount(), 0);
    }

    void findCommandReopensLastSearch()
    {
        auto s = searched(3, 2, 1);
        QVERIFY(s);
        s->manager.setFilters({QStringLiteral("*.txt"), QStringLiteral("*.log")});

        // The dialog opens on the last search; pressing Find starts it again on
        // the view's own job.
        QString what;
        QString where;
        QWidget* dialogParent = nullptr;
        EndWatcher watcher(s->job);
        ModalAnswerer<FifDialog> answerer([&](FifDialog* dialog, bool fresh) {
            if (!fresh)
                return;
            auto* whatBox = dialog->findChild<QComboBox*>(QStringLiteral("what"));
            what = whatBox->currentText();
            where = dialog->findChild<QComboBox*>(QStringLiteral("where"))->currentText();
            dialogParent = dialog->parentWidget();
            whatBox->setCurrentText("needle 1");
            dialog->findChild<QPushButton*>(QStringLiteral("start"))->click();
        });
        actionOf(&s->view, "find-in-files")->trigger();
        QCOMPARE(answerer.seen, 1);
        QCOMPARE(what, QStringLiteral("needle"));
        QCOMPARE(where, dir->path());
        QCOMPARE(dialogParent, &s->view);
        QVERIFY(watcher.wait());
        QCOMPARE(s->job->getInput().what, QStringLiteral("needle 1"));
        QCOMPARE(s->view.getStatusLabel()->text(), found(3, 2, 4));
    }

private:
    // Writes `files` files with `hitsPerFile` lines holding "needle" each,
    // plus `plainFiles` files without it.
    void makeTree(int files, int hitsPerFile, int plainFiles = 0);
    FifInput request(const QString& what = QStringLiteral("needle")) const;
    // makeTree, then a shown view whose job has searched it.
    std::unique_ptr<Shown> searched(int files, int hitsPerFile, int plainFiles = 0);

    std::unique_ptr<QTemporaryDir> dir;
    std::unique_ptr<Settings> store;
};

void tst_FifHitsView::makeTree(int files, int hitsPerFile, int plainFiles)
{
    for (int f = 0; f < files; ++f) {
        QByteArray bytes;
        for (int h = 0; h < hitsPerFile; ++h)
            bytes += "line before\n  needle " + QByteArray::number(f * 1000 + h) + "\n";
        QVERIFY(TestTree::write(dir->path(), QStringLiteral("sub%1/hit%2.txt").arg(f % 3).arg(f),
                                bytes));
    }
    for (int f = 0; f < plainFiles; ++f)
        QVERIFY(TestTree::write(dir->path(), QStringLiteral("plain%1.txt").arg(f),
                                "nothing to see\nhere\n"));
}

FifInput tst_FifHitsView::request(const QString& what) const
{
    FifInput input;
    input.what = what;
    input.where = dir->path();
    return input;
}

std::unique_ptr<Shown> tst_FifHitsView::searched(int files, int hitsPerFile, int plainFiles)
{
    makeTree(files, hitsPerFile, plainFiles);
    auto shown = std::make_unique<Shown>();
    if (!shown->exposed || !runToEnd(shown->job, request()))
        return nullptr;
    return shown;
}

int main(int argc, char** argv)
{
    ApplicationBase app(argc, argv);
    tst_FifHitsView tc;
    QTEST_SET_MAIN_SOURCE_PATH
    return QTest::qExec(&tc, argc, argv);
}

#include "tst_fifhitsview.moc"
