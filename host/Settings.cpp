#include "Settings.h"

#include <QSettings>
#include <QStringList>

namespace Gui {
namespace Orba {

namespace {

// INI files store text only, so the type of each value is kept beside it
// under this group and restored when the value is read back.
const QString typeGroup = QStringLiteral("ValueTypes");

QString typeKey(const QString& keyPath)
{
    QString key = keyPath;
    key.replace(QLatin1Char('/'), QLatin1Char('|'));
    return typeGroup + QLatin1Char('/') + key;
}

} // namespace

Settings::Settings(const QString& fileName)
{
    if (!fileName.isEmpty())
        file = std::make_unique<QSettings>(fileName, QSettings::IniFormat);
}

Settings::~Settings()
{
    if (file)
        file->sync();
}

QVariant Settings::getValue(const QString& keyPath, const QVariant& defaultValue) const
{
    if (!file)
        return memory.value(keyPath, defaultValue);

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
        memory.insert(keyPath, value);
        return;
    }
    file->setValue(keyPath, value);
    switch (value.typeId()) {
    case QMetaType::QStringList:
    case QMetaType::Bool:
    case QMetaType::Int:
        file->setValue(typeKey(keyPath), value.typeId());
        break;
    default:
        file->remove(typeKey(keyPath));
        break;
    }
}

void Settings::sync()
{
    if (file)
        file->sync();
}

QString Settings::getFileName() const
{
    return file ? file->fileName() : QString();
}

bool Settings::isPersistent() const
{
    return file && file->status() == QSettings::NoError && file->isWritable();
}

} // namespace Orba
} // namespace Gui
