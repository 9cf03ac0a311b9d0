#pragma once

#include "orba_host_export.h"

#include <QDockWidget>

namespace Gui {
namespace Orba {

class ORBA_HOST_EXPORT DockWidget : public QDockWidget
{
    Q_OBJECT

public:
    DockWidget(const QString& title, QWidget* parent, const char* name,
               Qt::WindowFlags flags = Qt::WindowFlags());
    ~DockWidget() override;

    // Called by the host when command states are refreshed.
    virtual void updateActions(bool enable);

protected:
    void paintEvent(QPaintEvent* event) override;
};

} // namespace Orba
} // namespace Gui
