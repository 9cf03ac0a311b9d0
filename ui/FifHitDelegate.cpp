#include "FifHitDelegate.h"

#include "FifHit.h"

#include <QApplication>
#include <QPainter>
#include <QTextLayout>

namespace Gui {
namespace Orba {

FifHitDelegate::FifHitDelegate(QObject* parent)
    : QStyledItemDelegate(parent)
{
}

FifHitDelegate::Range FifHitDelegate::matchRange(const QModelIndex& index)
{
    return matchRange(index.data(Qt::DisplayRole).toString(),
                      index.data(Qt::UserRole).value<FifHit>());
}

FifHitDelegate::Range FifHitDelegate::matchRange(const QString& displayText, const FifHit& hit)
{
    // The line's text ends the display text, whatever the file's name holds.
    if (!hit.hasMatchRange() || !displayText.endsWith(hit.text))
        return Range();
    return Range{int(displayText.size() - hit.text.size()) + hit.column, hit.length};
}

void FifHitDelegate::paint(QPainter* painter, const QStyleOptionViewItem& option,
                           const QModelIndex& index) const
{
    QStyleOptionViewItem opt = option;
    initStyleOption(&opt, index);
    const QWidget* widget = opt.widget;
    QStyle* style = widget ? widget->style() : QApplication::style();
    // Rows without a match to show are painted as the style paints them.
    Range range = opt.textElideMode == Qt::ElideRight
                      ? matchRange(opt.text, index.data(Qt::UserRole).value<FifHit>())
                      : Range();
    QRect textRect;
    QString text;
    if (range.length > 0) {
        // Within the space the style gives the text, as it lays text out.
        const int margin = style->pixelMetric(QStyle::PM_FocusFrameHMargin, nullptr, widget) + 1;
        textRect = style->subElementRect(QStyle::SE_ItemViewItemText, &opt, widget)
                       .adjusted(margin, 0, -margin, 0);
        text = opt.fontMetrics.elidedText(opt.text, Qt::ElideRight, textRect.width());
        if (text != opt.text) // the kept characters, then an ellipsis
            range.length = qMin(range.start + range.length, int(text.size()) - 1) - range.start;
    }
    if (range.length <= 0) {
        style->drawControl(QStyle::CE_ItemViewItem, &opt, painter, widget);
        return;
    }

    // The style paints the row without its text: background, selection, focus.
    opt.text.clear();
    style->drawControl(QStyle::CE_ItemViewItem, &opt, painter, widget);

    const QPalette::ColorGroup group = !(opt.state & QStyle::State_Enabled) ? QPalette::Disabled
                                       : !(opt.state & QStyle::State_Active) ? QPalette::Inactive
                                                                             : QPalette::Normal;
    const bool selected = opt.state & QStyle::State_Selected;
    const QColor highlight = opt.palette.color(group, QPalette::Highlight);
    const QColor highlightedText = opt.palette.color(group, QPalette::HighlightedText);
    QTextLayout::FormatRange match;
    match.start = range.start;
    match.length = range.length;
    match.format.setBackground(selected ? highlightedText : highlight);
    match.format.setForeground(selected ? highlight : highlightedText);

    QTextLayout layout(text, opt.font);
    QTextOption textOption(Qt::AlignLeft | Qt::AlignAbsolute);
    textOption.setWrapMode(QTextOption::NoWrap);
    textOption.setTextDirection(opt.direction);
    layout.setTextOption(textOption);
    layout.setFormats({match});
    layout.beginLayout();
    QTextLine line = layout.createLine();
    line.setLineWidth(textRect.width());
    layout.endLayout();
    const QSize size = QSizeF(line.naturalTextWidth(), line.height()).toSize();

    painter->save();
    painter->setClipRect(textRect, Qt::IntersectClip);
    painter->setPen(opt.palette.color(group, selected ? QPalette::HighlightedText : QPalette::Text));
    layout.draw(painter,
                QStyle::alignedRect(opt.direction, opt.displayAlignment, size, textRect).topLeft());
    painter->restore();
}

} // namespace Orba
} // namespace Gui
