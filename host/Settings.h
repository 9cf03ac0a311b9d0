#pragma once

#include "orba_host_export.h"

#include <QHash>
#include <QString>
#include <QVariant>

#include <memory>

class QSettings;

namespace Gui {
namespace Orba {

// The application's settings store: values under key paths "group/key".
// With a file name the values live in an INI file and keep their types
// (string lists, bools, ints) across runs; without one they live in memory
// only, which is what tests want.
class ORBA_HOST_EXPORT Settings
{
public:
    explicit Settings(const QString& fileName = QString());
    ~Settings();

    Settings(const Settings&) = delete;
    Settings& operator=(const Settings&) = delete;

    QVariant getValue(const QString& keyPath,
                      const QVariant& defaultValue = QVariant()) const;
    void setValue(const QString& keyPath, const QVariant& value);

    // Writes pending values to the file; a memory store has nothing to do.
    void sync();

    // The INI file's name, empty for a memory store.
    QString getFileName() const;

    // False once the file could not be read or written; values set since
    // then are kept for this run only.
    bool isPersistent() const;

private:
    std::unique_ptr<QSettings> file;
    QHash<QString, QVariant> memory;
};

} // namespace Orba
} // namespace Gui
