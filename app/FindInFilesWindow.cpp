#include "FindInFilesWindow.h"

#include "FileViewer.h"

#include "ApplicationBase.h"
#include "FifHandler.h"
#include "FifHit.h"
#include "FifHitsView.h"
#include "FifInput.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "FifSettings.h"
#include "HelpManager.h"
#include "ImageManager.h"

#include <QApplication>
#include <QDir>
#include <QFileInfo>
#include <QKeySequence>
#include <QMenuBar>
#include <QMessageBox>
#include <QStatusBar>
#include <QToolBar>

using namespace Gui::Orba;

namespace {
// How long a note in the status bar stays.
constexpr int messageTimeoutMs = 10000;
}

FindInFilesWindow::FindInFilesWindow(const QString& folder, QWidget* parent)
    : MainWindow(parent)
    , startFolder(folder)
{
    setObjectName(QStringLiteral("FindInFilesWindow"));
    setWindowTitle(tr("Find in Files - %1")
                       .arg(QDir::toNativeSeparators(folder.isEmpty() ? QDir::currentPath()
                                                                      : folder)));
    setWindowIcon(ImageManager::getInstance()->getIcon(QStringLiteral("gui-orba-find-in-files")));

    viewer = new FileViewer(this);
    setCentralWidget(viewer);
    connect(viewer, &FileViewer::fileOpened, this, [this](const QString& path) {
        setWindowTitle(tr("Find in Files - %1").arg(QDir::toNativeSeparators(path)));
    });
    connect(viewer, &FileViewer::failed, this,
            [this](const QString& message) { statusBar()->showMessage(message, messageTimeoutMs); });

    createActions();
    createDocks();
    createMenus();
    updateFindAction();
    statusBar()->showMessage(tr("Ready"));
    resize(960, 720);
}

FindInFilesWindow::~FindInFilesWindow()
{
    // The children go in order of creation, the handler before the docks;
    // a dock hidden on its way out must not reach the handler any more.
    for (const auto& dock : docks) {
        if (dock)
            disconnect(dock, nullptr, this, nullptr);
    }
}

FileViewer* FindInFilesWindow::getViewer() const
{
    return viewer;
}

FifAction* FindInFilesWindow::getFindAction() const
{
    return findAction;
}

ShowNextFifHitAction* FindInFilesWindow::getNextAction() const
{
    return nextAction;
}

ShowPreviousFifHitAction* FindInFilesWindow::getPreviousAction() const
{
    return previousAction;
}

StopFifJobAction* FindInFilesWindow::getStopAction() const
{
    return stopAction;
}

FifHandler* FindInFilesWindow::getHandler() const
{
    return handler;
}

FifResultsDockWidget* FindInFilesWindow::getResultsDock(int index) const
{
    return index >= 0 && index < 2 ? docks[index].data() : nullptr;
}

void FindInFilesWindow::showHit(const FifHit& hit)
{
    QString error;
    if (!viewer->showHit(hit, &error)) {
        statusBar()->showMessage(error, messageTimeoutMs);
        return;
    }
    statusBar()->showMessage(tr("%1, line %2")
                                 .arg(QDir::toNativeSeparators(viewer->getFilePath()))
                                 .arg(hit.line));
}

void FindInFilesWindow::updateFindAction()
{
    handler->updateActions();
}

void FindInFilesWindow::offerStartFolder(FifInput& input)
{
    // Once only: later searches offer the folders the user chose last.
    if (startFolder.isEmpty())
        return;
    input.where = QDir::toNativeSeparators(QFileInfo(startFolder).absoluteFilePath());
    startFolder.clear();
}

void FindInFilesWindow::showHelpTopic(const QString& topic)
{
    if (!HelpManager::getInstance()->showHelp(topic))
        statusBar()->showMessage(tr("No help page for \"%1\".").arg(topic), messageTimeoutMs);
}

void FindInFilesWindow::about()
{
    QMessageBox::about(this, tr("About findinfiles"),
                       tr("<p><b>findinfiles</b> %1</p>"
                          "<p>Finds text, wildcard patterns or regular expressions in the "
                          "files of one or more folders and shows each result in place.</p>")
                           .arg(QApplication::applicationVersion()));
}

void FindInFilesWindow::createActions()
{
    findAction = new FifAction(this);
    nextAction = new ShowNextFifHitAction(this);
    previousAction = new ShowPreviousFifHitAction(this);
    stopAction = new StopFifJobAction(this);

    // The handler runs the find command: addAction makes a trigger call its
    // doAction. The request it builds passes through offerStartFolder first.
    handler = new FifHandler(this);
    handler->addAction(findAction);
    connect(handler, &FifHandler::getInput, this, &FindInFilesWindow::offerStartFolder,
            Qt::DirectConnection);
}

void FindInFilesWindow::createDocks()
{
    // The searches of both docks scan with the threads the settings name.
    ApplicationBase* application = ApplicationBase::getInstance();
    const int threads = FifSettings().getThreadCount(application ? application->getSettings() : nullptr);
    FifManager* manager = FifManager::getInstance(this);
    for (int i = 0; i < 2; ++i) {
        manager->getJob(i)->setThreadCount(threads);
        auto* dock = new FifResultsDockWidget(this);
        docks[i] = dock;
        dock->linkSharedActions(nextAction, previousAction, stopAction);
        if (auto* view = qobject_cast<FifHitsView*>(dock->widget()))
            connect(view, &FifHitsView::showHit, this, &FindInFilesWindow::showHit);
        // The find command depends on the first dock; re-check it once a
        // dock has gone.
        connect(dock, &QObject::destroyed, this, &FindInFilesWindow::updateFindAction,
                Qt::QueuedConnection);
        connect(dock, &QDockWidget::visibilityChanged, this,
                &FindInFilesWindow::updateFindAction);
    }
    // The second dock keeps a search of its own (job slot 1, started from
    // its own tool bar), so it is not shown and raised by every search of
    // the Find in Files command, which runs on slot 0.
    if (auto* view = qobject_cast<FifHitsView*>(docks[1]->widget()))
        view->setJob(manager->getJob(1));
    docks[1]->setWindowTitle(tr("Find in Files Results (2)"));
    tabifyDockWidget(docks[0], docks[1]);
    docks[1]->hide();
}

void FindInFilesWindow::createMenus()
{
    QMenu* fileMenu = menuBar()->addMenu(tr("&File"));
    fileMenu->setObjectName(QStringLiteral("fileMenu"));
    fileMenu->addAction(viewer->getOpenInEditorAction());
    fileMenu->addAction(viewer->getCopyPathAction());
    fileMenu->addSeparator();
    QAction* quit = fileMenu->addAction(tr("&Quit"), this, &QWidget::close);
    quit->setObjectName(QStringLiteral("quit"));
    quit->setShortcut(QKeySequence::Quit);

    editMenu = menuBar()->addMenu(tr("&Edit"));
    editMenu->setObjectName(QStringLiteral("editMenu"));
    editMenu->addAction(findAction);
    editMenu->addSeparator();
    editMenu->addAction(nextAction);
    editMenu->addAction(previousAction);
    editMenu->addAction(stopAction);
    connect(editMenu, &QMenu::aboutToShow, this, &FindInFilesWindow::updateFindAction);

    QMenu* viewMenu = menuBar()->addMenu(tr("&View"));
    viewMenu->setObjectName(QStringLiteral("viewMenu"));
    for (const auto& dock : docks)
        viewMenu->addAction(dock->toggleViewAction());

    QMenu* helpMenu = menuBar()->addMenu(tr("&Help"));
    helpMenu->setObjectName(QStringLiteral("helpMenu"));
    helpMenu->addAction(tr("Find in Files &Dialog"), this,
                        [this] { showHelpTopic(QStringLiteral("find-in-files-dialog")); });
    helpMenu->addAction(tr("Find in Files &Results"), this,
                        [this] { showHelpTopic(QStringLiteral("find-in-files-results")); });
    helpMenu->addSeparator();
    helpMenu->addAction(tr("&About findinfiles"), this, &FindInFilesWindow::about);

    QToolBar* toolBar = addToolBar(tr("Find in Files"));
    toolBar->setObjectName(QStringLiteral("mainToolBar"));
    toolBar->addAction(findAction);
    toolBar->addAction(previousAction);
    toolBar->addAction(nextAction);
    toolBar->addAction(stopAction);
    toolBar->addSeparator();
    toolBar->addAction(viewer->getOpenInEditorAction());
    toolBar->addAction(viewer->getCopyPathAction());
}
