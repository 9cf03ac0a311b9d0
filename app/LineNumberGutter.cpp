#include "LineNumberGutter.h"

#include "FileViewer.h"

#include <QPaintEvent>
#include <QPainter>
#include <QTextBlock>

namespace {
// Space left and right of the numbers, in pixels.
constexpr int padding = 6;
}

LineNumberGutter::LineNumberGutter(FileViewer* viewer)
    : QWidget(viewer)
    , viewer(viewer)
{
    setObjectName(QStringLiteral("lineNumbers"));
}

QSize LineNumberGutter::sizeHint() const
{
    const int digits = int(QString::number(qMax(1, viewer->blockCount())).size());
    return QSize(2 * padding + digits * viewer->fontMetrics().horizontalAdvance(QLatin1Char('9')),
                 0);
}

void LineNumberGutter::follow(const QRect& rect, int dy)
{
    if (dy)
        scroll(0, dy);
    else
        update(0, rect.y(), width(), rect.height());
}

void LineNumberGutter::paintEvent(QPaintEvent* event)
{
    QPainter painter(this);
    painter.fillRect(event->rect(), palette().color(QPalette::Window));
    QFont font = viewer->font();
    const int marked = viewer->getMarkedLine();
    // The viewer scrolls by whole lines: the block at its top is the first in view.
    for (QTextBlock block = viewer->cursorForPosition(QPoint(0, 0)).block(); block.isValid();
         block = block.next()) {
        const QRect line = viewer->cursorRect(QTextCursor(block));
        if (line.top() > event->rect().bottom())
            break;
        const int number = block.blockNumber() + 1;
        font.setBold(number == marked);
        painter.setFont(font);
        painter.setPen(palette().color(number == marked ? QPalette::WindowText
                                                        : QPalette::PlaceholderText));
        painter.drawText(QRect(0, line.top(), width() - padding, line.height()),
                         Qt::AlignRight | Qt::AlignVCenter, QString::number(number));
    }
}
