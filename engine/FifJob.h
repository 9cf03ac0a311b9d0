#pragma once

#include "fif_export.h"
#include "FifHit.h"
#include "FifInput.h"

#include <QDir>
#include <QReadWriteLock>
#include <QThread>

#include <atomic>

namespace Gui {
namespace Orba {

class FifHitsModel;
class FifManager;
class FifOutbox;
class MainWindow;

// One search slot of a main window: runs one search at a time on its own
// thread and keeps its request, hits, counters and stop flag.
//
// The counters are shared with the search threads and are only touched
// under `lock`; the stop flag is changed under it too and read without it,
// as the scanning threads poll it often. The hits model is changed in the
// GUI thread only. What the search finds reaches the GUI thread through the
// job's outbox, in walk order, and is all delivered before any receiver of
// finished() other than the job's own runs.
class FIF_EXPORT FifJob : public QThread
{
    Q_OBJECT

public:
    explicit FifJob(FifManager* manager);
    // Stops a running search and waits until its thread has ended, so that
    // the search never outlives the job.
    ~FifJob() override;

    // Empties the model, zeroes the counters, notes the current directory,
    // emits aboutToStart() and starts the search thread. A job whose thread
    // still runs refuses: the call then changes nothing and returns false.
    bool start(const FifInput& request);

    bool shouldStop() const;
    void setShouldStop(bool stop);

    // The threads that scan files in the next search; 0 or less means one
    // per core. The getter gives the number that will be used (at least 1).
    // With 1, files are scanned on the job's thread itself.
    void setThreadCount(int count);
    int getThreadCount() const;

    int getReadFileCount() const;
    int getFileHitCount() const;
    void incrementReadFileCount();
    void incrementFileHitCount();
    // The number of rows of the hits model, 0 while there is none.
    int getLineHitCount() const;
    // The counts of the search as the results view shows them at its end:
    // "Found %n line(s) in %n file(s) out of %n file(s)".
    QString getResultText() const;
    // The same text for counts of its own (`fif` counts rows it dropped).
    static QString resultText(int lines, int files, int readFiles);

    FifInput getInput() const;
    QDir getWorkingDir() const;
    void setWorkingDir(QDir dir);
    // Created on first use, owned by the job.
    FifHitsModel* getHitsModel() const;

    FifManager* getManager() const;
    MainWindow* getMainWindow() const;

signals:
    void aboutToStart();
    void searching(const QString& file);

public slots:
    void appendHit(const Gui::Orba::FifHit& hit);
    void appendHits(const Gui::Orba::FifHitList& hits);
    // Asks the running search to end; does not wait.
    void stop();

protected:
    void run() override;

private:
    friend class FifWorker;
    // The worker's events, handed to the outbox on the thread that reports
    // them.
    void postSearching(const QString& file);
    void postHit(const Gui::Orba::FifHit& hit);
    void postHits(const Gui::Orba::FifHitList& hits);

    mutable FifHitsModel* hitsModel = nullptr;
    FifOutbox* outbox;
    QDir workingDir;
    FifInput input;
    mutable QReadWriteLock lock;
    int readFileCount = 0;
    int fileHitCount = 0;
    int threadCount = 0;
    std::atomic<bool> stopFlag{false};
};

} // namespace Orba
} // namespace Gui
