#include "DockWidget.h"

namespace Gui {
namespace Orba {

DockWidget::DockWidget(const QString& title, QWidget* parent, const char* name,
                       Qt::WindowFlags flags)
    : QDockWidget(title, parent, flags)
{
    if (name)
        setObjectName(QString::fromUtf8(name));
}

DockWidget::~DockWidget() = default;

void DockWidget::updateActions(bool /*enable*/)
{
}

void DockWidget::paintEvent(QPaintEvent* event)
{
    QDockWidget::paintEvent(event);
}

} // namespace Orba
} // namespace Gui
