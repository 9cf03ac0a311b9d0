#include "FifInput.h"

#include "FifSettings.h"
#include "Settings.h"

#include <QCoreApplication>
#include <QDir>

namespace Gui {
namespace Orba {

namespace {

// Only '*' and '?' are wildcards; everything else matches itself.
QString wildcardToRegExp(const QString& pattern)
{
    QString rx = QRegExp::escape(pattern);
    rx.replace(QLatin1String("\\?"), QLatin1String("."), Qt::CaseSensitive);
    rx.replace(QLatin1String("\\*"), QLatin1String(".*"), Qt::CaseSensitive);
    return rx;
}

QString wordBounded(const QString& pattern)
{
    return QLatin1String("\\b(") + pattern + QLatin1String(")\\b");
}

// A stored value counts only when Qt can read it as the field's type; one of
// another kind (a list where a flag belongs, text where a number belongs) is
// passed over like a missing one.
bool readBool(const QVariant& value, bool* result)
{
    if (value.isNull())
        return false;
    QVariant converted = value;
    if (!converted.convert(QMetaType::fromType<bool>()))
        return false;
    *result = converted.toBool();
    return true;
}

bool readInt(const QVariant& value, int* result)
{
    if (value.isNull())
        return false;
    bool ok = false;
    const int number = value.toInt(&ok);
    if (ok)
        *result = number;
    return ok;
}

} // namespace

FifInput::FifInput(const QString& filterText)
    : where(QDir::toNativeSeparators(QDir::currentPath()))
    , filter(filterText.isEmpty() ? QStringLiteral("*") : filterText)
    , matchCase(Qt::CaseInsensitive)
    , matchType(QRegExp::FixedString)
    , includeSubFolders(true)
    , matchWord(false)
{
}

FifInput::FifInput(const FifInput& other) = default;
FifInput& FifInput::operator=(const FifInput& other) = default;
FifInput::~FifInput() = default;

bool FifInput::isValid() const
{
    return !what.isEmpty() && getRegExp().isValid();
}

bool FifInput::check(QString* title, QString* message) const
{
    if (what.isEmpty()) {
        *title = QObject::tr("Empty Expression");
        *message = QObject::tr("Please enter the search expression in the \"Find what:\" field.");
        return false;
    }
    const QRegExp rx = getRegExp();
    if (!rx.isValid()) {
        *title = QObject::tr("Bad Expression");
        // One pass, so that a "%2" in Qt's error text stays as it is.
        *message = QObject::tr("%1: \"%2\"").arg(rx.errorString(), what);
        return false;
    }
    return true;
}

QRegExp FifInput::getRegExp() const
{
    QRegExp rx;
    rx.setCaseSensitivity(matchCase == Qt::CaseSensitive ? Qt::CaseSensitive
                                                         : Qt::CaseInsensitive);
    QString pattern = what;
    int syntax = matchType;
    switch (matchType) {
    case QRegExp::FixedString:
        if (matchWord) {
            pattern = wordBounded(QRegExp::escape(what));
            syntax = QRegExp::RegExp2;
        }
        break;
    case QRegExp::Wildcard:
        pattern = wildcardToRegExp(what);
        if (matchWord)
            pattern = wordBounded(pattern);
        syntax = QRegExp::RegExp2;
        break;
    case QRegExp::RegExp2:
        if (matchWord)
            pattern = wordBounded(what);
        break;
    default:
        break;
    }
    rx.setPattern(pattern);
    // A stored value outside Qt's syntaxes must not reach QRegExp as an enum.
    if (syntax >= QRegExp::RegExp && syntax <= QRegExp::W3CXmlSchema11)
        rx.setPatternSyntax(QRegExp::PatternSyntax(syntax));
    return rx;
}

QString FifInput::toString() const
{
    if (what.isEmpty())
        return QString();

    QString text;
    switch (matchType) {
    case QRegExp::RegExp2:
        text = QObject::tr("Find regular expression \"%1\"").arg(what);
        break;
    case QRegExp::Wildcard:
        text = QObject::tr("Find wildcard \"%1\"").arg(what);
        break;
    default:
        text = QObject::tr("Find \"%1\"").arg(what);
        break;
    }
    if (matchCase == Qt::CaseSensitive)
        text += QObject::tr(", case sensitive");
    if (matchWord)
        text += QObject::tr(", match word");
    if (includeSubFolders)
        text += QObject::tr(", include subfolders");
    if (!where.isEmpty())
        text += QObject::tr(", in folders \"%1\"").arg(where);
    if (!filter.isEmpty())
        text += QObject::tr(", in file type \"%1\"").arg(filter);
    return text;
}

void FifInput::setContents(Settings* settings)
{
    if (!settings)
        return;
    const FifSettings keys;

    const QString storedWhat = keys.getWhatString(settings);
    if (!storedWhat.isEmpty())
        what = storedWhat;
    const QString storedWhere = keys.getWhereString(settings);
    if (!storedWhere.isEmpty())
        where = storedWhere;
    const QString storedFilter = keys.getFilterString(settings);
    if (!storedFilter.isEmpty())
        filter = storedFilter;

    bool flag = false;
    if (readBool(settings->getValue(keys.getMatchCaseKeyPath(), QVariant()), &flag))
        matchCase = flag ? Qt::CaseSensitive : Qt::CaseInsensitive;
    if (readBool(settings->getValue(keys.getMatchWordKeyPath(), QVariant()), &flag))
        matchWord = flag;

    int storedType = 0;
    if (readInt(settings->getValue(keys.getMatchTypeKeyPath(), QVariant()), &storedType)) {
        // The store keeps RegExp (0) where a request carries RegExp2.
        switch (storedType) {
        case QRegExp::RegExp:
            matchType = QRegExp::RegExp2;
            break;
        case QRegExp::Wildcard:
            matchType = QRegExp::Wildcard;
            break;
        case QRegExp::FixedString:
            matchType = QRegExp::FixedString;
            break;
        default:
            break;
        }
    }

    if (readBool(settings->getValue(keys.getIncludeSubFolderKeyPath(), QVariant()), &flag))
        includeSubFolders = flag;
}

} // namespace Orba
} // namespace Gui
