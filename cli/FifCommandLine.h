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
    // When hits are coloured (--color).
    enum ColorMode { ColorAuto, ColorAlways, ColorNever };

    // `arguments` includes the program name, as QCoreApplication gives them.
    Result parse(const QStringList& arguments);

    // Valid after Search: the request as the arguments give it; the
    // expression itself is not checked.
    FifInput getRequest() const;
    // The folders as named, in order.
    QStringList getFolders() const;
    ColorMode getColorMode() const;
    // Scanning threads (-j): as given, else 0, one per core (as the job takes it).
    int getThreadCount() const;
    // After Error: what was wrong, one line.
    QString getErrorText() const;
    QString getHelpText() const;
    static QString getVersionText();

private:
    FifInput request;
    QStringList folders;
    ColorMode colorMode = ColorAuto;
    int threadCount = 0;
    QString errorText;
    QString helpText;
};

} // namespace Orba
} // namespace Gui
