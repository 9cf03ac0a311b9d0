// fif: searches files as the Find in Files dialog does and prints the hits.
//
// It runs the very path of the GUI: a job with its worker thread, whose hits
// reach the job's model through queued signals on this event loop; the hits
// are printed from the model in row order as they arrive.

#include "FifCommandLine.h"
#include "FifHitPrinter.h"
#include "FifHitsModel.h"
#include "FifInput.h"
#include "FifJob.h"
#include "FifManager.h"

#include <QCoreApplication>
#include <QFile>
#include <QObject>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>

#include <dirent.h>
#include <fcntl.h>
#include <unistd.h>

using namespace Gui::Orba;

namespace {

void printError(const QString& text)
{
    std::fputs(text.toLocal8Bit().constData(), stderr);
    std::fputc('\n', stderr);
    std::fflush(stderr);
}

// Why a folder named on the command line cannot be searched, as grep tells
// it; empty when it can.
QString folderProblem(const QString& folder)
{
    DIR* opened = opendir(QFile::encodeName(folder).constData());
    if (opened) {
        closedir(opened);
        return QString();
    }
    if (errno == ENOENT)
        return QCoreApplication::translate("FifCommandLine", "No such folder");
    return QString::fromLocal8Bit(std::strerror(errno));
}

bool colorsWanted(FifCommandLine::ColorMode mode)
{
    if (mode != FifCommandLine::ColorAuto)
        return mode == FifCommandLine::ColorAlways;
    // As grep decides: a terminal that is not a dumb one.
    const QByteArray terminal = qgetenv("TERM");
    return isatty(STDOUT_FILENO) && !terminal.isEmpty() && terminal != "dumb";
}


} // namespace

int main(int argc, char* argv[])
{
    // A standard descriptor that was closed before the start would be
    // handed to the next file or event descriptor Qt opens, and hits would
    // be written into it; /dev/null takes its place first.
    bool outputClosed = false;
    for (int fd = STDIN_FILENO; fd <= STDERR_FILENO; ++fd) {
        if (fcntl(fd, F_GETFD) == -1 && errno == EBADF) {
            outputClosed = outputClosed || fd == STDOUT_FILENO;
            if (open("/dev/null", fd == STDIN_FILENO ? O_RDONLY : O_WRONLY) != fd)
                return 2;
        }
    }
    if (outputClosed) {
        std::fputs("fif: standard output is closed\n", stderr);
        return 2;
    }

    // A reader that goes away (fif ... | head) shows as EPIPE on the next
    // write, which stops the search; the default would kill the process.
    std::signal(SIGPIPE, SIG_IGN);

    QCoreApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("fif"));
    QCoreApplication::setApplicationVersion(QStringLiteral(FIF_VERSION));

    FifCommandLine commandLine;
    switch (commandLine.parse(QCoreApplication::arguments())) {
    case FifCommandLine::Help:
        std::fputs(commandLine.getHelpText().toLocal8Bit().constData(), stdout);
        return 0;
    case FifCommandLine::Version:
        std::fputs(FifCommandLine::getVersionText().toLocal8Bit().constData(), stdout);
        return 0;
    case FifCommandLine::Error:
        printError(QStringLiteral("fif: ") + commandLine.getErrorText());
        printError(QCoreApplication::translate("FifCommandLine",
                                               "Try 'fif --help' for more information."));
        return 2;
    case FifCommandLine::Search:
        break;
    }

    const FifInput request = commandLine.getRequest();
    QString title;
    QString message;
    if (!request.check(&title, &message)) {
        printError(title + QStringLiteral(": ") + message);
        return 2;
    }

    // Like grep: a folder that cannot be searched is an error (status 2),
    // and the others are searched all the same.
    bool folderFailed = false;
    for (const QString& folder : commandLine.getFolders()) {
        const QString problem = folderProblem(folder);
        if (!problem.isEmpty()) {
            printError(QStringLiteral("fif: %1: %2").arg(folder, problem));
            folderFailed = true;
        }
    }

    FifManager manager;
    FifJob* job = manager.getJob(0);
    job->setThreadCount(commandLine.getThreadCount());
    const FifGrepColors colors = colorsWanted(commandLine.getColorMode())
                                     ? FifGrepColors::fromGrepColors(qgetenv("GREP_COLORS"))
                                     : FifGrepColors();
    FifHitPrinter printer(job->getHitsModel(), stdout, colors);
    QObject::connect(&printer, &FifHitPrinter::outputFailed, job, &FifJob::stop);
    QObject::connect(job, &QThread::finished, &app, [&] {
        // Hits sent before the end arrive before finished(), so every row
        // has been printed by now.
        if (printer.getWriteError() != 0) {
            printError(QStringLiteral("fif: ")
                       + QCoreApplication::translate("FifCommandLine", "Cannot write output: %1")
                             .arg(QString::fromLocal8Bit(std::strerror(printer.getWriteError()))));
            app.exit(2);
            return;
        }
        const int lines = printer.getDroppedRows() + job->getLineHitCount();
        // The job's closing line, counting the rows the printer dropped too.
        printError(FifJob::resultText(lines, job->getFileHitCount(), job->getReadFileCount()));
        app.exit(folderFailed ? 2 : lines > 0 ? 0 : 1);
    });
    job->start(request);
    return app.exec();
}
