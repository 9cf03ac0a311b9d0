// How long a stop takes while a pattern that QRegExp matches in time
// quadratic in the line's length works on one long line.
//
//   fif_stop_bench [--length N]
//
// For each pattern a line of N characters (default 200,000) is written to a
// temporary folder and searched; 200 ms after the file is opened a stop is
// asked for. Prints how long the search went on after the stop, or how long
// it took when it ended by itself first.

#include "FifJob.h"
#include "FifManager.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QFile>
#include <QTemporaryDir>
#include <QTimer>

#include <cstdio>

using namespace Gui::Orba;

int main(int argc, char** argv)
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    const int length = args.size() == 3 && args.at(1) == QLatin1String("--length") ? args.at(2).toInt() : 200000;
    const QByteArray as(qMax(length, 1), 'a');
    const struct { const char* pattern; QByteArray line; } cases[] = {
        {"(a*)*b", as}, {"(a|aa)*b", as + "cb"}, {".*x", as}};

    FifManager manager;
    FifJob* job = manager.getJob(0);
    for (const auto& c : cases) {
        QTemporaryDir dir;
        QFile file(dir.filePath(QStringLiteral("line.txt")));
        if (!dir.isValid() || !file.open(QIODevice::WriteOnly) || file.write(c.line + '\n') != c.line.size() + 1)
            return 1;
        file.close();
        FifInput request;
        request.what = QString::fromLatin1(c.pattern);
        request.where = dir.path();
        request.matchType = QRegExp::RegExp2;

        QEventLoop loop;
        QElapsedTimer total, sinceStop;
        QObject::connect(job, &QThread::finished, &loop, &QEventLoop::quit, Qt::QueuedConnection);
        QObject::connect(job, &FifJob::searching, &loop, [&] {
            QTimer::singleShot(200, &loop, [&] {
                sinceStop.start();
                job->stop();
            });
        });
        total.start();
        if (!job->start(request))
            return 1;
        loop.exec();
        if (sinceStop.isValid())
            std::printf("%-10s %d chars: stop took %lld ms\n", c.pattern, length, sinceStop.elapsed());
        else
            std::printf("%-10s %d chars: ended by itself after %lld ms\n", c.pattern, length, total.elapsed());
        job->wait();
    }
    return 0;
}
