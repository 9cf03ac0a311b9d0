#pragma once

#include "fif_export.h"

#include <QPixmap>
#include <QWidget>

namespace Gui {
namespace Orba {

// A small busy indicator: a ring of nine dots whose grey shades turn while
// work is going on and which stands still in the palette's colours otherwise.
// It can show a fixed picture instead of the dots.
class FIF_EXPORT ChaseWidget : public QWidget
{
    Q_OBJECT

public:
    explicit ChaseWidget(QWidget* parent = nullptr, QPixmap pixmap = QPixmap(),
                         bool pixmapEnabled = false);
    ~ChaseWidget() override;

    // Starting again while running keeps the phase and the timer.
    void setAnimated(bool animated);
    // Takes effect at the next repaint; no repaint is requested.
    void setPixmapEnabled(bool enabled);

    QSize sizeHint() const override;

protected:
    void timerEvent(QTimerEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    int segmentCount() const;
    QColor colorForSegment(int seg) const;

    int segment = 0;       // timer ticks since the animation started
    int delay = 100;       // milliseconds between ticks
    int step = 40;         // degrees between two dots
    int timerId = -1;
    bool animated = false;
    QPixmap pixmap;
    bool pixmapEnabled;
};

} // namespace Orba
} // namespace Gui
