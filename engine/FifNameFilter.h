#pragma once

#include <QList>
#include <QRegularExpression>
#include <QStringList>

namespace Gui {
namespace Orba {

// The file-name patterns of a request, as a walk applies them to the names
// it meets. A pattern is a wildcard that must match the whole name, without
// regard to case, as QDir matches its name filters; a pattern that starts
// with "!" names files and folders to leave out. Files must match one of
// the other patterns (any file does when there is none); folders are not
// subject to them, only to the exclusions.
class FifNameFilter
{
public:
    explicit FifNameFilter(const QStringList& patterns);

    bool acceptsFile(const QString& name) const;
    bool acceptsFolder(const QString& name) const;

private:
    static bool matchesAny(const QList<QRegularExpression>& patterns, const QString& name);

    QList<QRegularExpression> included;
    QList<QRegularExpression> excluded;
    // No inclusion, or "*" among them: every name is included. Spares a
    // regular expression per file for the usual filter.
    bool includesAll = true;
};

} // namespace Orba
} // namespace Gui
