#pragma once

#include "fif_export.h"

#include <QMetaType>
#include <QString>
#include <QtCore5Compat/QRegExp>

namespace Gui {
namespace Orba {

class Settings;

// A search request: what to find, how to match it, where and in which files.
class FIF_EXPORT FifInput
{
public:
    // `filter` becomes the file-name patterns, "*" when it is empty; `where`
    // starts as the process's current directory.
    FifInput(const QString& filter = QString());
    FifInput(const FifInput& other);
    FifInput& operator=(const FifInput& other);
    ~FifInput();

    // A non-empty `what` whose expression Qt accepts.
    bool isValid() const;
    // The same verdict with the reason for the user: on an unusable request,
    // the title ("Empty Expression" or "Bad Expression") and the message
    // that the find dialog and `fif` show.
    bool check(QString* title, QString* message) const;
    // The expression every line is matched against.
    QRegExp getRegExp() const;
    // One line describing the request, empty when `what` is.
    QString toString() const;
    // Takes the stored entries of the last search, field by field.
    void setContents(Settings* settings);

    QString what;
    QString where;     // folders separated by ";"
    QString filter;    // file-name patterns separated by ";"
    int matchCase;     // Qt::CaseSensitivity
    int matchType;     // QRegExp::PatternSyntax: FixedString, Wildcard or RegExp2
    bool includeSubFolders;
    bool matchWord;
};

} // namespace Orba
} // namespace Gui

Q_DECLARE_METATYPE(Gui::Orba::FifInput)
