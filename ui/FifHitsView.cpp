#include "FifHitsView.h"

#include "ApplicationBase.h"
#include "ChaseWidget.h"
#include "FifDialog.h"
#include "FifHitDelegate.h"
#include "FifHitsModel.h"
#include "FifInput.h"
#include "FifJob.h"
#include "FifManager.h"
#include "HelpManager.h"
#include "ImExportDialog.h"
#include "ImageManager.h"
#include "MainWindow.h"
#include "String.h"

#include <QAction>
#include <QContextMenuEvent>
#include <QDockWidget>
#include <QItemSelectionModel>
#include <QLabel>
#include <QMenu>
#include <QMessageBox>
#include <QToolBar>
#include <QTreeView>
#include <QVBoxLayout>

namespace Gui {
namespace Orba {

namespace {

QAction* makeAction(QObject* parent, const char* objectName, const char* iconId,
                    const QString& text, const QString& toolTip, bool enabled)
{
    auto* action = new QAction(parent);
    action->setObjectName(QLatin1String(objectName));
    action->setIcon(ImageManager::getInstance()->getIcon(QLatin1String(iconId)));
    action->setText(text);
    action->setToolTip(toolTip);
    action->setEnabled(enabled);
    return action;
}

FifHit hitOf(const QModelIndex& index)
{
    return index.data(Qt::UserRole).value<FifHit>();
}

} // namespace

FifHitsView::FifHitsView(FifJob* job, QWidget* parent)
    : QWidget(parent)
{
    setObjectName(QStringLiteral("FifHitsView"));
    setWindowIcon(ImageManager::getInstance()->getIcon(QStringLiteral("gui-orba-find-in-files")));

    clearAction = makeAction(this, "clear-fifresults", "gui-orba-clear-all", tr("Clear All"),
                             tr("Clear All"), false);
    findInFilesAction = makeAction(this, "find-in-files", "gui-orba-find-in-files",
                                   tr("Find in files"), tr("Find Text in Files"), true);
    nextCommand.own = makeAction(this, "show-next-fifhit", "gui-orba-show-next-fifhit",
                                tr("Show Next Result"), tr("Show Next Result"), false);
    previousCommand.own = makeAction(this, "show-previous-fifhit", "gui-orba-show-previous-fifhit",
                                    tr("Show Previous Result"), tr("Show Previous Result"),
                                    false);
    stopCommand.own = makeAction(this, "stop-fifjob", "gui-orba-stop-fifjob", tr("Stop"),
                            tr("Stop Job"), false);
    showCurrentAction = makeAction(this, "show-current-fifhit", "gui-orba-show-current-fifhit",
                                   tr("Goto"), tr("Show Current Result"), false);
    saveAction = makeAction(this, "save-fifhits", "gui-orba-file-save", tr("Save As..."),
                            tr("Save Results As a Text File"), false);
    connect(findInFilesAction, &QAction::triggered, this, &FifHitsView::onFifAction);

    vboxLayout = new QVBoxLayout(this);
    vboxLayout->setObjectName(QStringLiteral("vboxLayout"));
    vboxLayout->setSpacing(0);
    vboxLayout->setContentsMargins(0, 0, 0, 0);

    toolBar = new QToolBar(this);
    toolBar->setObjectName(QStringLiteral("toolBar"));
    toolBar->addAction(clearAction);
    toolBar->addAction(findInFilesAction);
    toolBar->addAction(nextCommand.own);
    toolBar->addAction(previousCommand.own);
    toolBar->addAction(showCurrentAction);
    toolBar->addAction(saveAction);
    toolBar->addAction(stopCommand.own);
    if (MainWindow* window = MainWindow::getInstance())
        toolBar->setIconSize(window->iconSize());

    statusLabel = new QLabel(toolBar);
    statusLabel->setFrameShadow(QFrame::Sunken);
    statusLabel->setFrameShape(QFrame::Panel);
    statusLabel->setAlignment(Qt::AlignLeft | Qt::AlignVCenter);
    // A small minimum lets long paths be cut off instead of pushing the label
    // into the tool bar's overflow menu.
    statusLabel->setMinimumWidth(25);
    statusLabel->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Preferred);
    toolBar->addWidget(statusLabel);

    chaseWidget = new ChaseWidget(toolBar, QPixmap(), false);
    chaseWidget->setMinimumSize(chaseWidget->sizeHint());
    chaseWidgetAction = toolBar->addWidget(chaseWidget);
    chaseWidgetAction->setVisible(false);

    vboxLayout->addWidget(toolBar);

    treeView = new QTreeView(this);
    treeView->setObjectName(QStringLiteral("treeView"));
    // Many rows may stream in: equal heights spare the view measuring each one.
    treeView->setUniformRowHeights(true);
    treeView->setRootIsDecorated(false);
    treeView->setItemDelegate(new FifHitDelegate(treeView));
    vboxLayout->addWidget(treeView);

    connect(saveAction, &QAction::triggered, this, &FifHitsView::saveAs);
    connect(nextCommand.own, &QAction::triggered, this, &FifHitsView::next);
    connect(previousCommand.own, &QAction::triggered, this, &FifHitsView::previous);
    connect(showCurrentAction, &QAction::triggered, this, &FifHitsView::showCurrentIndex);
    // Enter, and a double-click (or the single click of styles that open items
    // so); a double-click is one activation whatever the style.
    connect(treeView, &QAbstractItemView::activated, this, &FifHitsView::showIndex);

    setJob(job);

    HelpManager::getInstance()->setHelpForWidget(
        this, String::convert(ApplicationBase::getHelpFileName()),
        String::convert(QStringLiteral("find-in-files-results")));
}

FifHitsView::~FifHitsView()
{
    nextCommand.linked = nullptr;
    previousCommand.linked = nullptr;
    stopCommand.linked = nullptr;
}

void FifHitsView::setJob(FifJob* newJob)
{
    if (newJob == job)
        return;

    if (job) {
        // A search of the old job that is still being followed would never
        // report its end here.
        followRows(false);
        leaveSearching();
        disconnect(job, nullptr, this, nullptr);
        disconnect(stopCommand.own, &QAction::triggered, job, &FifJob::stop);
    }

    if (newJob) {
        connect(newJob, &FifJob::aboutToStart, this, &FifHitsView::onAboutToStart);
        connect(newJob, &FifJob::searching, this, &FifHitsView::onSearching);
        // Qt 6 threads have no terminated() signal; finished() covers every end.
        // It arrives queued from the job's thread, and a call already queued
        // is still delivered after the job has been replaced: only the end of
        // the job shown counts.
        connect(newJob, &QThread::finished, this, [this, newJob] {
            if (newJob == job)
                onEnded();
        });
        connect(stopCommand.own, &QAction::triggered, newJob, &FifJob::stop);
        // The view does not own its job; one deleted under it must not be
        // reached through a stale pointer.
        connect(newJob, &QObject::destroyed, this, [this, newJob] {
            if (newJob != job)
                return;
            // Its model, and with it the row connections, goes with it.
            leaveSearching();
            job = nullptr;
            disconnect(clearAction, &QAction::triggered, this, &FifHitsView::removeAllRows);
        });
        connect(clearAction, &QAction::triggered, this, &FifHitsView::removeAllRows,
                Qt::UniqueConnection);
    } else {
        disconnect(clearAction, &QAction::triggered, this, &FifHitsView::removeAllRows);
    }

    job = newJob;
    // setModel() leaves the old selection model to its owner, the tree view.
    QItemSelectionModel* oldSelection = treeView->selectionModel();
    treeView->setModel(job ? job->getHitsModel() : nullptr);
    if (oldSelection && oldSelection != treeView->selectionModel())
        delete oldSelection;
}

FifJob* FifHitsView::getJob() const
{
    return job;
}

QToolBar* FifHitsView::getToolBar() const
{
    return toolBar;
}

QLabel* FifHitsView::getStatusLabel() const
{
    return statusLabel;
}

void FifHitsView::linkNextAction(QAction* action)
{
    nextCommand.link(action);
}

void FifHitsView::linkPreviousAction(QAction* action)
{
    previousCommand.link(action);
}

void FifHitsView::linkStopAction(QAction* action)
{
    stopCommand.link(action);
}

void FifHitsView::unlinkActions()
{
    nextCommand.link(nullptr);
    previousCommand.link(nullptr);
    stopCommand.link(nullptr);
}

void FifHitsView::SharedCommand::link(QAction* action)
{
    if (linked.data() == action)
        return;
    if (linked)
        disconnect(linked.data(), &QAction::triggered, own, &QAction::triggered);
    linked = action;
    // A relay from signal to signal: the shared action acts through the
    // view's own one, whatever the latter's enabled state.
    if (action)
        connect(action, &QAction::triggered, own, &QAction::triggered);
}

void FifHitsView::SharedCommand::setEnabled(bool enabled)
{
    own->setEnabled(enabled);
    if (linked)
        linked->setEnabled(enabled);
}

void FifHitsView::next()
{
    nextOrPrevious(true);
}

void FifHitsView::previous()
{
    nextOrPrevious(false);
}

void FifHitsView::setIconSize(const QSize& iconSize)
{
    toolBar->setIconSize(iconSize);
    chaseWidget->setMinimumSize(chaseWidget->sizeHint());
}

void FifHitsView::onFifAction()
{
    if (!job)
        return;
    ApplicationBase* application = ApplicationBase::getInstance();
    Settings* settings = application ? application->getSettings() : nullptr;

    FifDialog dialog(settings, this);
    dialog.setJob(job);
    FifManager* manager = job->getManager();
    const QStringList filters = manager ? manager->getFilters() : QStringList();
    dialog.setFilters(filters);

    FifInput request = job->getInput();
    if (!request.isValid()) {
        request = FifInput(filters.isEmpty() ? QString() : filters.constFirst());
        request.setContents(settings);
    }
    dialog.setInput(request);
    dialog.exec();
}

void FifHitsView::onAboutToStart()
{
    if (!job)
        return;
    chaseWidget->setAnimated(true);
    chaseWidgetAction->setVisible(true);
    statusLabel->clear();
    stopCommand.setEnabled(true);
    followRows(true);
    show();
    if (auto* dock = qobject_cast<QDockWidget*>(parentWidget())) {
        dock->show();
        dock->raise();
        statusLabel->setText(tr("Searching..."));
    }
}

void FifHitsView::onEnded()
{
    if (!job)
        return;
    statusLabel->setText(job->getResultText());
    chaseWidget->setAnimated(false);
    chaseWidgetAction->setVisible(false);
    stopCommand.setEnabled(false);
    updateActions();
    followRows(false);
}

void FifHitsView::onSearching(const QString& file)
{
    if (!job)
        return;
    statusLabel->setText(tr("Searching %1").arg(file));
}

void FifHitsView::updateActions()
{
    if (!job)
        return;
    if (FifHitsModel* model = job->getHitsModel()) {
        // A view hidden behind another dock must not take the shared commands.
        const bool enabled = model->rowCount(QModelIndex()) > 0 && isVisible();
        nextCommand.setEnabled(enabled);
        previousCommand.setEnabled(enabled);
        showCurrentAction->setEnabled(enabled);
        saveAction->setEnabled(enabled);
        clearAction->setEnabled(enabled);
    }
    stopCommand.setEnabled(job->isRunning());
}

void FifHitsView::showCurrentIndex()
{
    QAbstractItemModel* model = treeView->model();
    QItemSelectionModel* selection = treeView->selectionModel();
    if (!model || !selection || model->rowCount(QModelIndex()) <= 0)
        return;
    QModelIndex current = treeView->currentIndex();
    if (!current.isValid()) {
        const QModelIndex first = model->index(0, 0, QModelIndex());
        if (first.isValid()) {
            selection->select(first, QItemSelectionModel::ClearAndSelect);
            treeView->setCurrentIndex(first);
        }
        current = treeView->currentIndex();
    }
    if (current.isValid())
        emit showHit(hitOf(current));
}

void FifHitsView::showIndex(const QModelIndex& mi) const
{
    if (mi.isValid())
        emit const_cast<FifHitsView*>(this)->showHit(hitOf(mi));
}

void FifHitsView::saveAs() const
{
    QAbstractItemModel* model = treeView->model();
    if (!model)
        return;
    ImExportDialog::exportDialog(*model, QString(), ImExportDialog::TextFormat, nullptr,
                                 QString(), nullptr);
}

void FifHitsView::removeAllRows()
{
    auto* model = qobject_cast<FifHitsModel*>(treeView->model());
    if (!model)
        return;
    const int rows = model->rowCount(QModelIndex());
    if (rows <= 0)
        return;
    model->removeRows(0, rows, QModelIndex());
    statusLabel->clear();
    updateActions();
}

void FifHitsView::contextMenuEvent(QContextMenuEvent* event)
{
    QMenu menu(this);
    menu.addAction(showCurrentAction);
    menu.setDefaultAction(showCurrentAction);
    menu.addAction(nextCommand.own);
    menu.addAction(previousCommand.own);
    menu.addSeparator();
    menu.addAction(stopCommand.own);
    menu.addAction(saveAction);
    menu.addAction(findInFilesAction);
    menu.addAction(clearAction);
    menu.exec(event->globalPos());
}

void FifHitsView::nextOrPrevious(bool forward)
{
    QAbstractItemModel* model = treeView->model();
    QItemSelectionModel* selection = treeView->selectionModel();
    if (!model || !selection)
        return;
    int rows = model->rowCount(QModelIndex());
    if (rows <= 0)
        return;

    int target = forward ? 0 : rows - 1;
    // The tree view makes its first row current, unselected, when it takes
    // the focus; only a row the user or a step has chosen counts, so the
    // first step still lands on the first (or last) hit.
    const QModelIndex current = treeView->currentIndex();
    if (current.isValid() && selection->isSelected(current)) {
        target = current.row() + (forward ? 1 : -1);
        if (target > rows - 1) {
            if (!confirmWrap(tr("Reach bottom"), tr("Reach bottom, continued from top?")))
                return;
            target = 0;
        } else if (target < 0) {
            rows = model->rowCount(QModelIndex());
            if (!confirmWrap(tr("Reach top"), tr("Reach top, continued from bottom?")))
                return;
            target = rows - 1;
        }
    }
    selectAndShow(model->index(target, 0, QModelIndex()));
}

bool FifHitsView::confirmWrap(const QString& title, const QString& text)
{
    QAbstractItemModel* model = treeView->model();
    QItemSelectionModel* selection = treeView->selectionModel();
    QPointer<FifHitsView> self(this);
    // The prompt lives on the heap: the view may be deleted while the prompt's
    // own event loop runs, taking its child prompt with it.
    QPointer<QMessageBox> box =
        new QMessageBox(QMessageBox::Question, title, text, QMessageBox::NoButton, this,
                        Qt::Dialog | Qt::MSWindowsFixedSizeDialogHint);
    box->setStandardButtons(QMessageBox::Yes | QMessageBox::No);
    const int answer = box->exec();
    delete box.data();
    if (!self)
        return false;
    // A job replaced meanwhile leaves nothing to step in.
    if (treeView->model() != model || treeView->selectionModel() != selection)
        return false;
    return answer != QMessageBox::No;
}

void FifHitsView::selectAndShow(const QModelIndex& index)
{
    // The model may have shrunk while a prompt was open.
    if (!index.isValid())
        return;
    treeView->selectionModel()->select(index, QItemSelectionModel::ClearAndSelect);
    treeView->setCurrentIndex(index);
    emit showHit(hitOf(index));
}

void FifHitsView::leaveSearching()
{
    if (!chaseWidgetAction->isVisible())
        return;
    chaseWidget->setAnimated(false);
    chaseWidgetAction->setVisible(false);
    stopCommand.setEnabled(false);
}

void FifHitsView::followRows(bool follow)
{
    if (!job)
        return;
    FifHitsModel* model = job->getHitsModel();
    if (follow) {
        connect(model, &QAbstractItemModel::rowsInserted, this, &FifHitsView::updateActions,
                Qt::UniqueConnection);
        connect(model, &QAbstractItemModel::rowsRemoved, this, &FifHitsView::updateActions,
                Qt::UniqueConnection);
    } else {
        disconnect(model, &QAbstractItemModel::rowsInserted, this, &FifHitsView::updateActions);
        disconnect(model, &QAbstractItemModel::rowsRemoved, this, &FifHitsView::updateActions);
    }
}

} // namespace Orba
} // namespace Gui
