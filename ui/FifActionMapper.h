#pragma once

#include "fif_export.h"

#include <QList>
#include <QObject>
#include <QPointer>

class QAction;
class QDockWidget;
class QWidget;

namespace Gui {
namespace Orba {

// Lends the host's shared next/previous/stop actions to the results view of
// whichever registered dock is visible, and keeps their enabled state in line
// with the visible docks. One per main window, held by its FifManager.
//
// The mapper owns neither the actions (the host's) nor the docks (the main
// window's); it keeps guarded pointers to both.
class FIF_EXPORT FifActionMapper : public QObject
{
    Q_OBJECT

public:
    explicit FifActionMapper(QObject* parent = nullptr);
    ~FifActionMapper() override;

    // Each replaces the action of its kind (null clears it). Links already
    // made stay; the new action is used from the next visibility change on.
    void setNextAction(QAction* action);
    void setPreviousAction(QAction* action);
    void setStopAction(QAction* action);

    // Registers a dock: its visibility changes drive the mapping from now on.
    void addDockWidget(QDockWidget* dock);

private slots:
    void mapActions(bool isVisible);

private:
    // A results view whose job's model has at least one row.
    bool hasItem(QWidget* widget) const;
    // A results view whose job's thread runs.
    bool isRunning(QWidget* widget) const;

    QPointer<QAction> nextAction;
    QPointer<QAction> previousAction;
    QPointer<QAction> stopAction;
    QList<QPointer<QDockWidget>> dockWidgets;
};

} // namespace Orba
} // namespace Gui
