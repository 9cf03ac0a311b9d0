#include "ImExportDialog.h"

#include <QAbstractItemModel>
#include <QFileDialog>
#include <QMessageBox>
#include <QSaveFile>

namespace Gui {
namespace Orba {

bool ImExportDialog::exportDialog(const QAbstractItemModel& model, const QString& caption,
                                  FormatFlag /*format*/, QWidget* parent,
                                  const QString& fileName, QString* savedFileName)
{
    QString target = fileName;
    if (target.isEmpty()) {
        QFileDialog chooser(parent, caption.isEmpty() ? tr("Export") : caption);
        chooser.setObjectName(QStringLiteral("ImExportFileDialog"));
        chooser.setAcceptMode(QFileDialog::AcceptSave);
        chooser.setFileMode(QFileDialog::AnyFile);
        chooser.setNameFilter(tr("Text files (*.txt)"));
        chooser.setDefaultSuffix(QStringLiteral("txt"));
        chooser.setOption(QFileDialog::DontUseNativeDialog);
        if (chooser.exec() != QDialog::Accepted || chooser.selectedFiles().isEmpty())
            return false;
        target = chooser.selectedFiles().constFirst();
    }

    QString error;
    if (!writeText(model, target, &error)) {
        QMessageBox::critical(parent, tr("Export Failed"),
                              tr("Could not save \"%1\": %2").arg(target, error));
        return false;
    }
    if (savedFileName)
        *savedFileName = target;
    return true;
}

bool ImExportDialog::writeText(const QAbstractItemModel& model, const QString& fileName,
                               QString* error)
{
    QSaveFile file(fileName);
    if (!file.open(QIODevice::WriteOnly)) {
        if (error)
            *error = file.errorString();
        return false;
    }
    const int rows = model.rowCount();
    for (int row = 0; row < rows; ++row) {
        QByteArray line = model.data(model.index(row, 0)).toString().toUtf8();
        line += '\n';
        if (file.write(line) != line.size()) {
            file.cancelWriting(); // commit() then fails and keeps the old file
            break;
        }
    }
    if (!file.commit()) {
        if (error)
            *error = file.errorString();
        return false;
    }
    return true;
}

} // namespace Orba
} // namespace Gui
