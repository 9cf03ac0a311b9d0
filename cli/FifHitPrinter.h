#pragma once

#include <QObject>
#include <QTimer>

#include <cstdio>

class QAbstractItemModel;
class QModelIndex;

namespace Gui {
namespace Orba {

// Writes the hits of a hits model to a stream, one "file (line): text" line
// per row, in row order, as soon as each row holds its hit.
class FifHitPrinter : public QObject
{
    Q_OBJECT

public:
    FifHitPrinter(QAbstractItemModel* model, FILE* stream, QObject* parent = nullptr);

    // Errors other than a closed reader; 0 when there were none.
    int getWriteError() const;

signals:
    // Writing failed; nothing more is written.
    void outputFailed();

private:
    void printReadyRows();
    void checkReader();
    void writeFailed(int error);

    QAbstractItemModel* model;
    FILE* stream;
    int nextRow = 0;
    bool failed = false;
    int writeError = 0;
    QTimer readerCheck;
};

} // namespace Orba
} // namespace Gui
