#include "FifNameFilter.h"

namespace Gui {
namespace Orba {

FifNameFilter::FifNameFilter(const QStringList& patterns)
{
    bool star = false;
    for (const QString& pattern : patterns) {
        if (pattern.startsWith(QLatin1Char('!'))) {
            excluded.append(QRegularExpression::fromWildcard(QStringView(pattern).mid(1),
                                                             Qt::CaseInsensitive));
        } else {
            // A name never holds a "/", the one character "*" does not match.
            star = star || pattern == QLatin1String("*");
            included.append(QRegularExpression::fromWildcard(pattern, Qt::CaseInsensitive));
        }
    }
    includesAll = included.isEmpty() || star;
}

bool FifNameFilter::acceptsFile(const QString& name) const
{
    return (includesAll || matchesAny(included, name)) && !matchesAny(excluded, name);
}

bool FifNameFilter::acceptsFolder(const QString& name) const
{
    return !matchesAny(excluded, name);
}

bool FifNameFilter::matchesAny(const QList<QRegularExpression>& patterns, const QString& name)
{
    for (const QRegularExpression& pattern : patterns) {
        if (pattern.match(name).hasMatch())
            return true;
    }
    return false;
}

} // namespace Orba
} // namespace Gui
