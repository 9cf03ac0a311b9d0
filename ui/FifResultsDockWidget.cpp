#include "FifResultsDockWidget.h"

#include "FifActionMapper.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "MainWindow.h"

#include <QDebug>

namespace Gui {
namespace Orba {

FifResultsDockWidget::FifResultsDockWidget(MainWindow* mainWindow)
    : DockWidget(tr("Find in Files Results"), mainWindow, "FifResultsDockWidget")
{
    if (!mainWindow) {
        // Nothing to dock in and no manager to ask for a job: an empty view.
        setWidget(new FifHitsView(nullptr, this));
        return;
    }

    QString name = Results1ObjectName();
    if (mainWindow->findChild<FifResultsDockWidget*>(name)) {
        name = Results2ObjectName();
        if (mainWindow->findChild<FifResultsDockWidget*>(name))
            qDebug("Internal Error: Not support two Find-In-File Results");
    }
    setObjectName(name);

    auto* view = new FifHitsView(FifManager::getInstance(mainWindow)->getJob(0), this);
    connect(mainWindow, &QMainWindow::iconSizeChanged, view, &FifHitsView::setIconSize);
    setWidget(view);
    mainWindow->addDockWidget(Qt::BottomDockWidgetArea, this);
}

FifResultsDockWidget::~FifResultsDockWidget() = default;

QString FifResultsDockWidget::Results1ObjectName()
{
    return QStringLiteral("FifResults1DockWidget");
}

QString FifResultsDockWidget::Results2ObjectName()
{
    return QStringLiteral("FifResults2DockWidget");
}

void FifResultsDockWidget::linkSharedActions(QAction* next, QAction* previous, QAction* stop)
{
    auto* mainWindow = qobject_cast<MainWindow*>(parent());
    if (!mainWindow)
        return;
    FifActionMapper* mapper = FifManager::getInstance(mainWindow)->getActionMapper();
    if (next)
        mapper->setNextAction(next);
    if (previous)
        mapper->setPreviousAction(previous);
    if (stop)
        mapper->setStopAction(stop);
    mapper->addDockWidget(this);
}

} // namespace Orba
} // namespace Gui
