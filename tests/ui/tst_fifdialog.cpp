#include "FifDialog.h"
#include "FifHitsModel.h"
#include "FifInput.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifSettings.h"
#include "ImageManager.h"
#include "Settings.h"
#include "TestTree.h"

#include <QApplication>
#include <QCheckBox>
#include <QComboBox>
#include <QCompleter>
#include <QFileDialog>
#include <QLabel>
#include <QLineEdit>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QRadioButton>
#include <QToolButton>
#include <QtTest>

#include <functional>

using namespace Gui::Orba;

namespace {

// A job whose run holds until it is asked to stop, so that a test sees it
// running for as long as it needs to.
class HoldingJob : public FifJob
{
public:
    using FifJob::FifJob;

protected:
    void run() override
    {
        while (!shouldStop())
            QThread::msleep(2);
        setShouldStop(false);
    }
};

// Watches for the message boxes and folder choosers that the dialog opens
// modally and answers each one once.
class ModalWatch : public QObject
{
public:
    explicit ModalWatch(std::function<void(QWidget*)> answer)
        : answer(std::move(answer))
    {
        connect(&timer, &QTimer::timeout, this, &ModalWatch::poll);
        timer.start(5);
    }

    int seen = 0;
    QString title;
    QString text;
    QMessageBox::Icon icon = QMessageBox::NoIcon;
    QMessageBox::StandardButtons buttons;
    QString startFolder;

private:
    void poll()
    {
        QWidget* modal = QApplication::activeModalWidget();
        if (!modal || modal == last)
            return;
        if (auto box = qobject_cast<QMessageBox*>(modal)) {
            title = box->windowTitle();
            text = box->text();
            icon = box->icon();
            buttons = box->standardButtons();
        } else if (auto chooser = qobject_cast<QFileDialog*>(modal)) {
            title = chooser->windowTitle();
            startFolder = chooser->directory().absolutePath();
        } else {
            return;
        }
        last = modal;
        ++seen;
        answer(modal);
    }

    std::function<void(QWidget*)> answer;
    QPointer<QWidget> last;
    QTimer timer;
};

void pressOk(QWidget* modal)
{
    if (auto box = qobject_cast<QMessageBox*>(modal))
        box->button(QMessageBox::Ok)->click();
    else if (auto dialog = qobject_cast<QDialog*>(modal))
        dialog->reject();
}

// Answers a folder chooser with `folder`, or cancels it for an empty one.
std::function<void(QWidget*)> choose(const QString& folder)
{
    return [folder](QWidget* modal) {
        auto chooser = qobject_cast<QFileDialog*>(modal);
        if (!chooser || folder.isEmpty()) {
            pressOk(modal);
            return;
        }
        // With nothing typed or selected, a folder chooser answers the folder
        // it shows; selecting an entry instead races with the chooser's own
        // asynchronous listing of the folder's contents.
        chooser->setDirectory(folder);
        if (auto edit = chooser->findChild<QLineEdit*>("fileNameEdit"))
            edit->clear();
        static_cast<QDialog*>(chooser)->accept();
    };
}

// The widgets of one dialog, found by their object names.
struct Controls
{
    explicit Controls(QDialog& dialog) : d(dialog) {}
    template <typename T> T* find(const char* name) const { return d.findChild<T*>(name); }
    QStringList items(QComboBox* box) const
    {
        QStringList texts;
        for (int i = 0; i < box->count(); ++i)
            texts << box->itemText(i);
        return texts;
    }

    QDialog& d;
    QComboBox* what = find<QComboBox>("what");
    QComboBox* where = find<QComboBox>("where");
    QComboBox* filter = find<QComboBox>("filter");
    QCheckBox* matchCase = find<QCheckBox>("matchCase");
    QCheckBox* matchWord = find<QCheckBox>("matchWord");
    QCheckBox* includeSubDir = find<QCheckBox>("includeSubDir");
    QRadioButton* literal = find<QRadioButton>("literal");
    QRadioButton* regexp = find<QRadioButton>("regexp");
    QToolButton* browse = find<QToolButton>("browse");
    QToolButton* append = find<QToolButton>("append");
    QPushButton* start = find<QPushButton>("start");
    QPushButton* stop = find<QPushButton>("stop");
    QPushButton* cancel = find<QPushButton>("cancel");
    QPushButton* help = find<QPushButton>("help");
    // What a running job leaves disabled.
    QList<QWidget*> form = {find<QWidget>("label"), what, find<QWidget>("groupBox"),
                            find<QWidget>("groupBox_3"), help, where, filter, browse, append,
                            regexp, matchCase};
};

bool enabled(const QList<QWidget*>& widgets, bool state)
{
    for (QWidget* w : widgets) {
        if (w->isEnabled() != state)
            return false;
    }
    return true;
}

// Checks which match type button is on.
bool checkedType(QDialog& dialog, const QString& checked)
{
    for (const QString name : {"literal", "wildcard", "regexp"}) {
        if (dialog.findChild<QRadioButton*>(name)->isChecked() != (name == checked))
            return false;
    }
    return true;
}

bool hasFocus(QDialog& dialog, QComboBox* box)
{
    QWidget* focus = dialog.focusWidget();
    return focus && (focus == box || focus == box->lineEdit());
}

bool nothingStored(const Settings& settings)
{
    const FifSettings k;
    for (const QString& key : {k.getFindWhatKeyPath(), k.getMatchCaseKeyPath(),
                               k.getMatchWordKeyPath(), k.getMatchTypeKeyPath(),
                               k.getWhereKeyPath(), k.getFilterKeyPath(),
                               k.getIncludeSubFolderKeyPath()}) {
        if (!settings.getValue(key).isNull())
            return false;
    }
    return true;
}

// Waits until the job has ended and its last signals have been delivered.
bool waitForEnd(FifJob* job)
{
    if (!QTest::qWaitFor([job] { return !job->isRunning(); }, 10000))
        return false;
    QCoreApplication::processEvents();
    return true;
}

} // namespace

class tst_FifDialog : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        // Keep the folder chooser a widget dialog that the test can answer.
        QCoreApplication::setAttribute(Qt::AA_DontUseNativeDialogs, true);
        QVERIFY(tree.isValid());
        QVERIFY(TestTree::write(tree.path(), "a.txt", "alpha\nbeta\nspaced   out\n"));
        QVERIFY(TestTree::write(tree.path(), "sub/b.txt", "Alpha beta\nnothing\n"));
        QVERIFY(TestTree::write(tree.path(), "sub/c.log", "alpha\n"));
        QVERIFY(QDir().mkpath(tree.filePath("one")));
        QVERIFY(QDir().mkpath(tree.filePath("two")));
    }

    void initialState()
    {
        Settings settings;
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        QVERIFY(dialog.isModal());
        QVERIFY(!dialog.windowIcon().isNull());
        QCOMPARE(c.where->completer()->caseSensitivity(), Qt::CaseInsensitive);
        QVERIFY(c.start->isEnabled());
        QVERIFY(c.start->isDefault());
        QVERIFY(!c.stop->isEnabled());
        QVERIFY(c.literal->isChecked());
        QVERIFY(c.includeSubDir->isChecked());
    }

    // What pressing Find does with the text typed: refused with a message
    // (title given), or searched for as typed.
    void startChecksTheText_data()
    {
        QTest::addColumn<QString>("what");
        QTest::addColumn<QString>("type");
        QTest::addColumn<bool>("withJob");
        QTest::addColumn<QString>("title");
        QTest::addColumn<int>("hits");
        QTest::newRow("empty") << "" << "literal" << true << "Empty Expression" << 0;
        QTest::newRow("empty, no job") << "" << "literal" << false << "Empty Expression" << 0;
        QTest::newRow("bad regexp") << "(" << "regexp" << true << "Bad Expression" << 0;
        QTest::newRow("( as literal") << "(" << "literal" << true << "" << 0;
        QTest::newRow("( as wildcard") << "(" << "wildcard" << true << "" << 0;
        QTest::newRow("blanks only") << "   " << "literal" << true << "" << 1;
        QTest::newRow("no job") << "alpha" << "literal" << false << "" << 0;
    }

    void startChecksTheText()
    {
        QFETCH(QString, what);
        QFETCH(QString, type);
        QFETCH(bool, withJob);
        QFETCH(QString, title);
        QFETCH(int, hits);
        Settings settings;
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        if (withJob)
            dialog.setJob(job);
        dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));
        dialog.findChild<QRadioButton*>(type)->setChecked(true);
        c.what->setEditText(what);
        c.where->setEditText(tree.path());
        c.help->setFocus();

        ModalWatch watch(pressOk);
        c.start->click();
        if (!title.isEmpty()) {
            const QString message = type == "regexp"
                ? QRegExp(what, Qt::CaseInsensitive, QRegExp::RegExp2).errorString() + ": \"(\""
                : "Please enter the search expression in the \"Find what:\" field.";
            QCOMPARE(watch.seen, 1);
            QCOMPARE(watch.title, title);
            QCOMPARE(watch.text, message);
            QCOMPARE(watch.icon, QMessageBox::Critical);
            QCOMPARE(watch.buttons, QMessageBox::StandardButtons(QMessageBox::Ok));
            // Back to the text, selected, for the user to mend.
            QVERIFY(hasFocus(dialog, c.what));
            QCOMPARE(c.what->lineEdit()->selectedText(), what);
        } else if (withJob) {
            QVERIFY(waitForEnd(job));
            QCOMPARE(watch.seen, 0);
            QVERIFY(!dialog.isVisible());
            QCOMPARE(job->getInput().what, what);
            QCOMPARE(job->getLineHitCount(), hits);
            QCOMPARE(settings.getValue(FifSettings().getFindWhatKeyPath()).toStringList(),
                     QStringList{what});
            return;
        }
        QCoreApplication::processEvents();
        QCOMPARE(watch.seen, title.isEmpty() ? 0 : 1);
        QVERIFY(dialog.isVisible());
        QVERIFY(!job->isRunning());
        QCOMPARE(job->getInput().what, QString());
        QVERIFY(nothingStored(settings));
    }
    void requestAndStoredEntriesFollowTheForm_data()
    {
        QTest::addColumn<QString>("type");
        QTest::addColumn<bool>("matchCase");
        QTest::addColumn<bool>("matchWord");
        QTest::addColumn<bool>("subFolders");
        QTest::addColumn<int>("requestType");
        QTest::addColumn<int>("storedType");
        QTest::addColumn<int>("hits");
        QTest::newRow("literal") << "literal" << false << false << true
                                 << int(QRegExp::FixedString) << 2 << 2;
        QTest::newRow("literal, case") << "literal" << true << false << true
                                       << int(QRegExp::FixedString) << 2 << 1;
        QTest::newRow("wildcard, word") << "wildcard" << false << true << true
                                        << int(QRegExp::Wildcard) << 1 << 2;
        QTest::newRow("regexp, top folder") << "regexp" << true << true << false
                                            << int(QRegExp::RegExp2) << 0 << 1;
    }

    void requestAndStoredEntriesFollowTheForm()
    {
        QFETCH(QString, type);
        QFETCH(bool, matchCase);
        QFETCH(bool, matchWord);
        QFETCH(bool, subFolders);
        QFETCH(int, requestType);
        QFETCH(int, storedType);
        QFETCH(int, hits);
        Settings settings;
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        dialog.setJob(job);
        dialog.setFilters({"*.txt", "*.log"});
        const QString pattern = type == "wildcard" ? "al?ha" : type == "regexp" ? "alph[a]" : "alpha";
        c.what->setEditText(pattern);
        dialog.findChild<QRadioButton*>(type)->setChecked(true);
        c.matchCase->setChecked(matchCase);
        c.matchWord->setChecked(matchWord);
        c.includeSubDir->setChecked(subFolders);
        c.where->setEditText(tree.path());
        c.filter->setCurrentIndex(1);
        c.filter->setCurrentIndex(0);

        c.start->click();
        QVERIFY(waitForEnd(job));
        const FifInput request = job->getInput();
        QCOMPARE(request.what, pattern);
        QCOMPARE(request.matchType, requestType);
        QCOMPARE(request.matchCase, matchCase ? int(Qt::CaseSensitive) : int(Qt::CaseInsensitive));
        QCOMPARE(request.matchWord, matchWord);
        QCOMPARE(request.includeSubFolders, subFolders);
        QCOMPARE(request.where, tree.path());
        QCOMPARE(request.filter, QString("*.txt"));
        QCOMPARE(job->getLineHitCount(), hits);

        const FifSettings keys;
        QCOMPARE(settings.getValue(keys.getMatchTypeKeyPath()).toInt(), storedType);
        QCOMPARE(settings.getValue(keys.getMatchCaseKeyPath()).toBool(), matchCase);
        QCOMPARE(settings.getValue(keys.getMatchWordKeyPath()).toBool(), matchWord);
        QCOMPARE(settings.getValue(keys.getIncludeSubFolderKeyPath()).toBool(), subFolders);
        QCOMPARE(settings.getValue(keys.getFilterKeyPath()).toString(), QString("*.txt"));
        QCOMPARE(settings.getValue(keys.getWhereKeyPath()).toStringList(), QStringList{tree.path()});
    }

    void aRunningJobLeavesOnlyStopAndCancel()
    {
        FifManager manager;
        auto job = new HoldingJob(&manager);
        QVERIFY(job->start(FifInput()));
        Settings settings;
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        dialog.setJob(job);
        dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));

        QVERIFY(c.stop->isEnabled() && c.stop->isDefault() && c.cancel->isEnabled());
        QVERIFY(!c.start->isEnabled() && !c.start->isDefault());
        QVERIFY(enabled(c.form, false));

        // At the job's end, Find and the focus come back.
        c.help->setFocus();
        c.stop->click();
        QTRY_VERIFY(c.start->isEnabled());
        QVERIFY(!job->isRunning());
        QVERIFY(c.start->isDefault());
        QVERIFY(!c.stop->isEnabled() && !c.stop->isDefault());
        QVERIFY(enabled(c.form, true));
        QVERIFY(hasFocus(dialog, c.what));
    }

    void anotherJobTakesOverTheButtons()
    {
        FifManager manager;
        auto first = new HoldingJob(&manager);
        auto second = new HoldingJob(&manager);
        FifDialog dialog(nullptr, nullptr);
        Controls c(dialog);
        dialog.setJob(first);
        dialog.setJob(second);

        // A job started while the dialog is open is followed.
        QVERIFY(second->start(FifInput()));
        QTRY_VERIFY(c.stop->isEnabled());
        QVERIFY(!c.start->isEnabled() && !c.what->isEnabled());
        QVERIFY(first->start(FifInput()));
        c.stop->click();
        QTRY_VERIFY(!second->isRunning());
        QTRY_VERIFY(c.start->isEnabled());
        // The first job is no longer the dialog's: its stop was not asked for.
        QVERIFY(first->isRunning());
        QVERIFY(!first->shouldStop());
        first->stop();
        QVERIFY(waitForEnd(first));
        QVERIFY(c.start->isEnabled());

        dialog.setJob(nullptr);
        QVERIFY(!dialog.getJob());
        QVERIFY(second->start(FifInput()));
        c.stop->click();
        QVERIFY(!second->shouldStop());
        second->stop();
        QVERIFY(waitForEnd(second));
    }

    void browseOpensAtTheLastExistingFolder_data()
    {
        QTest::addColumn<QString>("folders");
        QTest::addColumn<QString>("expected");
        const QString one = tree.filePath("one");
        const QString two = tree.filePath("two");
        const QString none = tree.filePath("none");
        const QString here = QDir::currentPath();
        QTest::newRow("missing, existing") << none + ";" + one << one;
        QTest::newRow("existing, missing") << one + ";" + none << one;
        QTest::newRow("two existing") << one + ";" + two << two;
        QTest::newRow("trailing separator") << two + ";" << two;
        QTest::newRow("none existing") << none + ";" + none + "2" << here;
        QTest::newRow("empty") << QString() << here;
    }

    void browseOpensAtTheLastExistingFolder()
    {
        QFETCH(QString, folders);
        QFETCH(QString, expected);
        FifDialog dialog(nullptr, nullptr);
        Controls c(dialog);
        c.where->setEditText(folders);
        for (QToolButton* button : {c.browse, c.append}) {
            ModalWatch watch(choose(QString()));
            button->click();
            QCOMPARE(watch.seen, 1);
            QCOMPARE(watch.title, QString("Find Directory"));
            QCOMPARE(watch.startFolder, QDir(expected).absolutePath());
            // Cancelled: nothing changes.
            QCOMPARE(c.where->currentText(), folders);
            QCOMPARE(c.where->count(), 0);
        }
    }

    void appendAddsToTheFolderList_data()
    {
        QTest::addColumn<QString>("folders");
        QTest::addColumn<QString>("prefix");
        QTest::newRow("ends with separator") << "C:\\a;" << "C:\\a;";
        QTest::newRow("one folder") << "C:\\a" << "C:\\a;";
        QTest::newRow("surrounding blanks") << "  C:\\a  " << "C:\\a;";
        QTest::newRow("three blanks") << "   " << "";
        QTest::newRow("empty") << "" << "";
    }

    void appendAddsToTheFolderList()
    {
        QFETCH(QString, folders);
        QFETCH(QString, prefix);
        FifDialog dialog(nullptr, nullptr);
        Controls c(dialog);
        c.where->setEditText(folders);
        ModalWatch watch(choose(tree.filePath("two")));
        c.append->click();
        QCOMPARE(watch.seen, 1);
        const QString expected = prefix + QDir::toNativeSeparators(tree.filePath("two"));
        QCOMPARE(c.where->currentText(), expected);
        QCOMPARE(c.where->currentIndex(), 0);
        QCOMPARE(c.items(c.where), QStringList{expected});
    }

    void theFolderHistoryKeepsTwentyEntries()
    {
        const QString one = QDir::toNativeSeparators(tree.filePath("one"));
        const QString two = QDir::toNativeSeparators(tree.filePath("two"));
        QStringList stored;
        for (int i = 0; i < 20; ++i)
            stored << (i == 7 ? one : QString("/folder%1").arg(i));
        Settings settings;
        settings.setValue(FifSettings().getWhereKeyPath(), stored);
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        QCOMPARE(c.items(c.where), stored);

        {
            ModalWatch watch(choose(two));
            c.browse->click();
            QCOMPARE(watch.seen, 1);
        }
        QStringList expected = stored;
        expected.removeLast();
        expected.prepend(two);
        QCOMPARE(c.items(c.where), expected);

        // A folder already in the history moves to the top; nothing is lost.
        {
            ModalWatch watch(choose(one));
            c.browse->click();
            QCOMPARE(watch.seen, 1);
        }
        expected.removeAll(one);
        expected.prepend(one);
        QCOMPARE(c.items(c.where), expected);
        QCOMPARE(c.where->count(), 20);
        QCOMPARE(c.where->currentText(), one);
    }

    void storedMatchType_data()
    {
        QTest::addColumn<QVariant>("stored");
        QTest::addColumn<QString>("checked");
        QTest::newRow("0") << QVariant(0) << "regexp";
        QTest::newRow("1") << QVariant(1) << "wildcard";
        QTest::newRow("2") << QVariant(2) << "literal";
        QTest::newRow("3") << QVariant(3) << "literal";
        QTest::newRow("7") << QVariant(7) << "literal";
        QTest::newRow("-1") << QVariant(-1) << "literal";
        QTest::newRow("missing") << QVariant() << "literal";
    }

    void storedMatchType()
    {
        QFETCH(QVariant, stored);
        QFETCH(QString, checked);
        Settings settings;
        if (stored.isValid())
            settings.setValue(FifSettings().getMatchTypeKeyPath(), stored);
        FifDialog dialog(&settings, nullptr);
        QVERIFY(checkedType(dialog, checked));
    }

    void storedEntriesFillTheForm()
    {
        const FifSettings keys;
        Settings settings;
        settings.setValue(keys.getFindWhatKeyPath(), QStringList{"beta", "alpha"});
        settings.setValue(keys.getMatchCaseKeyPath(), true);
        settings.setValue(keys.getMatchWordKeyPath(), true);
        settings.setValue(keys.getWhereKeyPath(), QStringList{"/w1", "/w2"});
        settings.setValue(keys.getIncludeSubFolderKeyPath(), false);
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        QCOMPARE(c.items(c.what), QStringList({"beta", "alpha"}));
        QCOMPARE(c.what->currentText(), QString("beta"));
        QCOMPARE(c.what->lineEdit()->selectedText(), QString("beta"));
        QVERIFY(c.matchCase->isChecked());
        QCOMPARE(c.what->completer()->caseSensitivity(), Qt::CaseSensitive);
        QVERIFY(c.matchWord->isChecked());
        QCOMPARE(c.items(c.where), QStringList({"/w1", "/w2"}));
        QCOMPARE(c.where->currentText(), QString("/w1"));
        QVERIFY(!c.includeSubDir->isChecked());

        c.matchCase->setChecked(false);
        QCOMPARE(c.what->completer()->caseSensitivity(), Qt::CaseInsensitive);

        // Empty lists add no empty entries.
        settings.setValue(keys.getFindWhatKeyPath(), QStringList());
        settings.setValue(keys.getWhereKeyPath(), QStringList());
        FifDialog empty(&settings, nullptr);
        Controls e(empty);
        QCOMPARE(e.what->count() + e.where->count(), 0);
    }

    void setInputSelectsOrAdds()
    {
        Settings settings;
        settings.setValue(FifSettings().getFindWhatKeyPath(), QStringList{"a", "b"});
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        dialog.setFilters({"*.cpp", "*.h"});
        FifInput input;
        input.what = "b";
        input.where = "/src";
        input.filter = "*.h";
        dialog.setInput(input);
        QCOMPARE(c.items(c.what), QStringList({"a", "b"}));
        QCOMPARE(c.what->currentIndex(), 1);
        QCOMPARE(c.items(c.where), QStringList{"/src"});
        QCOMPARE(c.items(c.filter), QStringList({"*.cpp", "*.h"}));
        QCOMPARE(c.filter->currentIndex(), 1);

        // Exact, case-sensitive lookup: a text differing in case is added.
        input.what = "B";
        input.filter = "*.txt";
        dialog.setInput(input);
        QCOMPARE(c.items(c.what), QStringList({"a", "b", "B"}));
        QCOMPARE(c.what->currentIndex(), 2);
        QCOMPARE(c.items(c.filter), QStringList({"*.cpp", "*.h", "*.txt"}));
        QCOMPARE(c.filter->currentText(), QString("*.txt"));

        // An empty text shows as empty but is no history entry, so it is
        // not stored with the next search.
        input.what.clear();
        dialog.setInput(input);
        QCOMPARE(c.items(c.what), QStringList({"a", "b", "B"}));
        QCOMPARE(c.what->currentText(), QString());
    }

    void setInputMapsTheOptions_data()
    {
        QTest::addColumn<int>("matchType");
        QTest::addColumn<int>("matchCase");
        QTest::addColumn<bool>("matchWord");
        QTest::addColumn<bool>("subFolders");
        QTest::addColumn<QString>("checked");
        QTest::newRow("fixed string") << int(QRegExp::FixedString) << 1 << true << false << "literal";
        QTest::newRow("wildcard") << int(QRegExp::Wildcard) << 0 << false << true << "wildcard";
        QTest::newRow("regexp2") << int(QRegExp::RegExp2) << 1 << true << true << "regexp";
        QTest::newRow("regexp") << int(QRegExp::RegExp) << 2 << false << false << "regexp";
        QTest::newRow("other") << 7 << -1 << false << true << "regexp";
    }

    void setInputMapsTheOptions()
    {
        QFETCH(int, matchType);
        QFETCH(int, matchCase);
        QFETCH(bool, matchWord);
        QFETCH(bool, subFolders);
        QFETCH(QString, checked);
        FifDialog dialog(nullptr, nullptr);
        Controls c(dialog);
        // Start from the opposite of each expected state.
        c.matchCase->setChecked(matchCase != 1);
        c.matchWord->setChecked(!matchWord);
        c.includeSubDir->setChecked(!subFolders);
        FifInput input;
        input.what = "x";
        input.matchType = matchType;
        input.matchCase = matchCase;
        input.matchWord = matchWord;
        input.includeSubFolders = subFolders;
        dialog.setInput(input);
        QVERIFY(checkedType(dialog, checked));
        QCOMPARE(c.matchCase->isChecked(), matchCase == 1);
        QCOMPARE(c.what->completer()->caseSensitivity(),
                 matchCase == 1 ? Qt::CaseSensitive : Qt::CaseInsensitive);
        QCOMPARE(c.matchWord->isChecked(), matchWord);
        QCOMPARE(c.includeSubDir->isChecked(), subFolders);
    }



    void anEmptyFilterIsNotStored()
    {
        const FifSettings keys;
        Settings settings;
        settings.setValue(keys.getFilterKeyPath(), QString("*.old"));
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        dialog.setJob(job);
        dialog.setFilters({"*.cpp;*.h", "*"});
        QCOMPARE(c.filter->currentText(), QString("*.cpp;*.h"));
        dialog.setFilters({});
        QCOMPARE(c.filter->count(), 0);
        c.what->setEditText("alpha");
        c.where->setEditText(tree.path());
        c.start->click();
        QVERIFY(waitForEnd(job));
        QCOMPARE(job->getInput().filter, QString());
        QCOMPARE(settings.getValue(keys.getFilterKeyPath()).toString(), QString("*.old"));
        QCOMPARE(settings.getValue(keys.getFindWhatKeyPath()).toStringList(), QStringList{"alpha"});
    }

    void cancelClosesWithoutStoring()
    {
        Settings settings;
        FifManager manager;
        FifDialog dialog(&settings, nullptr);
        Controls c(dialog);
        dialog.setJob(manager.getJob(0));
        c.what->setEditText("alpha");
        QTimer::singleShot(0, c.cancel, &QPushButton::click);
        QCOMPARE(dialog.exec(), int(QDialog::Rejected));
        QVERIFY(!manager.getJob(0)->isRunning());
        QVERIFY(nothingStored(settings));
    }

    void historiesReachTheNextDialog()
    {
        QTemporaryDir storeDir;
        QVERIFY(storeDir.isValid());
        const QString file = storeDir.filePath("host.ini");
        const FifSettings keys;
        {
            Settings earlier(file);
            earlier.setValue(keys.getFindWhatKeyPath(), QStringList{"beta", "alpha"});
            earlier.setValue(keys.getWhereKeyPath(), QStringList{"/elsewhere"});
            earlier.sync();
        }

        FifManager manager;
        FifJob* job = manager.getJob(0);
        {
            Settings settings(file);
            FifInput request("*.txt");
            request.setContents(&settings);
            QCOMPARE(request.what, QString("beta"));
            request.what = "alpha";
            request.where = tree.path();

            FifDialog dialog(&settings, nullptr);
            Controls c(dialog);
            QCOMPARE(c.items(c.what), QStringList({"beta", "alpha"}));
            dialog.setJob(job);
            dialog.setFilters({"*.txt", "*"});
            dialog.setInput(request);
            QCOMPARE(c.what->currentText(), QString("alpha"));

            ModalWatch watch(pressOk);
            QTimer::singleShot(0, c.start, &QPushButton::click);
            dialog.exec();
            QCOMPARE(watch.seen, 0);
            QVERIFY(!dialog.isVisible());
            QVERIFY(waitForEnd(job));
            QCOMPARE(job->getLineHitCount(), 2);
            settings.sync();
        }

        Settings later(file);
        QCOMPARE(later.getValue(keys.getFindWhatKeyPath()).toStringList(),
                 QStringList({"alpha", "beta"}));
        QCOMPARE(later.getValue(keys.getWhereKeyPath()).toStringList(),
                 QStringList({tree.path(), "/elsewhere"}));
        QCOMPARE(later.getValue(keys.getFilterKeyPath()).toString(), QString("*.txt"));
        QCOMPARE(later.getValue(keys.getMatchTypeKeyPath()).toInt(), 2);

        FifInput request;
        request.setContents(&later);
        FifDialog next(&later, nullptr);
        Controls c(next);
        next.setFilters({"*", "*.txt"});
        next.setInput(request);
        QCOMPARE(c.items(c.what), QStringList({"alpha", "beta"}));
        QCOMPARE(c.what->currentText(), QString("alpha"));
        QCOMPARE(c.items(c.where), QStringList({tree.path(), "/elsewhere"}));
        QCOMPARE(c.where->currentText(), tree.path());
        QCOMPARE(c.filter->currentText(), QString("*.txt"));
        QVERIFY(c.literal->isChecked());
    }

private:
    QTemporaryDir tree;
};

QTEST_MAIN(tst_FifDialog)
#include "tst_fifdialog.moc"
