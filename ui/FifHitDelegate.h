#pragma once

#include "fif_export.h"

#include <QStyledItemDelegate>

namespace Gui {
namespace Orba {

class FifHit;

// Paints a result row as the style would, with the characters of the hit's
// first match in the palette's highlight colours (swapped in a selected row,
// whose background already is the highlight). The row's text is the model's
// as it is; only the rows shown are painted, and nothing is matched again:
// the hit tells where its match is.
class FIF_EXPORT FifHitDelegate : public QStyledItemDelegate
{
    Q_OBJECT

public:
    explicit FifHitDelegate(QObject* parent = nullptr);

    // The match within the row's display text "file (line): text": where it
    // starts and how many characters it spans; {-1, 0} when there is none to show.
    struct Range
    {
        int start = -1;
        int length = 0;
    };
    static Range matchRange(const QModelIndex& index);
    static Range matchRange(const QString& displayText, const FifHit& hit);

    void paint(QPainter* painter, const QStyleOptionViewItem& option,
               const QModelIndex& index) const override;
};

} // namespace Orba
} // namespace Gui
