#include "ChaseWidget.h"

#include <QApplication>
#include <QPainter>
#include <QTimerEvent>

namespace Gui {
namespace Orba {

ChaseWidget::ChaseWidget(QWidget* parent, QPixmap pixmap, bool pixmapEnabled)
    : QWidget(parent, Qt::WindowFlags())
    , pixmap(pixmap)
    , pixmapEnabled(pixmapEnabled)
{
}

ChaseWidget::~ChaseWidget() = default;

void ChaseWidget::setAnimated(bool value)
{
    if (animated == value)
        return;
    animated = value;
    if (timerId != -1) {
        killTimer(timerId);
        timerId = -1;
    }
    if (animated) {
        segment = 0;
        timerId = startTimer(delay);
    }
    update();
}

void ChaseWidget::setPixmapEnabled(bool enabled)
{
    pixmapEnabled = enabled;
}

QSize ChaseWidget::sizeHint() const
{
    return QSize(32, 32);
}

void ChaseWidget::timerEvent(QTimerEvent* event)
{
    if (event->timerId() == timerId) {
        ++segment;
        update();
    }
    QWidget::timerEvent(event);
}

void ChaseWidget::paintEvent(QPaintEvent* /*event*/)
{
    QPainter p(this);
    if (pixmapEnabled && !pixmap.isNull()) {
        p.drawPixmap(0, 0, pixmap);
        return;
    }

    const int extent = qMin(width() - 8, height() - 8);
    const int displ = extent / 4;
    const int ext = displ - 1;

    p.setRenderHint(QPainter::Antialiasing, true);
    if (animated)
        p.setPen(Qt::gray);
    else
        p.setPen(QPen(palette().dark().color()));

    p.translate(width() / 2, height() / 2);
    // A right-to-left user reads the ring, and its motion, mirrored.
    const int turn = QApplication::isRightToLeft() ? step : -step;
    for (int i = 0; i < segmentCount(); ++i) {
        p.rotate(turn);
        if (animated)
            p.setBrush(QBrush(colorForSegment(i), Qt::SolidPattern));
        else
            p.setBrush(palette().window());
        p.drawEllipse(QRect(displ, -ext / 2, ext, ext));
    }
}

int ChaseWidget::segmentCount() const
{
    return 360 / step;
}

QColor ChaseWidget::colorForSegment(int seg) const
{
    const int n = segmentCount();
    const int index = (segment + seg) % n;
    int value = 255 - index * (255 / n);
    if (value < 1)
        value = 0;
    return QColor(value, value, value, 255);
}

} // namespace Orba
} // namespace Gui
