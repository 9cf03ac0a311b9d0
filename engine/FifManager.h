#pragma once

#include "fif_export.h"
#include "FifActionMapper.h"

#include <QList>
#include <QMap>
#include <QObject>
#include <QPointer>
#include <QStringList>

namespace Gui {
namespace Orba {

class FifJob;
class MainWindow;

// The search jobs of one main window, as numbered slots created on demand.
// The window owns its manager; the manager owns its jobs.
class FIF_EXPORT FifManager : public QObject
{
    Q_OBJECT

public:
    // The manager of `mainWindow`, created on first request. A null window is
    // an ordinary key.
    static FifManager* getInstance(MainWindow* mainWindow);

    // Registers the value types that travel between threads. Does not enter
    // itself in the map of managers: only getInstance() does.
    explicit FifManager(MainWindow* mainWindow = nullptr);
    ~FifManager() override;

    int getJobCount() const;
    // The job in slot `index`; past the last slot exactly one new slot is
    // added and its job returned. Null for a negative index. A slot whose
    // job has been destroyed gets a new job.
    FifJob* getJob(int index) const;
    // Puts `job` into slot `index` (1 or more) and returns the job that was
    // there; slot 0 cannot be replaced. Ownership does not change.
    FifJob* replaceJob(int index, FifJob* job);

    QStringList getFilters() const;
    void setFilters(const QStringList& filters);

    MainWindow* getMainWindow() const;

    // The window's shared-action mapper; never null.
    FifActionMapper* getActionMapper() const;

private:
    static QMap<MainWindow*, FifManager*>* s_wndToMrgMap;

    // Guarded: a job put in by replaceJob() may be deleted by its owner.
    mutable QList<QPointer<FifJob>> jobs;
    // A member rather than a child: it lives exactly as long as the manager.
    mutable FifActionMapper actionMapper;
    QStringList filters;
};

} // namespace Orba
} // namespace Gui
