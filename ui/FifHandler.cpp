#include "FifHandler.h"

#include "ApplicationBase.h"
#include "FifDialog.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "MainWindow.h"

#include <QAction>

namespace Gui {
namespace Orba {

FifHandler::FifHandler(QObject* parent)
    : ActionHandler(parent)
{
    setObjectName(Name());
}

FifHandler::~FifHandler() = default;

QString FifHandler::Name()
{
    return FifAction::Name();
}

void FifHandler::updateAction(QAction* action)
{
    if (!action)
        return;
    MainWindow* mainWindow = MainWindow::getInstance(nullptr);
    const bool enable = mainWindow
        && mainWindow->findChild<FifResultsDockWidget*>(FifResultsDockWidget::Results1ObjectName());
    if (action->isEnabled() != enable)
        action->setEnabled(enable);
}

bool FifHandler::doAction()
{
    ApplicationBase* application = ApplicationBase::getInstance();
    Settings* settings = application ? application->getSettings() : nullptr;
    MainWindow* mainWindow = MainWindow::getInstance(nullptr);

    FifDialog dialog(settings, mainWindow);
    FifManager* manager = FifManager::getInstance(mainWindow);
    dialog.setJob(manager->getJob(0));
    const QStringList filters = manager->getFilters();
    dialog.setFilters(filters);

    FifInput request(filters.isEmpty() ? QString() : filters.first());
    request.setContents(settings);
    emit getInput(request);

    dialog.setInput(request);
    dialog.exec();
    return true;
}

} // namespace Orba
} // namespace Gui
