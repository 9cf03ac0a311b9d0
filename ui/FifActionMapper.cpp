#include "FifActionMapper.h"

#include "FifHitsModel.h"
#include "FifHitsView.h"
#include "FifJob.h"

#include <QAction>
#include <QDockWidget>

namespace Gui {
namespace Orba {

FifActionMapper::FifActionMapper(QObject* parent)
    : QObject(parent)
{
}

FifActionMapper::~FifActionMapper() = default;

void FifActionMapper::setNextAction(QAction* action)
{
    nextAction = action;
}

void FifActionMapper::setPreviousAction(QAction* action)
{
    previousAction = action;
}

void FifActionMapper::setStopAction(QAction* action)
{
    stopAction = action;
}

void FifActionMapper::addDockWidget(QDockWidget* dock)
{
    if (!dock)
        return;
    dockWidgets.append(QPointer<QDockWidget>(dock));
    connect(dock, &QDockWidget::visibilityChanged, this, &FifActionMapper::mapActions);
}

void FifActionMapper::mapActions(bool isVisible)
{
    auto* sendingDock = qobject_cast<QDockWidget*>(sender());

    if (sendingDock && dockWidgets.contains(QPointer<QDockWidget>(sendingDock))) {
        if (auto* view = qobject_cast<FifHitsView*>(sendingDock->widget())) {
            if (isVisible) {
                view->linkNextAction(nextAction);
                view->linkPreviousAction(previousAction);
                view->linkStopAction(stopAction);
            } else {
                view->unlinkActions();
            }
        }
    }

    // The sender's own visibility is taken from the signal: while it is being
    // shown or hidden, QWidget::isVisible() may still tell the old state.
    // A dock behind another in a tab group stays "visible" to Qt, moved out
    // of sight; only a dock with something on screen counts. Entries whose
    // dock has been destroyed are passed over.
    const auto countsAsVisible = [&](QDockWidget* dock) {
        if (dock == sendingDock)
            return isVisible;
        return dock->isVisible() && !dock->visibleRegion().isEmpty();
    };
    bool anyItems = false;
    bool anyRunning = false;
    for (const QPointer<QDockWidget>& entry : std::as_const(dockWidgets)) {
        QDockWidget* dock = entry.data();
        if (!dock || !countsAsVisible(dock))
            continue;
        if (!anyItems && hasItem(dock->widget()))
            anyItems = true;
        if (!anyRunning && isRunning(dock->widget()))
            anyRunning = true;
        if (anyItems && anyRunning)
            break;
    }
    if (nextAction)
        nextAction->setEnabled(anyItems);
    if (previousAction)
        previousAction->setEnabled(anyItems);
    if (stopAction)
        stopAction->setEnabled(anyRunning);
}

bool FifActionMapper::hasItem(QWidget* widget) const
{
    auto* view = qobject_cast<FifHitsView*>(widget);
    if (!view || !view->getJob())
        return false;
    const FifHitsModel* model = view->getJob()->getHitsModel();
    return model && model->rowCount(QModelIndex()) > 0;
}

bool FifActionMapper::isRunning(QWidget* widget) const
{
    auto* view = qobject_cast<FifHitsView*>(widget);
    return view && view->getJob() && view->getJob()->isRunning();
}

} // namespace Orba
} // namespace Gui
