#pragma once

#include "orba_host_export.h"

#include <QCoreApplication>
#include <QString>

class QAbstractItemModel;
class QWidget;

namespace Gui {
namespace Orba {

// Saves the rows of a model as a text file.
class ORBA_HOST_EXPORT ImExportDialog
{
    Q_DECLARE_TR_FUNCTIONS(Gui::Orba::ImExportDialog)

public:
    enum FormatFlag {
        TextFormat = 1 // each row's display text as one UTF-8 line
    };

    // Asks for a file ("Text files (*.txt)") and writes the model's rows to
    // it atomically: a failed write is reported in a message box and leaves
    // an existing file as it was. A non-empty `fileName` is used as is,
    // without asking. The file written goes to `savedFileName` when given.
    // Returns whether the file was written.
    static bool exportDialog(const QAbstractItemModel& model, const QString& caption,
                             FormatFlag format, QWidget* parent,
                             const QString& fileName, QString* savedFileName);

    // The same without any dialog; `error` receives the reason of a failure.
    static bool writeText(const QAbstractItemModel& model, const QString& fileName,
                          QString* error);
};

} // namespace Orba
} // namespace Gui
