#pragma once

#include "fif_export.h"

#include "ActionHandler.h"
#include "FifActions.h"
#include "FifInput.h"

#include <QString>

class QAction;

namespace Gui {
namespace Orba {

// Serves the "find-in-files" command: keeps it enabled while the main window
// has its first result dock, and opens the find dialog on job 0 when it
// fires. Includes the command classes, so a host needs this header only.
class FIF_EXPORT FifHandler : public ActionHandler
{
    Q_OBJECT

public:
    explicit FifHandler(QObject* parent = nullptr);
    ~FifHandler() override;

    // The id of the command it serves, "find-in-files".
    static QString Name();

    // Enables `action` exactly while a "FifResults1DockWidget" dock exists
    // in the current main window; setEnabled is called only on a change.
    void updateAction(QAction* action) override;
    // Opens the modal find dialog on job 0 of the current main window with
    // the stored search; always true.
    bool doAction() override;

signals:
    // Emitted synchronously before the dialog is filled. Receivers connected
    // directly may change the request in place.
    void getInput(Gui::Orba::FifInput& i);
};

} // namespace Orba
} // namespace Gui
