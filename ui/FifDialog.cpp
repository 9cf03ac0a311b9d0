#include "FifDialog.h"

#include "ui_FindInFilesDlg.h"

#include "FifInput.h"
#include "FifJob.h"
#include "ImageManager.h"
#include "Settings.h"

#include <QCompleter>
#include <QDir>
#include <QFileDialog>
#include <QLineEdit>
#include <QMessageBox>

namespace Gui {
namespace Orba {

namespace {

// Most recent first, no duplicates; a full box loses its oldest entry.
void putOnTop(QComboBox& box, const QString& text)
{
    const int found = box.findText(text, Qt::MatchExactly | Qt::MatchCaseSensitive);
    if (found >= 0) {
        box.removeItem(found);
    } else if (box.count() >= box.maxCount() && box.count() > 0) {
        box.removeItem(box.count() - 1);
    }
    box.insertItem(0, text);
}

void selectOrAdd(QComboBox& box, const QString& text)
{
    // An empty text is shown as such; as an entry it would be stored in the
    // history with the next search.
    if (text.isEmpty() && box.isEditable()) {
        box.setCurrentIndex(-1);
        box.setEditText(QString());
        return;
    }
    int found = box.findText(text, Qt::MatchExactly | Qt::MatchCaseSensitive);
    if (found < 0) {
        box.addItem(text);
        found = box.count() - 1;
    }
    box.setCurrentIndex(found);
}

Qt::CheckState checkState(bool checked)
{
    return checked ? Qt::Checked : Qt::Unchecked;
}

} // namespace

FifDialog::FifDialog(Settings* settings, QWidget* parent)
    : Dialog(parent, settings, "gui-orba-find-in-files-dialog", true, Qt::WindowFlags())
    , settings(settings)
    , form(new Ui::FindInFilesDlgClass)
{
    form->setupUi(this);
    setWindowIcon(ImageManager::getInstance()->getIcon(QStringLiteral("gui-orba-find-in-files")));

    connect(form->start, &QPushButton::clicked, this, &FifDialog::onStartClicked);
    connect(form->cancel, &QPushButton::clicked, this, &QWidget::close);

    readSettings();
    // Connected only now so that reading the stored state does not echo back.
    connect(form->matchCase, &QCheckBox::stateChanged, this, &FifDialog::onMatchCaseChanged);

    if (QCompleter* completer = form->filter->completer())
        completer->setCaseSensitivity(Qt::CaseInsensitive);
    if (QCompleter* completer = form->where->completer())
        completer->setCaseSensitivity(Qt::CaseInsensitive);

    setHelpTopic(QStringLiteral("find-in-files-dialog"));
    setHelpButton(form->help);
}

FifDialog::~FifDialog()
{
    delete form;
}

void FifDialog::setInput(const FifInput& input)
{
    selectOrAdd(*form->what, input.what);
    showOptions(input);
    selectOrAdd(*form->where, input.where);
    selectOrAdd(*form->filter, input.filter);
}

void FifDialog::setFilters(const QStringList& filters)
{
    form->filter->clear();
    if (!filters.isEmpty()) {
        form->filter->addItems(filters);
        form->filter->setCurrentIndex(0);
    }
}

void FifDialog::setJob(FifJob* newJob)
{
    if (newJob == job)
        return;
    if (job) {
        disconnect(job, &FifJob::aboutToStart, this, &FifDialog::updateButtons);
        disconnect(job, &QThread::finished, this, &FifDialog::updateButtons);
        disconnect(form->stop, &QPushButton::clicked, job, &FifJob::stop);
    }
    if (newJob) {
        // aboutToStart() comes just before the thread is started, when the
        // job does not run yet; queued, the buttons see the job running.
        connect(newJob, &FifJob::aboutToStart, this, &FifDialog::updateButtons,
                Qt::QueuedConnection);
        // Emitted from the search thread; runs queued here.
        connect(newJob, &QThread::finished, this, &FifDialog::updateButtons);
        connect(form->stop, &QPushButton::clicked, newJob, &FifJob::stop);
    }
    job = newJob;
    updateButtons();
}

FifJob* FifDialog::getJob() const
{
    return job;
}

void FifDialog::on_browse_clicked()
{
    const QString folder = chooseFolder();
    if (folder.isEmpty())
        return;
    putOnTop(*form->where, folder);
    form->where->setCurrentIndex(0);
}

void FifDialog::on_append_clicked()
{
    const QString folder = chooseFolder();
    if (folder.isEmpty())
        return;
    QString folders = form->where->currentText().trimmed();
    if (!folders.isEmpty() && !folders.endsWith(QLatin1Char(';')))
        folders += QLatin1Char(';');
    folders += folder;
    putOnTop(*form->where, folders);
    form->where->setCurrentIndex(0);
}

void FifDialog::onStartClicked()
{
    FifInput request{QString()};
    request.what = form->what->currentText();
    request.matchCase = form->matchCase->isChecked() ? Qt::CaseSensitive : Qt::CaseInsensitive;
    if (form->literal->isChecked())
        request.matchType = QRegExp::FixedString;
    else if (form->wildcard->isChecked())
        request.matchType = QRegExp::Wildcard;
    else
        request.matchType = QRegExp::RegExp2;
    request.matchWord = form->matchWord->isChecked();

    QString title;
    QString message;
    if (!request.check(&title, &message)) {
        QMessageBox::critical(this, title, message, QMessageBox::Ok, QMessageBox::NoButton);
        form->what->setFocus(Qt::OtherFocusReason);
        if (QLineEdit* edit = form->what->lineEdit())
            edit->selectAll();
        return;
    }
    if (!job)
        return;

    request.where = form->where->currentText();
    request.filter = form->filter->currentText();
    request.includeSubFolders = form->includeSubDir->isChecked();
    // A job still busy with an earlier search refuses; nothing was started,
    // so nothing is stored and the dialog stays open.
    if (!job->start(request)) {
        updateButtons();
        return;
    }
    if (settings)
        keys.writeInput(settings, request, takeHistory(*form->what), takeHistory(*form->where));
    close();
}

void FifDialog::updateButtons()
{
    if (!job)
        return;
    const bool running = job->isRunning();
    QPushButton* active = running ? form->stop : form->start;
    QPushButton* idle = running ? form->start : form->stop;

    active->setEnabled(true);
    active->setDefault(true);
    idle->setDefault(false);
    idle->setEnabled(false);

    const QList<QWidget*> children = findChildren<QWidget*>(QString(), Qt::FindDirectChildrenOnly);
    for (QWidget* child : children) {
        // Message boxes and choosers opened from here are windows of their own.
        if (child == active || child == idle || child->isWindow())
            continue;
        child->setEnabled(!running);
    }
    if (!running)
        form->what->setFocus(Qt::OtherFocusReason);
    form->cancel->setEnabled(true);
}

void FifDialog::onMatchCaseChanged(int state)
{
    if (QCompleter* completer = form->what->completer())
        completer->setCaseSensitivity(state == Qt::Checked ? Qt::CaseSensitive : Qt::CaseInsensitive);
}

QString FifDialog::getLastDir(const QString& where) const
{
    const QStringList parts = where.split(QLatin1Char(';'), Qt::KeepEmptyParts, Qt::CaseSensitive);
    for (auto it = parts.crbegin(); it != parts.crend(); ++it) {
        if (!it->isEmpty() && QDir(*it).exists())
            return *it;
    }
    return QDir::currentPath();
}

QString FifDialog::chooseFolder()
{
    const QString startFolder = getLastDir(form->where->currentText());
    return QDir::toNativeSeparators(QFileDialog::getExistingDirectory(
            this, tr("Find Directory"), startFolder, QFileDialog::ShowDirsOnly));
}

void FifDialog::readSettings()
{
    if (!settings)
        return;
    showHistory(*form->what, keys.getWhatHistory(settings));
    if (QLineEdit* edit = form->what->lineEdit())
        edit->selectAll();
    // Starts from the form's own defaults, which a request shares.
    FifInput stored;
    keys.readInput(settings, stored);
    showOptions(stored);
    showHistory(*form->where, keys.getWhereHistory(settings));
    form->filter->setCurrentIndex(0);
}

void FifDialog::showOptions(const FifInput& input)
{
    const bool matchCase = input.matchCase == Qt::CaseSensitive;
    form->matchCase->setCheckState(checkState(matchCase));
    onMatchCaseChanged(form->matchCase->checkState());
    if (input.matchType == QRegExp::FixedString)
        form->literal->setChecked(true);
    else if (input.matchType == QRegExp::Wildcard)
        form->wildcard->setChecked(true);
    else
        form->regexp->setChecked(true);
    form->matchWord->setCheckState(checkState(input.matchWord));
    form->includeSubDir->setCheckState(checkState(input.includeSubFolders));
}

void FifDialog::showHistory(QComboBox& box, const QStringList& entries)
{
    QLineEdit* edit = box.lineEdit();
    if (entries.isEmpty() || !edit)
        return;
    const QString typed = edit->text();
    box.clear();
    box.addItems(entries);
    if (typed.isEmpty())
        box.setCurrentIndex(0);
    else
        box.setEditText(typed);
}

QStringList FifDialog::takeHistory(QComboBox& box)
{
    if (box.lineEdit()) {
        putOnTop(box, box.lineEdit()->text());
        box.setCurrentIndex(0);
    }
    QStringList entries;
    entries.reserve(box.count());
    for (int i = 0; i < box.count(); ++i)
        entries << box.itemText(i);
    return entries;
}

} // namespace Orba
} // namespace Gui
