#include "FifSettings.h"

#include "Settings.h"

#include <QStringList>
#include <QVariant>

namespace Gui {
namespace Orba {

namespace {

QString keyPath(const QString& group, const QString& key)
{
    return group.isEmpty() ? QString() : group + QLatin1Char('/') + key;
}

} // namespace

FifSettings::FifSettings()
    : findInFilesGroup(QStringLiteral("Find-In-Files"))
    , findBarGroup(QStringLiteral("FindBar"))
    , findWhatKey(QStringLiteral("Find what"))
    , matchCaseKey(QStringLiteral("MatchCase"))
    , matchWordKey(QStringLiteral("MatchWord"))
    , matchTypeKey(QStringLiteral("MatchType"))
    , whereKey(QStringLiteral("WhereKey"))
    , filterKey(QStringLiteral("CurrentFilterKey"))
    , includeSubFolderKey(QStringLiteral("IncludeSubFolderKey"))
{
}

QString FifSettings::getFindWhatKeyPath() const { return keyPath(findBarGroup, findWhatKey); }
QString FifSettings::getMatchCaseKeyPath() const { return keyPath(findBarGroup, matchCaseKey); }
QString FifSettings::getMatchWordKeyPath() const { return keyPath(findBarGroup, matchWordKey); }
QString FifSettings::getMatchTypeKeyPath() const { return keyPath(findBarGroup, matchTypeKey); }
QString FifSettings::getWhereKeyPath() const { return keyPath(findInFilesGroup, whereKey); }
QString FifSettings::getFilterKeyPath() const { return keyPath(findInFilesGroup, filterKey); }

QString FifSettings::getIncludeSubFolderKeyPath() const
{
    return keyPath(findInFilesGroup, includeSubFolderKey);
}

QString FifSettings::getWhatString(Settings* settings) const
{
    return settings ? getFirstStringOfKey(settings, getFindWhatKeyPath()) : QString();
}

QString FifSettings::getWhereString(Settings* settings) const
{
    return settings ? getFirstStringOfKey(settings, getWhereKeyPath()) : QString();
}

QString FifSettings::getFilterString(Settings* settings) const
{
    if (!settings)
        return QString();
    const QVariant value = settings->getValue(getFilterKeyPath(), QVariant());
    return value.isNull() ? QString() : value.toString();
}

QString FifSettings::getFirstStringOfKey(Settings* settings, const QString& path) const
{
    const QVariant value = settings->getValue(path, QVariant());
    if (value.isNull())
        return QString();
    const QStringList list = value.toStringList();
    return list.isEmpty() ? QString() : list.constFirst();
}

} // namespace Orba
} // namespace Gui
