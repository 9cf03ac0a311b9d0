#pragma once

#include "FifHit.h"
#include "FifInput.h"

#include <QDir>
#include <QList>
#include <QObject>

class QFileInfo;

namespace Gui {
namespace Orba {

class FifJob;

// Walks the folders of a job's request depth-first and scans every text file
// in it. Lives on the job's thread for one run; reaches the job only through
// its locked operations and the three signals, which Qt delivers queued.
class FifWorker : public QObject
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
    virtual void searchFile(const QString& path);
    virtual void searchFolder(const QDir& folder);

private:
    void addFolder(QDir& folder, QList<QDir>& folders);
    void sendHit(const FifHit& hit, FifHitList& batch);

    FifJob* job;
    FifInput input;
};

} // namespace Orba
} // namespace Gui
