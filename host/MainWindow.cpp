#include "MainWindow.h"

#include <QApplication>
#include <QList>

namespace Gui {
namespace Orba {

namespace {

// Live main windows in order of creation.
QList<MainWindow*>& windows()
{
    static QList<MainWindow*> list;
    return list;
}

} // namespace

MainWindow::MainWindow(QWidget* parent)
    : QMainWindow(parent)
{
    windows().append(this);
}

MainWindow::~MainWindow()
{
    windows().removeAll(this);
}

MainWindow* MainWindow::getInstance(const QWidget* widget)
{
    if (widget) {
        for (const QWidget* w = widget; w; w = w->parentWidget()) {
            if (auto* window = qobject_cast<MainWindow*>(const_cast<QWidget*>(w)))
                return window;
        }
        return nullptr;
    }
    for (QWidget* w = QApplication::activeWindow(); w; w = w->parentWidget()) {
        if (auto* window = qobject_cast<MainWindow*>(w))
            return window;
    }
    return windows().isEmpty() ? nullptr : windows().last();
}

} // namespace Orba
} // namespace Gui
