#pragma once

#include "fif_export.h"
#include "FifHit.h"

#include <QAbstractListModel>
#include <QAtomicInt>
#include <QReadWriteLock>

namespace Gui {
namespace Orba {

// The hits of one job, one row per hit. Rows are changed in the GUI thread
// only; the search thread reads the row count, hence the lock.
class FIF_EXPORT FifHitsModel : public QAbstractListModel
{
    Q_OBJECT

public:
    explicit FifHitsModel(QObject* parent);
    ~FifHitsModel() override;

    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    // The same indexes as the base class gives, without a lock per call.
    QModelIndex index(int row, int column = 0,
                      const QModelIndex& parent = QModelIndex()) const override;
    // Display: "file (line): text"; tool and status tip: the line's text;
    // Qt::UserRole: the FifHit itself.
    QVariant data(const QModelIndex& index, int role) const override;
    // Writes the FifHit held by `value` (Qt::EditRole only).
    bool setData(const QModelIndex& index, const QVariant& value, int role) override;
    // Horizontal: the description of the search shown, or "No Search Results".
    QVariant headerData(int section, Qt::Orientation orientation,
                        int role = Qt::DisplayRole) const override;
    // Inserts placeholder (invalid) hits.
    bool insertRows(int row, int count, const QModelIndex& parent = QModelIndex()) override;
    bool removeRows(int row, int count, const QModelIndex& parent = QModelIndex()) override;

    // The hit of an existing row, for the GUI thread, which alone changes
    // the rows and so reads them without the lock; the reference lasts until
    // the rows change. A reader of many rows is spared a QVariant and a
    // copy of the hit per row.
    const FifHit& at(int row) const { return hits.at(row); }

private:
    friend class FifJob;
    // Appends the valid hits of `batch` in its order, announced to views as
    // one insertion of rows that already hold their hits, then a
    // dataChanged for each row.
    void appendValidHits(const FifHitList& batch, int validCount);

    QList<FifHit> hits;
    mutable QReadWriteLock lock;
    // The size of `hits`, written under the write lock. A view laying out a
    // million rows asks for each row's index; reading this instead of taking
    // the lock each time keeps that pass short.
    QAtomicInt rowsKept;
};

} // namespace Orba
} // namespace Gui
