#include "Settings.h"

#include <QFile>
#include <QFileInfo>
#include <QSettings>
#include <QStringList>

namespace Gui {
namespace Orba {

namespace {

// INI files store text only, so the type of each value that is not a
// string is kept beside it under this group and restored when the value
// is read back.
const QString typeGroup = QStringLiteral("ValueTypes");

// QSettings folds "a//b" and "/a/b/" into "a/b"; the type entry must
// follow the same key as the value.
QString normalized(const QString& keyPath)
{
    return keyPath.split(QLatin1Char('/'), Qt::SkipEmptyParts).join(QLatin1Char('/'));
}

// One key below typeGroup per value: "%" and "/" are escaped so that
// different key paths never share a type entry.
QString typeKey(const QString& keyPath)
{
    QString key = normalized(keyPath);
    key.replace(QLatin1Char('%'), QLatin1String("%25"));
    key.replace(QLatin1Char('/'), QLatin1String("%2F"));
    return typeGroup + QLatin1Char('/') + key;
}

} // namespace

Settings::Settings(const QString& name)
    : fileName(name)
{
    if (!fileName.isEmpty())
        openFile();
}

Settings::~Settings()
{
    if (file)
        file->sync();
}

void Settings::openFile()
{
    const QFileInfo info(fileName);
    // Writing to a file we cannot read would throw away what it holds.
    if (info.exists() && (!info.isFile() || !info.isReadable()))
        return;

    file = std::make_unique<QSettings>(fileName, QSettings::IniFormat);
    // Sections are parsed on first use; parse them all now so that damage
    // shows up here rather than in the middle of the session.
    file->allKeys();
    if (file->status() == QSettings::FormatError)
        replaceDamagedFile();
    if (file)
        writable = file->status() == QSettings::NoError && file->isWritable();
}

void Settings::replaceDamagedFile()
{
    QHash<QString, QVariant> salvaged;
    const QStringList keys = file->allKeys();
    for (const QString& key : keys)
        salvaged.insert(key, file->value(key));
    file.reset();

    const QString keep = fileName + QStringLiteral(".corrupt");
    QFile::remove(keep);
    if (!QFile::rename(fileName, keep)) {
        // The damaged file stays untouched; this run keeps what was read.
        memory = salvaged;
        return;
    }
    file = std::make_unique<QSettings>(fileName, QSettings::IniFormat);
    for (auto it = salvaged.cbegin(); it != salvaged.cend(); ++it)
        file->setValue(it.key(), it.value());
    file->sync();
}

QVariant Settings::getValue(const QString& keyPath, const QVariant& defaultValue) const
{
    if (!file)
        return memory.value(normalized(keyPath), defaultValue);

    const QVariant stored = file->value(keyPath);
    const int typeId = file->value(typeKey(keyPath)).toInt();
    if (typeId == QMetaType::QStringList && !stored.isValid())
        return QStringList(); // an empty list is written as an invalid value
    if (!stored.isValid())
        return defaultValue;
    if (typeId > 0 && stored.typeId() != typeId) {
        QVariant typed = stored;
        if (typed.convert(QMetaType(typeId)))
            return typed;
    }
    return stored;
}

void Settings::setValue(const QString& keyPath, const QVariant& value)
{
    if (!file) {
        memory.insert(normalized(keyPath), value);
        return;
    }
    file->setValue(keyPath, value);
    // Only Qt's own types have ids that stay the same from run to run.
    if (value.isValid() && value.typeId() != QMetaType::QString
        && value.typeId() < QMetaType::User)
        file->setValue(typeKey(keyPath), value.typeId());
    else
        file->remove(typeKey(keyPath));
}

void Settings::sync()
{
    if (file)
        file->sync();
}

QString Settings::getFileName() const
{
    return fileName;
}

bool Settings::isPersistent() const
{
    return file && writable && file->status() == QSettings::NoError;
}

} // namespace Orba
} // namespace Gui
