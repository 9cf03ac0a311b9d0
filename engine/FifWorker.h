#pragma once

#include "FifHit.h"
#include "FifInput.h"
#include "FifScanPool.h"

#include <QDir>
#include <QList>
#include <QObject>

#include <memory>

class QFileInfo;

namespace Gui {
namespace Orba {

class FifJob;
class FifNameFilter;

// Walks the folders of a job's request depth-first and has every text file
// in it scanned, by a pool of scanning threads or (with one thread, or when
// run in the job's own thread) by the walking thread itself. Lives on the
// job's thread for one run; reaches the job only through its locked
// operations and the three signals, which carry the search's events, in
// walk order, to the job's outbox.
class FifWorker : public QObject, private FifScanPool::Receiver
{
    Q_OBJECT

public:
    explicit FifWorker(FifJob* job);
    // Clears the job's stop flag, so that a stopped job can start again.
    ~FifWorker() override;

    void searchFolders();

    // A readable file whose first 20 lines hold no control character other
    // than white space.
    static bool isTextFile(const QFileInfo& info);

signals:
    void searching(const QString& file);
    void found(const Gui::Orba::FifHit& hit);
    void found(const Gui::Orba::FifHitList& hits);

protected:
    // Walks one folder that the request names.
    virtual void searchFolder(const QDir& folder);

private:
    void addFolder(const QDir& folder, QList<QDir>& folders);
    bool shouldStop() const;
    // The pool's reports, in walk order: the counters are raised and the
    // signals emitted here, batching the hits.
    void fileStarted(const QString& path) override;
    void hitFound(const FifHit& hit) override;
    void fileEnded(bool hasHit) override;
    void sendBatch();

    FifJob* job;
    FifInput input;
    std::unique_ptr<FifNameFilter> filter;
    // The run's pool, while searchFolders() runs.
    std::unique_ptr<FifScanPool> pool;
    // Hits of the file being reported that wait to go as one batch.
    FifHitList batch;
};

} // namespace Orba
} // namespace Gui
