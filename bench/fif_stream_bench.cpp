// Streams a search with very many hits into a visible results view on the
// current platform (offscreen in the scripts) and reports how long the GUI
// thread was kept from its event loop at most, the total time and the peak
// memory per hit.
//
//   fif_stream_bench [--hits N] [--files F] [--tree DIR] [--no-view]
//
// The tree (F files of N / F lines, every line a hit of the wildcard "*") is
// written to DIR unless it is there already.

#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#if __has_include("FifHitsView.h")
#include "FifHitsView.h"
#define FIF_HAVE_VIEW 1
#endif

#include <QApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QTimer>
#include <QTreeView>

#include <sys/resource.h>
#include <time.h>
#include <unistd.h>

#include <cstdio>

using namespace Gui::Orba;

namespace {

long currentRssKiB()
{
    QFile statm(QStringLiteral("/proc/self/statm"));
    if (!statm.open(QIODevice::ReadOnly))
        return 0;
    const QList<QByteArray> fields = statm.readAll().split(' ');
    return fields.size() > 1 ? fields.at(1).toLong() * (sysconf(_SC_PAGESIZE) / 1024) : 0;
}

long peakRssKiB()
{
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

// CPU time of the calling thread: on a loaded machine the wall-clock gaps
// include time spent waiting for a core, this does not.
qint64 threadCpuNs()
{
    timespec ts{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &ts);
    return qint64(ts.tv_sec) * 1000000000 + ts.tv_nsec;
}

// Writes the tree; returns the number of UTF-16 code units of all lines.
qint64 writeTree(const QString& root, int files, int linesPerFile)
{
    static const char* const words[] = {"alpha", "beta", "gamma", "delta", "return", "int",
                                        "const", "QString", "value", "(x)", "{", "}", "=",
                                        "if", "else", "for", "while", "0", "42", "//"};
    quint32 seed = 12345;
    qint64 chars = 0;
    const bool exists = QDir(root).exists();
    for (int f = 0; f < files; ++f) {
        const QString dir = root + QStringLiteral("/d%1").arg(f / 100);
        QDir().mkpath(dir);
        QFile file(dir + QStringLiteral("/f%1.txt").arg(f));
        const bool write = !exists && file.open(QIODevice::WriteOnly);
        QByteArray bytes;
        for (int l = 0; l < linesPerFile; ++l) {
            QByteArray line("    ");
            const int count = 4 + int((seed >> 7) % 9);
            for (int w = 0; w < count; ++w) {
                seed = seed * 1103515245u + 12345u;
                line += words[(seed >> 16) % 20];
                line += ' ';
            }
            chars += line.size();
            bytes += line;
            bytes += '\n';
        }
        if (write)
            file.write(bytes);
    }
    return chars;
}

} // namespace

int main(int argc, char** argv)
{
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication app(argc, argv);
    int hits = 1000000;
    int files = 1000;
    bool withView = true;
    QString tree = QDir::tempPath() + QStringLiteral("/fif-stream-tree");
    const QStringList args = app.arguments();
    for (int i = 1; i < args.size(); ++i) {
        if (args.at(i) == QLatin1String("--hits") && i + 1 < args.size())
            hits = args.at(++i).toInt();
        else if (args.at(i) == QLatin1String("--files") && i + 1 < args.size())
            files = args.at(++i).toInt();
        else if (args.at(i) == QLatin1String("--tree") && i + 1 < args.size())
            tree = args.at(++i);
        else if (args.at(i) == QLatin1String("--no-view"))
            withView = false;
    }
    const qint64 textChars = writeTree(tree, files, hits / files);

    FifManager manager;
    FifJob* job = manager.getJob(0);
    QWidget* view = nullptr;
    if (withView) {
#ifdef FIF_HAVE_VIEW
        view = new FifHitsView(job, nullptr);
#else
        // Until the results view is built: a tree view set up as it sets up
        // its own (flat, uniform row heights).
        auto* treeView = new QTreeView;
        treeView->setUniformRowHeights(true);
        treeView->setRootIsDecorated(false);
        treeView->setModel(job->getHitsModel());
        view = treeView;
#endif
        view->resize(1000, 700);
        view->show();
    }
    job->getHitsModel();
    app.processEvents();

    FifInput request;
    request.what = QStringLiteral("*");
    request.matchType = QRegExp::Wildcard;
    request.where = tree;

    QElapsedTimer clock;
    qint64 last = 0;
    qint64 longestGap = 0;
    qint64 lastCpu = 0;
    qint64 longestCpuGap = 0;
    QTimer ticker;
    ticker.setInterval(5);
    QObject::connect(&ticker, &QTimer::timeout, [&] {
        const qint64 now = clock.nsecsElapsed();
        const qint64 cpu = threadCpuNs();
        longestGap = qMax(longestGap, now - last);
        longestCpuGap = qMax(longestCpuGap, cpu - lastCpu);
        last = now;
        lastCpu = cpu;
    });
    qint64 total = 0;
    qint64 guiCpu = 0;
    qint64 cpuAtStart = 0;
    QObject::connect(job, &QThread::finished, &app, [&] {
        // Let the view catch up with the last rows before the clock stops.
        QTimer::singleShot(0, &app, [&] {
            total = clock.nsecsElapsed();
            guiCpu = threadCpuNs() - cpuAtStart;
            app.quit();
        });
    });

    const long baseRss = currentRssKiB();
    clock.start();
    lastCpu = threadCpuNs();
    cpuAtStart = lastCpu;
    ticker.start();
    job->start(request);
    app.exec();

    const long peak = peakRssKiB();
    const int rows = job->getLineHitCount();
    const double perHit = rows ? (peak - baseRss) * 1024.0 / rows : 0;
    const double perHitBeyondText = rows ? ((peak - baseRss) * 1024.0 - 2.0 * textChars) / rows : 0;
    std::printf("view: %s\n", withView ?
#ifdef FIF_HAVE_VIEW
                "FifHitsView"
#else
                "QTreeView (stand-in)"
#endif
                : "none");
    std::printf("hits: %d in %d files\n", rows, job->getReadFileCount());
    std::printf("total: %.3f s\n", total / 1e9);
    std::printf("GUI thread CPU: %.3f s\n", guiCpu / 1e9);
    std::printf("longest event-loop gap: %.1f ms wall, %.1f ms GUI-thread CPU\n",
                longestGap / 1e6, longestCpuGap / 1e6);
    std::printf("peak rss: %ld KiB, before search %ld KiB\n", peak, baseRss);
    std::printf("bytes per hit: %.0f, beyond the line text (UTF-16): %.0f\n", perHit,
                perHitBeyondText);
    delete view;
    return rows == hits ? 0 : 1;
}
