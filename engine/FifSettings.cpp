#include "FifSettings.h"

#include "FifInput.h"
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

bool readBool(Settings* settings, const QString& path, bool* result)
{
    QVariant value = settings->getValue(path, QVariant());
    if (value.isNull() || !value.convert(QMetaType::fromType<bool>()))
        return false;
    *result = value.toBool();
    return true;
}

bool readInt(Settings* settings, const QString& path, int* result)
{
    const QVariant value = settings->getValue(path, QVariant());
    bool ok = false;
    const int number = value.isNull() ? 0 : value.toInt(&ok);
    if (ok)
        *result = number;
    return ok;
}

void store(Settings* settings, const QString& path, const QVariant& value)
{
    if (!path.isEmpty())
        settings->setValue(path, value);
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
    , threadCountKey(QStringLiteral("ThreadCount"))
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

QString FifSettings::getThreadCountKeyPath() const
{
    return keyPath(findInFilesGroup, threadCountKey);
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

QStringList FifSettings::getWhatHistory(Settings* settings) const
{
    return settings ? getList(settings, getFindWhatKeyPath()) : QStringList();
}

QStringList FifSettings::getWhereHistory(Settings* settings) const
{
    return settings ? getList(settings, getWhereKeyPath()) : QStringList();
}

int FifSettings::getThreadCount(Settings* settings) const
{
    int count = 0;
    if (settings)
        readInt(settings, getThreadCountKeyPath(), &count);
    return count;
}

void FifSettings::readInput(Settings* settings, FifInput& input) const
{
    if (!settings)
        return;
    const QString storedWhat = getWhatString(settings);
    if (!storedWhat.isEmpty())
        input.what = storedWhat;
    const QString storedWhere = getWhereString(settings);
    if (!storedWhere.isEmpty())
        input.where = storedWhere;
    const QString storedFilter = getFilterString(settings);
    if (!storedFilter.isEmpty())
        input.filter = storedFilter;

    bool flag = false;
    if (readBool(settings, getMatchCaseKeyPath(), &flag))
        input.matchCase = flag ? Qt::CaseSensitive : Qt::CaseInsensitive;
    if (readBool(settings, getMatchWordKeyPath(), &flag))
        input.matchWord = flag;
    if (readBool(settings, getIncludeSubFolderKeyPath(), &flag))
        input.includeSubFolders = flag;
    int type = 0;
    if (readInt(settings, getMatchTypeKeyPath(), &type)) {
        // The store keeps RegExp (0) where a request carries RegExp2; other
        // numbers are not a match type.
        if (type == QRegExp::RegExp)
            input.matchType = QRegExp::RegExp2;
        else if (type == QRegExp::Wildcard || type == QRegExp::FixedString)
            input.matchType = type;
    }
}

void FifSettings::writeInput(Settings* settings, const FifInput& input,
                             const QStringList& whatHistory, const QStringList& whereHistory) const
{
    if (!settings)
        return;
    store(settings, getFindWhatKeyPath(), whatHistory);
    store(settings, getMatchCaseKeyPath(), input.matchCase == Qt::CaseSensitive);
    store(settings, getMatchWordKeyPath(), input.matchWord);
    store(settings, getMatchTypeKeyPath(),
          input.matchType == QRegExp::RegExp2 ? int(QRegExp::RegExp) : input.matchType);
    store(settings, getWhereKeyPath(), whereHistory);
    if (!input.filter.isEmpty())
        store(settings, getFilterKeyPath(), input.filter);
    store(settings, getIncludeSubFolderKeyPath(), input.includeSubFolders);
}

QString FifSettings::getFirstStringOfKey(Settings* settings, const QString& path) const
{
    const QStringList list = getList(settings, path);
    return list.isEmpty() ? QString() : list.constFirst();
}

QStringList FifSettings::getList(Settings* settings, const QString& path) const
{
    const QVariant value = settings->getValue(path, QVariant());
    return value.isNull() ? QStringList() : value.toStringList();
}

} // namespace Orba
} // namespace Gui
