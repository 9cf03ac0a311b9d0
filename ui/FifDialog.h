#pragma once

#include "fif_export.h"
#include "Dialog.h"
#include "FifSettings.h"

#include <QPointer>
#include <QStringList>

class QComboBox;
QT_BEGIN_NAMESPACE
namespace Ui {
class FindInFilesDlgClass;
}
QT_END_NAMESPACE

namespace Gui {
namespace Orba {

class FifInput;
class FifJob;
class Settings;

// The modal "Find in Files" dialog: fills its form from the stored entries
// and a request, checks what the user typed, starts the search on its job,
// stores the entries and their histories, and closes. While it is open the
// buttons follow the job, so a running search can be stopped from here.
//
// The folder chooser is the plain QFileDialog::getExistingDirectory(); it is
// deliberately not replaceable. Where no native dialog exists (the offscreen
// platform, or with Qt::AA_DontUseNativeDialogs) it is a widget dialog, which
// tests answer as the active modal widget.
class FIF_EXPORT FifDialog : public Dialog
{
    Q_OBJECT

public:
    // `settings` may be null: nothing is then read or written.
    FifDialog(Settings* settings, QWidget* parent);
    ~FifDialog() override;

    void setInput(const FifInput& input);
    // Replaces the file-type choices; the first becomes current.
    void setFilters(const QStringList& filters);
    // The job is not owned; the dialog follows its state while it lives.
    void setJob(FifJob* job);
    FifJob* getJob() const;

public slots:
    void on_browse_clicked();
    void on_append_clicked();
    void onStartClicked();
    void updateButtons();
    void onMatchCaseChanged(int state);

private:
    QString getLastDir(const QString& where) const;
    QString chooseFolder();
    void readSettings();
    void showOptions(const FifInput& input);
    // Fills an editable box with a stored history, keeping what is typed.
    static void showHistory(QComboBox& box, const QStringList& entries);
    // Puts what is typed on top of the box's entries and gives them all.
    static QStringList takeHistory(QComboBox& box);

    QPointer<FifJob> job;
    Settings* settings;
    FifSettings keys;
    Ui::FindInFilesDlgClass* form;
};

} // namespace Orba
} // namespace Gui
