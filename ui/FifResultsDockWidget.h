#pragma once

#include "fif_export.h"

#include "DockWidget.h"

#include <QString>

class QAction;

namespace Gui {
namespace Orba {

class MainWindow;

// A dock at the bottom of a main window holding one results view on the
// window's job 0. A window has up to two, told apart by object name.
class FIF_EXPORT FifResultsDockWidget : public DockWidget
{
    Q_OBJECT

public:
    // Docks itself in `mainWindow`, which the host always passes.
    explicit FifResultsDockWidget(MainWindow* mainWindow);
    ~FifResultsDockWidget() override;

    static QString Results1ObjectName();
    static QString Results2ObjectName();

    // Hands the host's shared actions to the window's action mapper (a null
    // argument keeps the mapper's earlier action of that kind) and registers
    // this dock with it. The view is linked at the dock's next visibility
    // change.
    void linkSharedActions(QAction* next, QAction* previous, QAction* stop);
};

} // namespace Orba
} // namespace Gui
