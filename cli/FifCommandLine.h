#pragma once

#include "FifInput.h"

#include <QCoreApplication>
#include <QString>
#include <QStringList>

namespace Gui {
namespace Orba {

// The arguments of `fif` read into a search request.
class FifCommandLine
{
    Q_DECLARE_TR_FUNCTIONS(FifCommandLine)

public:
    enum Result { Search, Help, Version, Error };

    // `arguments` includes the program name, as QCoreApplication gives them.
    Result parse(const QStringList& arguments);

    // Valid after Search: the request as the arguments give it; the
    // expression itself is not checked.
    FifInput getRequest() const;
    // After Error: what was wrong, one line.
    QString getErrorText() const;
    QString getHelpText() const;
    static QString getVersionText();

private:
    FifInput request;
    QString errorText;
    QString helpText;
};

} // namespace Orba
} // namespace Gui
