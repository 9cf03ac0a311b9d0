#include "FifHitPrinter.h"

#include "FifHit.h"
#include "FifHitsModel.h"

#include <QDir>

#include <cerrno>

#include <poll.h>
#include <sys/stat.h>

namespace Gui {
namespace Orba {

FifHitPrinter::FifHitPrinter(FifHitsModel* hitsModel, FILE* output, const FifGrepColors& lineColors,
                             QObject* parent)
    : QObject(parent)
    , model(hitsModel)
    , stream(output)
    , colors(lineColors)
{
    connect(model, &QAbstractItemModel::rowsInserted, this, [this] { printReadyRows(); });
    // A new search empties the model; its rows start again at 0.
    connect(model, &QAbstractItemModel::modelReset, this, [this] { nextRow = 0; });
    connect(model, &QAbstractItemModel::rowsRemoved, this,
            [this](const QModelIndex&, int first, int last) {
                nextRow -= qMax(0, qMin(last + 1, nextRow) - first);
            });

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

int FifHitPrinter::getDroppedRows() const
{
    return droppedRows;
}

void FifHitPrinter::printReadyRows()
{
    if (failed)
        return;
    const int rows = model->rowCount();
    output.resize(0);
    output.reserve(64 * 1024);
    for (; nextRow < rows; ++nextRow)
        append(model->at(nextRow));
    if (output.isEmpty())
        return;
    // One write and a flush a batch keep the output prompt without a
    // flush per line.
    if (std::fwrite(output.constData(), 1, size_t(output.size()), stream) != size_t(output.size())
        || std::fflush(stream) != 0) {
        writeFailed(errno);
        return;
    }
    // Not from inside the insertion: the model still tells of the new rows.
    if (rows > keptRows && !dropPending) {
        dropPending = true;
        QMetaObject::invokeMethod(this, &FifHitPrinter::dropPrintedRows, Qt::QueuedConnection);
    }
}

void FifHitPrinter::append(const FifHit& hit)
{
    // As FifHit::toString() has it: "file (line): text", in UTF-8.
    if (hit.file != lastFile) {
        lastFile = hit.file;
        fileName = QDir::toNativeSeparators(lastFile).toUtf8();
    }
    colors.append(output, FifGrepColors::FileName, fileName);
    colors.append(output, FifGrepColors::Separator, " (", 2);
    // As QString::number() writes it.
    char number[12];
    char* digits = number + sizeof number;
    unsigned magnitude = hit.line < 0 ? 0u - unsigned(hit.line) : unsigned(hit.line);
    do {
        *--digits = char('0' + magnitude % 10);
        magnitude /= 10;
    } while (magnitude);
    if (hit.line < 0)
        *--digits = '-';
    colors.append(output, FifGrepColors::LineNumber, digits, number + sizeof number - digits);
    colors.append(output, FifGrepColors::Separator, "): ", 3);
    const QStringView text(hit.text);
    if (colors.isEnabled() && hit.hasMatchRange()) {
        appendText(text.left(hit.column));
        colors.append(output, FifGrepColors::Match, text.mid(hit.column, hit.length).toUtf8());
        appendText(text.mid(hit.column + hit.length));
    } else {
        appendText(text);
    }
    FifGrepColors::appendPlain(output, "\n", 1);
}

void FifHitPrinter::appendText(QStringView text)
{
    if (!QtPrivate::isAscii(text)) {
        output += text.toUtf8();
        return;
    }
    // Most lines are ASCII: their bytes are their characters.
    const qsizetype at = output.size();
    output.resize(at + text.size());
    char* out = output.data() + at;
    const char16_t* in = text.utf16();
    for (qsizetype i = 0; i < text.size(); ++i)
        out[i] = char(in[i]);
}

void FifHitPrinter::dropPrintedRows()
{
    dropPending = false;
    const int drop = qMin(nextRow, model->rowCount() - keptRows);
    if (drop <= 0 || failed)
        return;
    model->removeRows(0, drop);
    droppedRows += drop;
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
