#pragma once

#include "orba_host_export.h"

#include <QApplication>

#include <memory>

namespace Gui {
namespace Orba {

class Settings;

// The host application: a QApplication that owns the settings store.
class ORBA_HOST_EXPORT ApplicationBase : public QApplication
{
    Q_OBJECT

public:
    ApplicationBase(int& argc, char** argv);
    ~ApplicationBase() override;

    static ApplicationBase* getInstance();

    // The store in use: the one given to setSettings, else an INI file in the
    // user's configuration folder, created on first use.
    Settings* getSettings() const;
    // The caller keeps ownership; null goes back to the INI file.
    void setSettings(Settings* settings);

    static QString getHelpFileName();

private:
    Settings* settings = nullptr;
    mutable std::unique_ptr<Settings> defaultSettings;
};

} // namespace Orba
} // namespace Gui
