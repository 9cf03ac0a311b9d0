#pragma once

#include "orba_host_export.h"

#include <QMainWindow>

namespace Gui {
namespace Orba {

class ORBA_HOST_EXPORT MainWindow : public QMainWindow
{
    Q_OBJECT

public:
    explicit MainWindow(QWidget* parent = nullptr);
    ~MainWindow() override;

    // The main window that holds `widget`. With no widget: the active main
    // window, else the most recently created one still alive, else null.
    static MainWindow* getInstance(const QWidget* widget = nullptr);
};

} // namespace Orba
} // namespace Gui
