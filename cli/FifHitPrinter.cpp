#include "FifHitPrinter.h"

#include "FifHit.h"

#include <QAbstractItemModel>

#include <cerrno>

#include <poll.h>
#include <sys/stat.h>

namespace Gui {
namespace Orba {

FifHitPrinter::FifHitPrinter(QAbstractItemModel* hitsModel, FILE* output, QObject* parent)
    : QObject(parent)
    , model(hitsModel)
    , stream(output)
{
    // A row is inserted empty and gets its hit right after, so both signals
    // may make rows ready.
    connect(model, &QAbstractItemModel::rowsInserted, this, [this] { printReadyRows(); });
    connect(model, &QAbstractItemModel::dataChanged, this, [this] { printReadyRows(); });
    // A new search empties the model; its rows start again at 0.
    connect(model, &QAbstractItemModel::modelReset, this, [this] { nextRow = 0; });
    connect(model, &QAbstractItemModel::rowsRemoved, this,
            [this] { nextRow = qMin(nextRow, model->rowCount()); });

    // A reader that leaves a pipe while no hit is being written would go
    // unnoticed until the next hit, which may be a long search away.
    struct stat info;
    if (fstat(fileno(stream), &info) == 0 && S_ISFIFO(info.st_mode)) {
        connect(&readerCheck, &QTimer::timeout, this, &FifHitPrinter::checkReader);
        readerCheck.start(100);
    }
}

int FifHitPrinter::getWriteError() const
{
    return writeError;
}

void FifHitPrinter::printReadyRows()
{
    if (failed)
        return;
    const int rows = model->rowCount();
    bool printed = false;
    while (nextRow < rows) {
        const FifHit hit = model->index(nextRow, 0).data(Qt::UserRole).value<FifHit>();
        if (!hit.isValid())
            break;
        const QByteArray line = hit.toString().toUtf8() + '\n';
        if (std::fwrite(line.constData(), 1, size_t(line.size()), stream)
            != size_t(line.size())) {
            writeFailed(errno);
            return;
        }
        printed = true;
        ++nextRow;
    }
    // A batch writes its rows one by one; flushing once its last row is out
    // keeps the output prompt without a flush per line.
    if (printed && nextRow == rows && std::fflush(stream) != 0)
        writeFailed(errno);
}

void FifHitPrinter::checkReader()
{
    pollfd descriptor = {fileno(stream), 0, 0};
    // A pipe whose read end is closed reports an error condition to the writer.
    if (poll(&descriptor, 1, 0) > 0 && (descriptor.revents & (POLLERR | POLLHUP)))
        writeFailed(EPIPE);
}

void FifHitPrinter::writeFailed(int error)
{
    readerCheck.stop();
    if (failed)
        return;
    failed = true;
    // A reader that went away is no error: the search just ends.
    if (error != EPIPE)
        writeError = error ? error : EIO;
    emit outputFailed();
}

} // namespace Orba
} // namespace Gui
