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
//
// A store never fails its caller. A file that cannot be read is left alone
// and the store keeps its values in memory; a file that is damaged is kept
// beside the new one as "<name>.corrupt" and what could be read of it is
// carried over. isPersistent() tells whether values reach the file.
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

    // Whether values set now will be there in the next run: false for a
    // memory store, for a file that could not be read, and once the file
    // or its folder could not be written. Values set in the meantime are
    // still read back for the rest of this run.
    bool isPersistent() const;

private:
    void openFile();
    void replaceDamagedFile();

    QString fileName;
    std::unique_ptr<QSettings> file;
    QHash<QString, QVariant> memory;
    bool writable = false;
};

} // namespace Orba
} // namespace Gui
