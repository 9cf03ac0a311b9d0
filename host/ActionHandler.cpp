#include "ActionHandler.h"

#include <QAction>

namespace Gui {
namespace Orba {

ActionHandler::ActionHandler(QObject* parent)
    : QObject(parent)
{
}

ActionHandler::~ActionHandler() = default;

void ActionHandler::addAction(QAction* action)
{
    if (!action || getActions().contains(action))
        return;
    actions.append(action);
    connect(action, &QAction::triggered, this, &ActionHandler::onTriggered);
    connect(action, &QObject::destroyed, this, &ActionHandler::onDestroyed);
}

void ActionHandler::removeAction(QAction* action)
{
    if (!action || !actions.removeAll(action))
        return;
    disconnect(action, nullptr, this, nullptr);
}

void ActionHandler::updateAction(QAction* /*action*/)
{
}

bool ActionHandler::doAction()
{
    return false;
}

QList<QAction*> ActionHandler::getActions() const
{
    QList<QAction*> list;
    for (const QPointer<QAction>& action : actions) {
        if (action)
            list.append(action);
    }
    return list;
}

void ActionHandler::updateActions()
{
    // updateAction() may add, remove or delete actions.
    const QList<QAction*> current = getActions();
    for (QAction* action : current) {
        if (actions.contains(action))
            updateAction(action);
    }
}

void ActionHandler::onDestroyed(QObject* /*object*/)
{
    // The object is no longer an action here, so it is not cast back to one;
    // its guard already reads null.
    actions.removeAll(QPointer<QAction>());
}

void ActionHandler::onTriggered()
{
    doAction();
}

} // namespace Orba
} // namespace Gui
