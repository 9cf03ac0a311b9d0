#pragma once

#include "FifHit.h"
#include "FifInput.h"

#include <QDir>
#include <QList>
#include <QObject>

#include <memory>

class QFileInfo;

namespace Gui {
namespace Orba {

class FifFileDevice;
class FifJob;
class FifLineScanner;

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
    // Opens the entry and tests it; a text file stays open for the
    // searchFile() that follows, so that it is opened only once.
    bool openTextFile(const QFileInfo& info);
    static bool isTextFile(FifFileDevice& file);
    // The test through a QTextStream, for files of a UTF-16 or UTF-32
    // byte-order mark.
    static bool isTextByStream(const QString& path);

    FifJob* job;
    FifInput input;
    // Built once for the whole search.
    std::unique_ptr<FifLineScanner> scanner;
    std::unique_ptr<FifFileDevice> openedFile;
    QString openedPath;
    QByteArray headBuffer;  // lent to each file opened in turn
};

} // namespace Orba
} // namespace Gui
