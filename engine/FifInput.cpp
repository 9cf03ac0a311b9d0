#include "FifInput.h"

#include "FifSettings.h"

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
    FifSettings().readInput(settings, *this);
}

} // namespace Orba
} // namespace Gui
