#include "FifManager.h"

#include "FifHit.h"
#include "FifInput.h"
#include "FifJob.h"
#include "MainWindow.h"

namespace Gui {
namespace Orba {

QMap<MainWindow*, FifManager*>* FifManager::s_wndToMrgMap = nullptr;

FifManager* FifManager::getInstance(MainWindow* mainWindow)
{
    if (!s_wndToMrgMap)
        s_wndToMrgMap = new QMap<MainWindow*, FifManager*>;
    if (FifManager* manager = s_wndToMrgMap->value(mainWindow))
        return manager;
    auto* manager = new FifManager(mainWindow);
    s_wndToMrgMap->insert(mainWindow, manager);
    return manager;
}

FifManager::FifManager(MainWindow* mainWindow)
    : QObject(mainWindow)
    , actionMapper(this)
{
    qRegisterMetaType<FifHit>("Gui::Orba::FifHit");
    qRegisterMetaType<FifHitList>("Gui::Orba::FifHitList");
    qRegisterMetaType<FifInput>("Gui::Orba::FifInput");
}

FifManager::~FifManager()
{
    // Look the entry up by manager rather than by window: the window may be
    // half destroyed by now, and a manager built directly for a window that
    // has a registered one must not remove that one.
    if (!s_wndToMrgMap)
        return;
    for (auto it = s_wndToMrgMap->begin(); it != s_wndToMrgMap->end(); ++it) {
        if (it.value() == this) {
            s_wndToMrgMap->erase(it);
            break;
        }
    }
}

int FifManager::getJobCount() const
{
    return int(jobs.size());
}

FifJob* FifManager::getJob(int index) const
{
    if (index < 0)
        return nullptr;
    if (index < jobs.size()) {
        if (!jobs.at(index))
            jobs[index] = new FifJob(const_cast<FifManager*>(this));
        return jobs.at(index);
    }
    auto* job = new FifJob(const_cast<FifManager*>(this));
    jobs.append(job);
    return job;
}

FifJob* FifManager::replaceJob(int index, FifJob* job)
{
    if (index <= 0)
        return nullptr;
    FifJob* old = getJob(index);
    if (index < jobs.size())
        jobs[index] = job;
    return old;
}

QStringList FifManager::getFilters() const
{
    return filters;
}

void FifManager::setFilters(const QStringList& list)
{
    filters = list;
}

MainWindow* FifManager::getMainWindow() const
{
    return qobject_cast<MainWindow*>(parent());
}

FifActionMapper* FifManager::getActionMapper() const
{
    return &actionMapper;
}

} // namespace Orba
} // namespace Gui
