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
    if (!action || actions.contains(action))
        return;
    actions.append(action);
    connect(action, &QAction::triggered, this, &ActionHandler::onTriggered);
    connect(action, &QObject::destroyed, this, &ActionHandler::onDestroyed);
}

void ActionHandler::removeAction(QAction* action)
{
    if (!actions.removeAll(action))
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
    return actions;
}

void ActionHandler::updateActions()
{
    const QList<QAction*> current = actions;
    for (QAction* action : current)
        updateAction(action);
}

void ActionHandler::onDestroyed(QObject* object)
{
    actions.removeAll(static_cast<QAction*>(object));
}

void ActionHandler::onTriggered()
{
    doAction();
}

} // namespace Orba
} // namespace Gui
