#pragma once

#include "FifGrepColors.h"

#include <QByteArray>
#include <QObject>
#include <QString>
#include <QTimer>

#include <cstdio>

namespace Gui {
namespace Orba {

class FifHit;
class FifHitsModel;

// Writes the hits of a hits model to a stream, one "file (line): text" line
// per row, in row order, as rows arrive (the job inserts them holding their
// hits), and then drops the rows it has written, so that memory stays
// bounded by a batch however many hits a search finds.
class FifHitPrinter : public QObject
{
    Q_OBJECT

public:
    // The worker sends its hits in batches that grow with the rows the
    // model holds, up to 101 rows from 50 on: that many written rows stay.
    static constexpr int keptRows = 50;

    FifHitPrinter(FifHitsModel* model, FILE* stream, const FifGrepColors& colors = {},
                  QObject* parent = nullptr);

    // Errors other than a closed reader; 0 when there were none.
    int getWriteError() const;
    // The rows written and then removed from the model.
    int getDroppedRows() const;

signals:
    // Writing failed; nothing more is written.
    void outputFailed();

private:
    void printReadyRows();
    void append(const FifHit& hit);
    // The UTF-8 of `text`, as QString::toUtf8() gives it.
    void appendText(QStringView text);
    void dropPrintedRows();
    void checkReader();
    void writeFailed(int error);

    FifHitsModel* model;
    FILE* stream;
    FifGrepColors colors;
    int nextRow = 0;
    int droppedRows = 0;
    bool dropPending = false;
    bool failed = false;
    int writeError = 0;
    QTimer readerCheck;
    QByteArray output;       // the lines of one batch, written at once
    QString lastFile;        // the hits of a file come together:
    QByteArray fileName;     // its name is encoded once
};

} // namespace Orba
} // namespace Gui
