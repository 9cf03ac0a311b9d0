#include "ApplicationBase.h"

#include "Settings.h"

#include <QDir>
#include <QStandardPaths>

namespace Gui {
namespace Orba {

ApplicationBase::ApplicationBase(int& argc, char** argv)
    : QApplication(argc, argv)
{
}

ApplicationBase::~ApplicationBase() = default;

ApplicationBase* ApplicationBase::getInstance()
{
    return qobject_cast<ApplicationBase*>(QCoreApplication::instance());
}

Settings* ApplicationBase::getSettings() const
{
    if (settings)
        return settings;
    if (!defaultSettings) {
        const QString folder =
            QStandardPaths::writableLocation(QStandardPaths::AppConfigLocation);
        // Without a usable folder the settings last for this run only; the
        // store's isPersistent() tells so.
        if (folder.isEmpty()) {
            defaultSettings = std::make_unique<Settings>();
        } else {
            QDir().mkpath(folder);
            defaultSettings = std::make_unique<Settings>(folder + QStringLiteral("/settings.ini"));
        }
    }
    return defaultSettings.get();
}

void ApplicationBase::setSettings(Settings* store)
{
    settings = store;
}

QString ApplicationBase::getHelpFileName()
{
    return QStringLiteral("qrc:/help/index.html");
}

} // namespace Orba
} // namespace Gui
