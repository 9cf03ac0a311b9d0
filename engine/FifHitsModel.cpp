#include "FifHitsModel.h"

#include "FifJob.h"
#include "FifLocker.h"

namespace Gui {
namespace Orba {

FifHitsModel::FifHitsModel(QObject* parent)
    : QAbstractListModel(parent)
{
}

FifHitsModel::~FifHitsModel()
{
    FifLocker::forget(&lock);
}

int FifHitsModel::rowCount(const QModelIndex& parent) const
{
    if (parent.isValid())
        return 0;
    FifLocker locker(&lock, FifLocker::Read);
    return int(hits.size());
}

QModelIndex FifHitsModel::index(int row, int column, const QModelIndex& parent) const
{
    if (parent.isValid() || column != 0 || row < 0 || row >= rowsKept.loadAcquire())
        return QModelIndex();
    return createIndex(row, column);
}

QVariant FifHitsModel::data(const QModelIndex& index, int role) const
{
    // Views ask for many roles per row they paint; only these take the lock.
    if (!index.isValid()
        || (role != Qt::DisplayRole && role != Qt::ToolTipRole && role != Qt::StatusTipRole
            && role != Qt::UserRole))
        return QVariant();
    FifHit hit;
    {
        FifLocker locker(&lock, FifLocker::Read);
        if (index.row() >= hits.size())
            return QVariant();
        hit = hits.at(index.row());
    }
    switch (role) {
    case Qt::DisplayRole:
        return hit.toString();
    case Qt::ToolTipRole:
    case Qt::StatusTipRole:
        return hit.text;
    case Qt::UserRole:
        return QVariant::fromValue(hit);
    default:
        return QVariant();
    }
}

bool FifHitsModel::setData(const QModelIndex& index, const QVariant& value, int role)
{
    if (!index.isValid() || role != Qt::EditRole)
        return false;
    {
        FifLocker locker(&lock, FifLocker::Write);
        if (index.row() >= hits.size())
            return false;
        hits[index.row()] = value.value<FifHit>();
    }
    emit dataChanged(index, index);
    return true;
}

QVariant FifHitsModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (role != Qt::DisplayRole)
        return QVariant();
    if (orientation == Qt::Vertical)
        return QStringLiteral("%1").arg(section);

    // The GUI thread is the only writer, so it may read without the lock.
    if (!hits.isEmpty() && hits.constFirst().job)
        return hits.constFirst().job->getInput().toString();
    return tr("No Search Results");
}

bool FifHitsModel::insertRows(int row, int count, const QModelIndex& /*parent*/)
{
    if (count < 1 || row < 0 || row > rowCount())
        return false;
    beginInsertRows(QModelIndex(), row, row + count - 1);
    {
        FifLocker locker(&lock, FifLocker::Write);
        hits.insert(row, count, FifHit());
        rowsKept.storeRelease(int(hits.size()));
    }
    endInsertRows();
    return true;
}

void FifHitsModel::appendValidHits(const FifHitList& batch, int validCount)
{
    if (validCount < 1)
        return;
    const int row = rowCount();
    beginInsertRows(QModelIndex(), row, row + validCount - 1);
    {
        FifLocker locker(&lock, FifLocker::Write);
        for (const FifHit& hit : batch) {
            if (hit.isValid())
                hits.append(hit);
        }
        rowsKept.storeRelease(int(hits.size()));
    }
    endInsertRows();
    // Receivers learn of each hit written, as when placeholder rows are
    // filled one by one; views waiting to lay out the new rows do nothing.
    for (int i = row; i < row + validCount; ++i) {
        const QModelIndex written = createIndex(i, 0);
        emit dataChanged(written, written);
    }
}

bool FifHitsModel::removeRows(int row, int count, const QModelIndex& /*parent*/)
{
    const int size = rowCount();
    if (count < 1 || row < 0 || row >= size)
        return false;
    // Views are told only of rows that exist.
    const int last = qMin(row + count, size) - 1;
    beginRemoveRows(QModelIndex(), row, last);
    {
        FifLocker locker(&lock, FifLocker::Write);
        hits.remove(row, last - row + 1);
        rowsKept.storeRelease(int(hits.size()));
    }
    endRemoveRows();
    return true;
}

} // namespace Orba
} // namespace Gui
