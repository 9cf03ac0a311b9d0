#pragma once

#include "orba_host_export.h"

#include <QList>
#include <QObject>
#include <QPointer>

class QAction;

namespace Gui {
namespace Orba {

// Carries out a command for the actions registered with it, and keeps their
// enabled state current when the host refreshes command states.
class ORBA_HOST_EXPORT ActionHandler : public QObject
{
    Q_OBJECT

public:
    explicit ActionHandler(QObject* parent = nullptr);
    ~ActionHandler() override;

    // Triggering `action` calls doAction(); a destroyed action is forgotten.
    virtual void addAction(QAction* action);
    virtual void removeAction(QAction* action);
    virtual void updateAction(QAction* action);
    virtual bool doAction();

    QList<QAction*> getActions() const;
    // updateAction() for every registered action.
    void updateActions();

protected slots:
    virtual void onDestroyed(QObject* object);

private slots:
    void onTriggered();

private:
    // Guarded, so that an action is never touched once it is gone.
    QList<QPointer<QAction>> actions;
};

} // namespace Orba
} // namespace Gui
