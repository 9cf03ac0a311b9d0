#include "ApplicationBase.h"
#include "ChaseWidget.h"
#include "FifDialog.h"
#include "FifHit.h"
#include "FifHitsModel.h"
#include "FifHitsView.h"
#include "FifJob.h"
#include "FifManager.h"
#include "ImageManager.h"
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
#include <QTimer>
#include <QToolBar>
#include <QTreeView>
#include <QVBoxLayout>
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
};

// Waits, in the GUI thread, for the end of a run of `job`. Connected after the
// view, so by the time it fires the view has handled the end as well.
class EndWatcher
{
public:
    explicit EndWatcher(FifJob* job)
    {
        QObject::connect(job, &QThread::finished, &context, [this] { ended = true; });
    }
    bool wait(int timeoutMs = 30000)
    {
        return QTest::qWaitFor([this] { return ended; }, timeoutMs);
    }

private:
    QObject context;
    bool ended = false;
};

bool runToEnd(FifJob* job, const FifInput& request)
{
    EndWatcher watcher(job);
    return job->start(request) && watcher.wait();
}

// Polls for modal widgets of type T and hands each to `answer` until it is
// gone (a dialog may not take an answer at once), counting the distinct ones
// in `seen`. Lets tests answer real modal dialogs.
template <typename T>
class ModalAnswerer
{
public:
    explicit ModalAnswerer(std::function<void(T*, bool)> answer)
        : answer(std::move(answer))
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

struct Prompt
{
    QString title;
    QString text;
    QMessageBox::Icon icon = QMessageBox::NoIcon;
    QMessageBox::StandardButtons buttons;
};

// Answers every prompt with `button` and keeps what it showed.
class PromptAnswerer : public ModalAnswerer<QMessageBox>
{
public:
    explicit PromptAnswerer(QMessageBox::StandardButton button)
        : ModalAnswerer<QMessageBox>([this, button](QMessageBox* box, bool fresh) {
              if (fresh)
                  prompts.append({box->windowTitle(), box->text(), box->icon(),
                                  box->standardButtons()});
              box->button(button)->click();
          })
    {
    }
    QList<Prompt> prompts;
};

QAction* actionOf(const QWidget* view, const char* name)
{
    return view->findChild<QAction*>(QLatin1String(name));
}

const char* const kNavigationActions[] = {"show-next-fifhit", "show-previous-fifhit",
                                          "show-current-fifhit", "save-fifhits",
                                          "clear-fifresults"};

QAction* chaseActionOf(const FifHitsView& view)
{
    QToolBar* bar = view.getToolBar();
    for (QAction* action : bar->actions()) {
        if (qobject_cast<ChaseWidget*>(bar->widgetForAction(action)))
            return action;
    }
    return nullptr;
}

QString rowText(const QAbstractItemModel* model, int row)
{
    return model->index(row, 0).data().toString();
}

FifHit rowHit(const QAbstractItemModel* model, int row)
{
    return model->index(row, 0).data(Qt::UserRole).value<FifHit>();
}

FifHit hitOf(const QSignalSpy& spy, int i)
{
    return spy.at(i).at(0).value<FifHit>();
}

bool sameHit(const FifHit& a, const FifHit& b)
{
    return a.job == b.job && a.file == b.file && a.line == b.line && a.offset == b.offset
        && a.rawOffset == b.rawOffset && a.text == b.text;
}

} // namespace

class tst_FifHitsView : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void constructionTable_data();
    void constructionTable();
    void widgetTree();
    void metaObjectInterface();
    void stateTable_data();
    void stateTable();
    void finalStatus_data();
    void finalStatus();
    void searchingShowsEachFile();
    void startShowsViewAndDock_data();
    void startShowsViewAndDock();
    void clearDuringSearch();
    void clearWhenIdle();
    void hiddenViewDisablesNavigation();
    void sameJobTwice();
    void replacedJob();
    void staleEndOfReplacedJob();
    void jobDeletedUnderView();
    void modelUnderTesterWhileStreaming();
    void wrapPrompts_data();
    void wrapPrompts();
    void firstStepWithoutCurrentRow();
    void oneRowWraps();
    void emptyListDoesNothing();
    void gotoWithAndWithoutCurrentRow();
    void doubleClickEmitsOnce();
    void relayWithoutDuplicates();
    void relayReachesDisabledActionAndStop();
    void unlinkAndDestroyedSharedAction();
    void linkedActionsFollowState();
    void saveThroughExportDialog();
    void contextMenuEntries();
    void setIconSize();
    void findCommandWithoutJob();
    void findCommandReopensLastSearch();
    void findCommandOnFreshJob();

private:
    // Writes `files` files with `hitsPerFile` lines holding "needle" each,
    // plus `plainFiles` files without it.
    void makeTree(int files, int hitsPerFile, int plainFiles = 0);
    FifInput request(const QString& what = QStringLiteral("needle")) const;

    std::unique_ptr<QTemporaryDir> dir;
    std::unique_ptr<Settings> store;
};

void tst_FifHitsView::init()
{
    dir = std::make_unique<QTemporaryDir>();
    QVERIFY(dir->isValid());
    // Each case starts from an empty settings store in memory.
    store = std::make_unique<Settings>();
    ApplicationBase::getInstance()->setSettings(store.get());
}

void tst_FifHitsView::cleanup()
{
    ApplicationBase::getInstance()->setSettings(nullptr);
    store.reset();
    dir.reset();
}

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

void tst_FifHitsView::constructionTable_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("iconId");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("toolTip");
    QTest::addColumn<bool>("enabled");
    QTest::newRow("clear") << "clear-fifresults" << "gui-orba-clear-all" << "Clear All"
                           << "Clear All" << false;
    QTest::newRow("find") << "find-in-files" << "gui-orba-find-in-files" << "Find in files"
                          << "Find Text in Files" << true;
    QTest::newRow("next") << "show-next-fifhit" << "gui-orba-show-next-fifhit"
                          << "Show Next Result" << "Show Next Result" << false;
    QTest::newRow("previous") << "show-previous-fifhit" << "gui-orba-show-previous-fifhit"
                              << "Show Previous Result" << "Show Previous Result" << false;
    QTest::newRow("stop") << "stop-fifjob" << "gui-orba-stop-fifjob" << "Stop" << "Stop Job"
                          << false;
    QTest::newRow("goto") << "show-current-fifhit" << "gui-orba-show-current-fifhit" << "Goto"
                          << "Show Current Result" << false;
    QTest::newRow("save") << "save-fifhits" << "gui-orba-file-save" << "Save As..."
                          << "Save Results As a Text File" << false;
}

void tst_FifHitsView::constructionTable()
{
    QFETCH(QString, name);
    QFETCH(QString, iconId);
    QFETCH(QString, text);
    QFETCH(QString, toolTip);
    QFETCH(bool, enabled);

    FifManager manager;
    for (FifJob* job : {static_cast<FifJob*>(nullptr), manager.getJob(0)}) {
        FifHitsView view(job, nullptr);
        QAction* action = actionOf(&view, name.toLatin1().constData());
        QVERIFY(action);
        QCOMPARE(action->parent(), &view);
        QCOMPARE(action->text(), text);
        QCOMPARE(action->toolTip(), toolTip);
        QCOMPARE(action->isEnabled(), enabled);
        QCOMPARE(action->icon().isNull(), ImageManager::getInstance()->getIcon(iconId).isNull());
    }
}

void tst_FifHitsView::widgetTree()
{
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    QCOMPARE(view.objectName(), QStringLiteral("FifHitsView"));
    QCOMPARE(view.getJob(), job);

    auto* layout = qobject_cast<QVBoxLayout*>(view.layout());
    QVERIFY(layout);
    QCOMPARE(layout->objectName(), QStringLiteral("vboxLayout"));
    QCOMPARE(layout->spacing(), 0);
    QCOMPARE(layout->contentsMargins(), QMargins());
    QCOMPARE(layout->count(), 2);

    QToolBar* bar = view.getToolBar();
    QCOMPARE(bar->objectName(), QStringLiteral("toolBar"));
    QCOMPARE(layout->itemAt(0)->widget(), bar);
    QStringList names;
    const QList<QAction*> actions = bar->actions();
    for (QAction* action : actions)
        names << action->objectName();
    QCOMPARE(names.mid(0, 7), QStringList({"clear-fifresults", "find-in-files",
                                           "show-next-fifhit", "show-previous-fifhit",
                                           "show-current-fifhit", "save-fifhits",
                                           "stop-fifjob"}));
    QCOMPARE(actions.size(), 9);
    QCOMPARE(bar->widgetForAction(actions.at(7)), view.getStatusLabel());
    QVERIFY(qobject_cast<ChaseWidget*>(bar->widgetForAction(actions.at(8))));
    QVERIFY(!actions.at(8)->isVisible());

    QLabel* label = view.getStatusLabel();
    QCOMPARE(label->parent(), bar);
    QCOMPARE(label->frameShadow(), QFrame::Sunken);
    QCOMPARE(label->frameShape(), QFrame::Panel);
    QCOMPARE(label->alignment(), Qt::AlignLeft | Qt::AlignVCenter);
    QCOMPARE(label->minimumWidth(), 25);
    QCOMPARE(label->sizePolicy().horizontalPolicy(), QSizePolicy::Expanding);
    QCOMPARE(label->sizePolicy().verticalPolicy(), QSizePolicy::Preferred);
    QVERIFY(label->text().isEmpty());

    auto* chase = view.findChild<ChaseWidget*>();
    QCOMPARE(chase->parent(), bar);
    QCOMPARE(chase->minimumSize(), QSize(32, 32));

    auto* tree = view.findChild<QTreeView*>(QStringLiteral("treeView"));
    QVERIFY(tree);
    QCOMPARE(layout->itemAt(1)->widget(), tree);
    QVERIFY(tree->uniformRowHeights());
    QVERIFY(!tree->rootIsDecorated());
    QCOMPARE(tree->model(), job->getHitsModel());

    FifHitsView empty(nullptr, nullptr);
    QVERIFY(!empty.getJob());
    QVERIFY(!empty.findChild<QTreeView*>()->model());
}

void tst_FifHitsView::metaObjectInterface()
{
    // The host connects by these signatures.
    const QMetaObject& meta = FifHitsView::staticMetaObject;
    QCOMPARE(meta.className(), "Gui::Orba::FifHitsView");
    QStringList signatures;
    for (int i = meta.methodOffset(); i < meta.methodCount(); ++i)
        signatures << QString::fromLatin1(meta.method(i).methodSignature());
    QCOMPARE(signatures, QStringList({"showHit(Gui::Orba::FifHit)", "next()", "previous()",
                                      "setIconSize(QSize)", "onFifAction()", "onAboutToStart()",
                                      "onEnded()", "onSearching(QString)", "updateActions()",
                                      "showCurrentIndex()", "showIndex(QModelIndex)", "saveAs()",
                                      "removeAllRows()"}));
    QCOMPARE(meta.method(meta.methodOffset()).methodType(), QMetaMethod::Signal);
}

void tst_FifHitsView::stateTable_data()
{
    QTest::addColumn<QString>("state");
    QTest::newRow("no job") << "no job";
    QTest::newRow("idle") << "idle";
    QTest::newRow("searching") << "searching";
}

void tst_FifHitsView::stateTable()
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

    if (state == "searching") {
        EndWatcher watcher(job);
        QVERIFY(job->start(request()));
        // aboutToStart() has been handled before start() returned.
        QVERIFY(chase->isVisible());
        QCOMPARE(view->getStatusLabel()->text(), QStringLiteral("Searching..."));
        QVERIFY(actionOf(view, "stop-fifjob")->isEnabled());
        QVERIFY(!next->isEnabled());
        bool enabledOnFirstRows = false;
        bool sawRows = false;
        QObject context;
        connect(job->getHitsModel(), &QAbstractItemModel::rowsInserted, &context, [&] {
            if (!sawRows)
                enabledOnFirstRows = next->isEnabled();
            sawRows = true;
        });
        QVERIFY(watcher.wait());
        QVERIFY(sawRows);
        QVERIFY(enabledOnFirstRows);
        QVERIFY(!chase->isVisible());
        QVERIFY(!actionOf(view, "stop-fifjob")->isEnabled());
        return;
    }

    QVERIFY(!chase->isVisible());
    QVERIFY(view->getStatusLabel()->text().isEmpty());
    QVERIFY(!actionOf(view, "stop-fifjob")->isEnabled());
    QVERIFY(actionOf(view, "find-in-files")->isEnabled());
    for (const char* name : kNavigationActions)
        QVERIFY2(!actionOf(view, name)->isEnabled(), name);
    if (job) {
        // Outside a search, row changes do not reach the actions.
        job->getHitsModel()->insertRows(0, 2);
        QVERIFY(!next->isEnabled());
        QVERIFY(!actionOf(view, "clear-fifresults")->isEnabled());
    }
}

void tst_FifHitsView::finalStatus_data()
{
    QTest::addColumn<int>("files");
    QTest::addColumn<int>("hitsPerFile");
    QTest::addColumn<int>("plainFiles");
    QTest::addColumn<QString>("expected");
    QTest::newRow("several") << 3 << 4 << 37
                             << "Found 12 line(s) in 3 file(s) out of 40 file(s)";
    QTest::newRow("one") << 1 << 1 << 0 << "Found 1 line(s) in 1 file(s) out of 1 file(s)";
    QTest::newRow("nothing found") << 0 << 0 << 5
                                   << "Found 0 line(s) in 0 file(s) out of 5 file(s)";
}

void tst_FifHitsView::finalStatus()
{
    QFETCH(int, files);
    QFETCH(int, hitsPerFile);
    QFETCH(int, plainFiles);
    QFETCH(QString, expected);
    makeTree(files, hitsPerFile, plainFiles);

    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));

    QCOMPARE(view.getStatusLabel()->text(), expected);
    QVERIFY(!chaseActionOf(view)->isVisible());
    QVERIFY(!actionOf(&view, "stop-fifjob")->isEnabled());
    const bool hasRows = files * hitsPerFile > 0;
    for (const char* name : kNavigationActions)
        QVERIFY2(actionOf(&view, name)->isEnabled() == hasRows, name);

    // Starting the next run clears the status label.
    EndWatcher watcher(job);
    QVERIFY(job->start(request()));
    QVERIFY(view.getStatusLabel()->text().isEmpty());
    QVERIFY(watcher.wait());
    QCOMPARE(view.getStatusLabel()->text(), expected);
}

void tst_FifHitsView::searchingShowsEachFile()
{
    makeTree(4, 1, 3);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    QStringList labels;
    QStringList files;
    QObject context;
    // Connected after the view: sees the label the view has just set.
    connect(job, &FifJob::searching, &context, [&](const QString& file) {
        files << file;
        labels << view.getStatusLabel()->text();
    });
    QVERIFY(runToEnd(job, request()));
    QCOMPARE(files.size(), 7);
    for (int i = 0; i < files.size(); ++i)
        QCOMPARE(labels.at(i), QStringLiteral("Searching ") + files.at(i));
}

void tst_FifHitsView::startShowsViewAndDock_data()
{
    QTest::addColumn<bool>("inDock");
    QTest::newRow("in a dock") << true;
    QTest::newRow("not in a dock") << false;
}

void tst_FifHitsView::startShowsViewAndDock()
{
    QFETCH(bool, inDock);
    makeTree(2, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    QMainWindow window;
    QDockWidget* dock = nullptr;
    FifHitsView* view = nullptr;
    if (inDock) {
        dock = new QDockWidget(&window);
        view = new FifHitsView(job, dock);
        dock->setWidget(view);
        window.addDockWidget(Qt::BottomDockWidgetArea, dock);
        dock->hide();
    } else {
        view = new FifHitsView(job, nullptr);
    }
    std::unique_ptr<FifHitsView> ownedView(inDock ? nullptr : view);
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));
    QVERIFY(!view->isVisible());

    EndWatcher watcher(job);
    QVERIFY(job->start(request()));
    QVERIFY(view->isVisible());
    if (inDock) {
        QVERIFY(dock->isVisible());
        QCOMPARE(view->getStatusLabel()->text(), QStringLiteral("Searching..."));
    } else {
        QVERIFY(view->getStatusLabel()->text().isEmpty());
    }
    QVERIFY(watcher.wait());
    QCOMPARE(view->getStatusLabel()->text(),
             QStringLiteral("Found 2 line(s) in 2 file(s) out of 2 file(s)"));
}

void tst_FifHitsView::clearDuringSearch()
{
    const int files = 40;
    const int hitsPerFile = 5;
    makeTree(files, hitsPerFile);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QAction* clear = actionOf(&view, "clear-fifresults");

    int seenFiles = 0;
    int removed = -1;
    bool labelClearedByClear = false;
    QStringList labelsAfterClear;
    QObject context;
    connect(job, &FifJob::searching, &context, [&](const QString&) {
        ++seenFiles;
        if (removed >= 0) {
            labelsAfterClear << view.getStatusLabel()->text();
            return;
        }
        // Every hit of the files before this one has been delivered by now.
        if (seenFiles == 10) {
            removed = job->getHitsModel()->rowCount();
            QVERIFY(clear->isEnabled());
            clear->trigger();
            QCOMPARE(job->getHitsModel()->rowCount(), 0);
            labelClearedByClear = view.getStatusLabel()->text().isEmpty();
        }
    });
    QVERIFY(runToEnd(job, request()));

    QCOMPARE(removed, 9 * hitsPerFile);
    QVERIFY(labelClearedByClear);
    QVERIFY(!labelsAfterClear.isEmpty());
    QVERIFY(labelsAfterClear.first().startsWith(QStringLiteral("Searching ")));
    const int left = files * hitsPerFile - removed;
    QCOMPARE(job->getHitsModel()->rowCount(), left);
    QCOMPARE(view.getStatusLabel()->text(),
             QStringLiteral("Found %1 line(s) in %2 file(s) out of %2 file(s)")
                 .arg(left)
                 .arg(files));
}

void tst_FifHitsView::clearWhenIdle()
{
    makeTree(2, 2);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QVERIFY(!view.getStatusLabel()->text().isEmpty());

    actionOf(&view, "clear-fifresults")->trigger();
    QCOMPARE(job->getHitsModel()->rowCount(), 0);
    QVERIFY(view.getStatusLabel()->text().isEmpty());
    for (const char* name : kNavigationActions)
        QVERIFY2(!actionOf(&view, name)->isEnabled(), name);
    // Clearing does not run the job.
    QVERIFY(!job->isRunning());
}

void tst_FifHitsView::hiddenViewDisablesNavigation()
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
    QVERIFY(!view->isVisible());
    QCOMPARE(view->getStatusLabel()->text(),
             QStringLiteral("Found 6 line(s) in 3 file(s) out of 3 file(s)"));
    for (const char* name : kNavigationActions)
        QVERIFY2(!actionOf(view, name)->isEnabled(), name);
    QVERIFY(!shared.isEnabled());

    // Showing it later does not bring them back before the next search.
    container.show();
    QVERIFY(QTest::qWaitForWindowExposed(&container));
    QVERIFY(view->isVisible());
    for (const char* name : kNavigationActions)
        QVERIFY2(!actionOf(view, name)->isEnabled(), name);
    // Outside a search, row changes do not reach the actions.
    job->getHitsModel()->insertRows(0, 1);
    for (const char* name : kNavigationActions)
        QVERIFY2(!actionOf(view, name)->isEnabled(), name);
    QVERIFY(runToEnd(job, request()));
    for (const char* name : kNavigationActions)
        QVERIFY2(actionOf(view, name)->isEnabled(), name);
    QVERIFY(shared.isEnabled());
}

void tst_FifHitsView::sameJobTwice()
{
    makeTree(2, 1);
    FifManager manager;
    auto* job = new ProbeJob(&manager);
    const int aboutBefore = job->receiverCount(SIGNAL(aboutToStart()));
    const int searchingBefore = job->receiverCount(SIGNAL(searching(QString)));
    const int finishedBefore = job->receiverCount(SIGNAL(finished()));

    FifHitsView view(job, nullptr);
    QCOMPARE(job->receiverCount(SIGNAL(aboutToStart())), aboutBefore + 1);
    QCOMPARE(job->receiverCount(SIGNAL(searching(QString))), searchingBefore + 1);
    QCOMPARE(job->receiverCount(SIGNAL(finished())), finishedBefore + 1);

    view.setJob(job);
    QCOMPARE(job->receiverCount(SIGNAL(aboutToStart())), aboutBefore + 1);
    QCOMPARE(job->receiverCount(SIGNAL(searching(QString))), searchingBefore + 1);
    QCOMPARE(job->receiverCount(SIGNAL(finished())), finishedBefore + 1);

    // One stop request per trigger of the (linked) stop command.
    QAction sharedStop;
    view.linkStopAction(&sharedStop);
    sharedStop.trigger();
    QVERIFY(job->shouldStop());
    job->setShouldStop(false);

    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QCOMPARE(view.getStatusLabel()->text(),
             QStringLiteral("Found 2 line(s) in 2 file(s) out of 2 file(s)"));
}

void tst_FifHitsView::replacedJob()
{
    makeTree(2, 1);
    FifManager manager;
    auto* oldJob = new ProbeJob(&manager);
    auto* newJob = new ProbeJob(&manager);
    const int oldAbout = oldJob->receiverCount(SIGNAL(aboutToStart()));
    const int oldSearching = oldJob->receiverCount(SIGNAL(searching(QString)));
    const int oldFinished = oldJob->receiverCount(SIGNAL(finished()));

    FifHitsView view(oldJob, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QAction sharedStop;
    view.linkStopAction(&sharedStop);
    view.setJob(newJob);
    QCOMPARE(view.getJob(), newJob);
    QCOMPARE(view.findChild<QTreeView*>()->model(), newJob->getHitsModel());
    QCOMPARE(oldJob->receiverCount(SIGNAL(finished())), oldFinished);
    QCOMPARE(oldJob->receiverCount(SIGNAL(aboutToStart())), oldAbout);
    QCOMPARE(oldJob->receiverCount(SIGNAL(searching(QString))), oldSearching);

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
    QCOMPARE(oldJob->getHitsModel()->rowCount(), 2);
    QCOMPARE(newJob->getHitsModel()->rowCount(), 0);

    QVERIFY(runToEnd(newJob, request()));
    QCOMPARE(view.getStatusLabel()->text(),
             QStringLiteral("Found 2 line(s) in 2 file(s) out of 2 file(s)"));

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
}

void tst_FifHitsView::staleEndOfReplacedJob()
{
    makeTree(2, 1);
    FifManager manager;
    FifJob* oldJob = manager.getJob(0);
    FifJob* newJob = manager.getJob(1);
    FifHitsView view(oldJob, nullptr);
    EndWatcher watcher(oldJob);
    QVERIFY(oldJob->start(request()));
    // Let the old job's end be queued for the view before it is replaced,
    // without handling any event meanwhile.
    while (!oldJob->isFinished())
        QThread::msleep(1);
    view.setJob(newJob);
    QVERIFY(watcher.wait());
    QCOMPARE(view.getStatusLabel()->text(), QString());
    QVERIFY(!chaseActionOf(view)->isVisible());
}

void tst_FifHitsView::jobDeletedUnderView()
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

void tst_FifHitsView::modelUnderTesterWhileStreaming()
{
    makeTree(60, 20);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QAbstractItemModel* shown = view.findChild<QTreeView*>()->model();
    QVERIFY(shown);
    QAbstractItemModelTester tester(shown, QAbstractItemModelTester::FailureReportingMode::QtTest);
    QVERIFY(runToEnd(job, request()));
    QCOMPARE(shown->rowCount(), 1200);
    QCOMPARE(view.getStatusLabel()->text(),
             QStringLiteral("Found 1200 line(s) in 60 file(s) out of 60 file(s)"));
    // A second run empties the shown model first, still under the tester.
    QVERIFY(runToEnd(job, request()));
    QCOMPARE(shown->rowCount(), 1200);
}

void tst_FifHitsView::wrapPrompts_data()
{
    QTest::addColumn<bool>("forward");
    QTest::addColumn<bool>("yes");
    QTest::newRow("bottom, yes") << true << true;
    QTest::newRow("bottom, no") << true << false;
    QTest::newRow("top, yes") << false << true;
    QTest::newRow("top, no") << false << false;
}

void tst_FifHitsView::wrapPrompts()
{
    QFETCH(bool, forward);
    QFETCH(bool, yes);
    makeTree(3, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QTreeView* tree = view.findChild<QTreeView*>();
    QAbstractItemModel* model = tree->model();
    QCOMPARE(model->rowCount(), 3);

    const int edge = forward ? 2 : 0;
    tree->setCurrentIndex(model->index(edge, 0));
    QSignalSpy spy(&view, &FifHitsView::showHit);
    PromptAnswerer answerer(yes ? QMessageBox::Yes : QMessageBox::No);
    actionOf(&view, forward ? "show-next-fifhit" : "show-previous-fifhit")->trigger();

    QCOMPARE(answerer.prompts.size(), 1);
    const Prompt& prompt = answerer.prompts.first();
    QCOMPARE(prompt.title, forward ? QStringLiteral("Reach bottom") : QStringLiteral("Reach top"));
    QCOMPARE(prompt.text, forward ? QStringLiteral("Reach bottom, continued from top?")
                                  : QStringLiteral("Reach top, continued from bottom?"));
    QCOMPARE(prompt.icon, QMessageBox::Question);
    QCOMPARE(prompt.buttons, QMessageBox::Yes | QMessageBox::No);

    if (yes) {
        const int target = forward ? 0 : 2;
        QCOMPARE(tree->currentIndex().row(), target);
        QCOMPARE(tree->selectionModel()->selectedIndexes(), QModelIndexList{model->index(target, 0)});
        QCOMPARE(spy.count(), 1);
        QVERIFY(sameHit(hitOf(spy, 0), rowHit(model, target)));
    } else {
        QCOMPARE(tree->currentIndex().row(), edge);
        QCOMPARE(spy.count(), 0);
    }
}

void tst_FifHitsView::firstStepWithoutCurrentRow()
{
    makeTree(3, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QTreeView* tree = view.findChild<QTreeView*>();
    QAbstractItemModel* model = tree->model();
    PromptAnswerer answerer(QMessageBox::No);
    QSignalSpy spy(&view, &FifHitsView::showHit);

    QVERIFY(!tree->currentIndex().isValid());
    view.next();
    QCOMPARE(tree->currentIndex().row(), 0);
    QCOMPARE(spy.count(), 1);
    QVERIFY(sameHit(hitOf(spy, 0), rowHit(model, 0)));
    view.next();
    QCOMPARE(tree->currentIndex().row(), 1);
    QCOMPARE(spy.count(), 2);
    QVERIFY(sameHit(hitOf(spy, 1), rowHit(model, 1)));

    tree->setCurrentIndex(QModelIndex());
    view.previous();
    QCOMPARE(tree->currentIndex().row(), 2);
    QCOMPARE(tree->selectionModel()->selectedIndexes(), QModelIndexList{model->index(2, 0)});
    QCOMPARE(spy.count(), 3);
    QVERIFY(sameHit(hitOf(spy, 2), rowHit(model, 2)));
    // The hit is handed out whole.
    const FifHit hit = hitOf(spy, 2);
    QCOMPARE(hit.job.data(), job);
    QVERIFY(hit.line >= 0);
    QVERIFY(hit.text.contains(QStringLiteral("needle")));
    QVERIFY(hit.file.endsWith(QStringLiteral(".txt")));
    QCOMPARE(answerer.prompts.size(), 0);
}

void tst_FifHitsView::oneRowWraps()
{
    makeTree(1, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QTreeView* tree = view.findChild<QTreeView*>();
    QAbstractItemModel* model = tree->model();
    QCOMPARE(model->rowCount(), 1);
    QSignalSpy spy(&view, &FifHitsView::showHit);
    PromptAnswerer answerer(QMessageBox::Yes);

    view.next(); // no current row: no prompt
    QCOMPARE(answerer.prompts.size(), 0);
    QCOMPARE(spy.count(), 1);
    view.next();
    QCOMPARE(answerer.prompts.size(), 1);
    QCOMPARE(answerer.prompts.last().title, QStringLiteral("Reach bottom"));
    QCOMPARE(tree->currentIndex().row(), 0);
    QCOMPARE(spy.count(), 2);
    view.previous();
    QCOMPARE(answerer.prompts.size(), 2);
    QCOMPARE(answerer.prompts.last().title, QStringLiteral("Reach top"));
    QCOMPARE(tree->currentIndex().row(), 0);
    QCOMPARE(spy.count(), 3);
    for (int i = 0; i < spy.count(); ++i)
        QVERIFY(sameHit(hitOf(spy, i), rowHit(model, 0)));
}

void tst_FifHitsView::emptyListDoesNothing()
{
    makeTree(0, 0, 2);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QAction sharedNext;
    QAction sharedPrevious;
    view.linkNextAction(&sharedNext);
    view.linkPreviousAction(&sharedPrevious);
    QSignalSpy spy(&view, &FifHitsView::showHit);
    PromptAnswerer answerer(QMessageBox::Yes);

    view.next();
    view.previous();
    sharedNext.trigger();
    sharedPrevious.trigger();
    QMetaObject::invokeMethod(&view, "showCurrentIndex");
    QCOMPARE(spy.count(), 0);
    QCOMPARE(answerer.prompts.size(), 0);
    QVERIFY(!view.findChild<QTreeView*>()->currentIndex().isValid());

    // A view without a job does nothing either.
    FifHitsView noJob(nullptr, nullptr);
    QSignalSpy noJobSpy(&noJob, &FifHitsView::showHit);
    noJob.next();
    noJob.previous();
    QMetaObject::invokeMethod(&noJob, "showCurrentIndex");
    QMetaObject::invokeMethod(&noJob, "removeAllRows");
    QMetaObject::invokeMethod(&noJob, "updateActions");
    QCOMPARE(noJobSpy.count(), 0);
    for (const char* name : kNavigationActions)
        QVERIFY2(!actionOf(&noJob, name)->isEnabled(), name);
}

void tst_FifHitsView::gotoWithAndWithoutCurrentRow()
{
    makeTree(4, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QTreeView* tree = view.findChild<QTreeView*>();
    QAbstractItemModel* model = tree->model();
    QAction* gotoAction = actionOf(&view, "show-current-fifhit");
    QVERIFY(gotoAction->isEnabled());
    QSignalSpy spy(&view, &FifHitsView::showHit);
    PromptAnswerer answerer(QMessageBox::No);

    gotoAction->trigger();
    QCOMPARE(tree->currentIndex().row(), 0);
    QCOMPARE(tree->selectionModel()->selectedIndexes(), QModelIndexList{model->index(0, 0)});
    QCOMPARE(spy.count(), 1);
    QVERIFY(sameHit(hitOf(spy, 0), rowHit(model, 0)));

    tree->setCurrentIndex(model->index(2, 0));
    gotoAction->trigger();
    QCOMPARE(tree->currentIndex().row(), 2);
    QCOMPARE(spy.count(), 2);
    QVERIFY(sameHit(hitOf(spy, 1), rowHit(model, 2)));
    QCOMPARE(answerer.prompts.size(), 0);
}

void tst_FifHitsView::doubleClickEmitsOnce()
{
    makeTree(3, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.resize(600, 300);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QTreeView* tree = view.findChild<QTreeView*>();
    QAbstractItemModel* model = tree->model();
    QSignalSpy spy(&view, &FifHitsView::showHit);

    const QRect rect = tree->visualRect(model->index(1, 0));
    QVERIFY(rect.isValid());
    // Through the window, as the platform delivers it: press, release, press,
    // double-click, release.
    QTest::mouseDClick(view.windowHandle(), Qt::LeftButton, Qt::NoModifier,
                       tree->viewport()->mapTo(&view, rect.center()));
    QCOMPARE(spy.count(), 1);
    QVERIFY(sameHit(hitOf(spy, 0), rowHit(model, 1)));
}

void tst_FifHitsView::relayWithoutDuplicates()
{
    makeTree(4, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QTreeView* tree = view.findChild<QTreeView*>();
    QSignalSpy spy(&view, &FifHitsView::showHit);

    QAction sharedNext;
    QAction sharedPrevious;
    view.linkNextAction(&sharedNext);
    view.linkNextAction(&sharedNext);
    view.linkPreviousAction(&sharedPrevious);
    view.linkPreviousAction(&sharedPrevious);
    sharedNext.trigger();
    QCOMPARE(spy.count(), 1);
    QCOMPARE(tree->currentIndex().row(), 0);
    sharedNext.trigger();
    QCOMPARE(spy.count(), 2);
    QCOMPARE(tree->currentIndex().row(), 1);
    sharedPrevious.trigger();
    QCOMPARE(spy.count(), 3);
    QCOMPARE(tree->currentIndex().row(), 0);

    // Another action replaces the first link.
    QAction otherNext;
    view.linkNextAction(&otherNext);
    sharedNext.trigger();
    QCOMPARE(spy.count(), 3);
    otherNext.trigger();
    QCOMPARE(spy.count(), 4);
    QCOMPARE(tree->currentIndex().row(), 1);
}

void tst_FifHitsView::relayReachesDisabledActionAndStop()
{
    makeTree(2, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    QWidget container; // hidden: the view's own navigation stays disabled
    auto* view = new FifHitsView(job, &container);
    QVERIFY(runToEnd(job, request()));
    QAction* ownNext = actionOf(view, "show-next-fifhit");
    QVERIFY(!ownNext->isEnabled());

    QAction sharedNext;
    view->linkNextAction(&sharedNext);
    QSignalSpy spy(view, &FifHitsView::showHit);
    sharedNext.trigger();
    QCOMPARE(spy.count(), 1);

    QAction sharedStop;
    view->linkStopAction(&sharedStop);
    QVERIFY(!job->shouldStop());
    sharedStop.trigger();
    QVERIFY(job->shouldStop());
    job->setShouldStop(false);
}

void tst_FifHitsView::unlinkAndDestroyedSharedAction()
{
    makeTree(2, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QSignalSpy spy(&view, &FifHitsView::showHit);

    QAction sharedNext;
    QAction sharedPrevious;
    QAction sharedStop;
    view.linkNextAction(&sharedNext);
    view.linkPreviousAction(&sharedPrevious);
    view.linkStopAction(&sharedStop);
    sharedStop.setEnabled(false);
    view.unlinkActions();
    sharedNext.trigger();
    sharedPrevious.trigger();
    QCOMPARE(spy.count(), 0);
    QVERIFY(!view.findChild<QTreeView*>()->currentIndex().isValid());
    sharedStop.setEnabled(true);
    sharedStop.trigger();
    QVERIFY(!job->shouldStop());
    // Unlinking leaves the shared actions' state alone.
    QVERIFY(sharedStop.isEnabled());

    // Linking null and a destroyed action are both harmless.
    view.linkNextAction(nullptr);
    auto* shortLived = new QAction;
    view.linkNextAction(shortLived);
    delete shortLived;
    view.linkNextAction(nullptr);
    view.unlinkActions();
    view.next();
    QCOMPARE(spy.count(), 1);
    QVERIFY(runToEnd(job, request()));
}

void tst_FifHitsView::linkedActionsFollowState()
{
    makeTree(30, 3);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QAction sharedNext;
    QAction sharedPrevious;
    QAction sharedStop;
    sharedNext.setEnabled(false);
    sharedPrevious.setEnabled(false);
    sharedStop.setEnabled(false);
    view.linkNextAction(&sharedNext);
    view.linkPreviousAction(&sharedPrevious);
    view.linkStopAction(&sharedStop);

    EndWatcher watcher(job);
    QVERIFY(job->start(request()));
    QVERIFY(sharedStop.isEnabled());
    QVERIFY(watcher.wait());
    QVERIFY(!sharedStop.isEnabled());
    QVERIFY(sharedNext.isEnabled());
    QVERIFY(sharedPrevious.isEnabled());

    // Clearing recomputes every state, the stop command's included.
    sharedStop.setEnabled(true);
    actionOf(&view, "clear-fifresults")->trigger();
    QVERIFY(!sharedNext.isEnabled());
    QVERIFY(!sharedPrevious.isEnabled());
    QVERIFY(!sharedStop.isEnabled());
}

void tst_FifHitsView::saveThroughExportDialog()
{
    makeTree(3, 2);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QAbstractItemModel* model = view.findChild<QTreeView*>()->model();
    QCOMPARE(model->rowCount(), 6);

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
    QAction* save = actionOf(&view, "save-fifhits");
    QVERIFY(save->isEnabled());
    save->trigger();
    QCOMPARE(answerer.seen, 1);

    QFile file(path);
    QVERIFY(file.open(QIODevice::ReadOnly));
    const QStringList lines = QString::fromUtf8(file.readAll()).split(QLatin1Char('\n'),
                                                                     Qt::SkipEmptyParts);
    QCOMPARE(lines.size(), 6);
    for (int row = 0; row < 6; ++row) {
        QCOMPARE(lines.at(row), rowText(model, row));
        QVERIFY(lines.at(row).contains(QStringLiteral("needle")));
    }
}

void tst_FifHitsView::contextMenuEntries()
{
    makeTree(2, 1);
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));

    // The menu's separator dies with the menu: read everything while it is open.
    QList<QAction*> entries;
    QStringList texts;
    QAction* defaultAction = nullptr;
    QObject* menuParent = nullptr;
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
        menuParent = menu->parent();
        menu->close();
    });
    poll.start(10);
    const QPoint local(20, 60);
    QContextMenuEvent event(QContextMenuEvent::Mouse, local, view.mapToGlobal(local));
    QApplication::sendEvent(&view, &event);

    QCOMPARE(entries.size(), 8);
    QCOMPARE(texts, QStringList({"Goto", "Show Next Result", "Show Previous Result", "--",
                                 "Stop", "Save As...", "Find in files", "Clear All"}));
    QCOMPARE(defaultAction, actionOf(&view, "show-current-fifhit"));
    QCOMPARE(menuParent, &view);
    // The entries are the view's own actions, with their enabled state.
    QCOMPARE(entries.at(4), actionOf(&view, "stop-fifjob"));
    QVERIFY(!entries.at(4)->isEnabled());
    QCOMPARE(entries.at(7), actionOf(&view, "clear-fifresults"));
    QVERIFY(entries.at(7)->isEnabled());
}

void tst_FifHitsView::setIconSize()
{
    FifHitsView view(nullptr, nullptr);
    view.setIconSize(QSize(40, 40));
    QCOMPARE(view.getToolBar()->iconSize(), QSize(40, 40));
    QCOMPARE(view.findChild<ChaseWidget*>()->minimumSize(), QSize(32, 32));
}

void tst_FifHitsView::findCommandWithoutJob()
{
    FifHitsView view(nullptr, nullptr);
    ModalAnswerer<QDialog> answerer([](QDialog* dialog, bool) { dialog->reject(); });
    view.onFifAction();
    QCoreApplication::processEvents();
    QCOMPARE(answerer.seen, 0);
}

void tst_FifHitsView::findCommandReopensLastSearch()
{
    makeTree(3, 2, 1);
    FifManager manager;
    manager.setFilters({QStringLiteral("*.txt"), QStringLiteral("*.log")});
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    QVERIFY(runToEnd(job, request()));
    QCOMPARE(job->getHitsModel()->rowCount(), 6);

    // The dialog opens on the last search; pressing Find starts it again on
    // the view's own job.
    QString what;
    QString where;
    QWidget* dialogParent = nullptr;
    EndWatcher watcher(job);
    ModalAnswerer<FifDialog> answerer([&](FifDialog* dialog, bool fresh) {
        if (!fresh)
            return;
        what = dialog->findChild<QComboBox*>(QStringLiteral("what"))->currentText();
        where = dialog->findChild<QComboBox*>(QStringLiteral("where"))->currentText();
        dialogParent = dialog->parentWidget();
        dialog->findChild<QComboBox*>(QStringLiteral("what"))->setCurrentText("needle 1");
        dialog->findChild<QPushButton*>(QStringLiteral("start"))->click();
    });
    actionOf(&view, "find-in-files")->trigger();
    QCOMPARE(answerer.seen, 1);
    QCOMPARE(what, QStringLiteral("needle"));
    QCOMPARE(where, dir->path());
    QCOMPARE(dialogParent, &view);
    QVERIFY(watcher.wait());
    QCOMPARE(job->getInput().what, QStringLiteral("needle 1"));
    QCOMPARE(view.getStatusLabel()->text(),
             QStringLiteral("Found 3 line(s) in 2 file(s) out of 4 file(s)"));
}

void tst_FifHitsView::findCommandOnFreshJob()
{
    FifManager manager;
    manager.setFilters({QStringLiteral("*.cpp;*.h"), QStringLiteral("*.txt")});
    FifJob* job = manager.getJob(0);
    FifHitsView view(job, nullptr);

    QString filter;
    QStringList filterItems;
    ModalAnswerer<FifDialog> answerer([&](FifDialog* dialog, bool fresh) {
        if (!fresh)
            return;
        auto* box = dialog->findChild<QComboBox*>(QStringLiteral("filter"));
        filter = box->currentText();
        for (int i = 0; i < box->count(); ++i)
            filterItems << box->itemText(i);
        dialog->reject();
    });
    view.onFifAction();
    QCOMPARE(answerer.seen, 1);
    QCOMPARE(filter, QStringLiteral("*.cpp;*.h"));
    QVERIFY(filterItems.contains(QStringLiteral("*.txt")));
    QVERIFY(!job->isRunning());
    QCOMPARE(job->getLineHitCount(), 0);
}

int main(int argc, char** argv)
{
    ApplicationBase app(argc, argv);
    tst_FifHitsView tc;
    QTEST_SET_MAIN_SOURCE_PATH
    return QTest::qExec(&tc, argc, argv);
}

#include "tst_fifhitsview.moc"
