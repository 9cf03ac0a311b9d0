#include "FifDialog.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "FifSettings.h"
#include "FifTest.h"

#include <QtTest>
#include <QtWidgets>

using namespace Gui::Orba;
using FifTest::holdUntilStopped;
using FifTest::items;

template <class T = QPushButton>
T* part(const QWidget& dialog, const QString& name) { return dialog.findChild<T*>(name); }
QComboBox* box(const QWidget& dialog, const char* name) { return part<QComboBox>(dialog, name); }

class tst_FifDialog : public QObject
{
    Q_OBJECT

    const FifSettings keys;
    QTemporaryDir tree;
    FifManager manager;
    FifJob* job = manager.getJob(0);

private slots:
    void initTestCase()
    {
        // The folder chooser stays a widget dialog that the test can answer.
        QCoreApplication::setAttribute(Qt::AA_DontUseNativeDialogs);
        QVERIFY(FifTest::write(tree.path(), "one/a.txt", "alpha\n") && QDir(tree.path()).mkdir("two"));
        FifTest::watch(job->getHitsModel());
    }

    // Find refuses a missing or broken expression with a message and hands the
    // text back, selected. While the job runs only Stop, the default, and Cancel
    // are usable; at its end Find is the default again. Cancel stores nothing.
    void refusalsRunningJobAndCancel()
    {
        Settings store; FifDialog dialog(&store, nullptr);
        dialog.setJob(job); dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));
        QPushButton *start = part(dialog, "start"), *stop = part(dialog, "stop");
        QPushButton* cancel = part(dialog, "cancel");
        const auto usable = [&] { // how many of the dialog's parts are enabled
            const auto parts = dialog.findChildren<QWidget*>(QString(), Qt::FindDirectChildrenOnly);
            return std::count_if(parts.begin(), parts.end(), [](QWidget* part) { return part->isEnabled(); });
        };
        const auto idle = usable();
        QVERIFY(start->isDefault() && !stop->isDefault() && !stop->isEnabled());
        part<QRadioButton>(dialog, "regexp")->setChecked(true);
        for (const QString& what : QStringList{"", "a("}) {
            box(dialog, "what")->setEditText(what);
            QString title; // a zero timeout: only a box opened by the click itself is answered
            FifTest::answer<QMessageBox>([&](QMessageBox* b) { title = b->windowTitle(); b->accept(); }, 0);
            start->click();
            QCOMPARE(title, what.isEmpty() ? "Empty Expression" : "Bad Expression");
            QVERIFY(dialog.isVisible() && box(dialog, "what")->lineEdit()->selectedText() == what);
        }
        QVERIFY(!job->isRunning() && job->getInput().what.isEmpty());

        const auto hold = holdUntilStopped(job);
        FifTest::EndWatcher end(job);
        QVERIFY(job->start(FifTest::request("alpha", tree.path())));
        QTRY_VERIFY(stop->isEnabled());
        QVERIFY(usable() == 2 && cancel->isEnabled() && stop->isDefault() && !start->isDefault());
        stop->click();
        QVERIFY(end.wait() && disconnect(hold));
        QVERIFY(usable() == idle && start->isDefault() && !stop->isDefault());
        cancel->click();
        QVERIFY(!dialog.isVisible() && store.getValue(keys.getFindWhatKeyPath()).isNull());
    }

    // The form becomes the job's request and the stored entries (histories
    // newest first, each once), from which the next dialog, reading the
    // settings file anew, makes the same request.
    void theFormReachesJobStoreAndNextDialog_data()
    {
        QTest::addColumn<QString>("what");
        QTest::addColumn<int>("type");
        QTest::addColumn<QString>("flags"); // c: match case, w: whole word, s: subfolders
        QTest::addColumn<QString>("filter");
        QTest::newRow("literal") << "a(" << int(QRegExp::FixedString) << "s" << "*.txt";
        QTest::newRow("wildcard, case") << "al?ha" << int(QRegExp::Wildcard) << "c" << "*.log";
        QTest::newRow("regexp, word, no filter") << "alph[a]" << int(QRegExp::RegExp2) << "ws" << "";
        QTest::newRow("the latest again, blanks") << "  " << int(QRegExp::FixedString) << "cws" << "*";
    }

    void theFormReachesJobStoreAndNextDialog()
    {
        QFETCH(QString, what);
        QFETCH(int, type);
        QFETCH(QString, flags);
        QFETCH(QString, filter);
        auto request = FifTest::request(what, tree.path(), type, flags.contains('c'), flags.contains('w'));
        request.includeSubFolders = flags.contains('s'); request.filter = filter;
        const auto find = [this](FifDialog& dialog) {
            FifTest::EndWatcher end(job);
            part(dialog, "start")->click();
            return end.wait() && !dialog.isVisible();
        };
        QTemporaryDir home; // a real settings file, read anew by the next dialog
        const QString file = home.filePath("host.ini");
        {
            Settings store(file);
            store.setValue(keys.getFindWhatKeyPath(), QStringList{"  ", "alpha"});
            store.setValue(keys.getWhereKeyPath(), QStringList{"/elsewhere"});
            store.setValue(keys.getFilterKeyPath(), QString("*.old"));
            FifDialog dialog(&store, nullptr);
            dialog.setJob(job); dialog.setFilters({"*.txt", "*.log"}); dialog.setInput(request);
            QVERIFY(find(dialog) && job->getInput().toString() == request.toString());
        }
        Settings later(FifTest::freshCopy(file));
        QStringList history{what, "  ", "alpha"};
        history.removeDuplicates(); // newest first, each once
        QCOMPARE(later.getValue(keys.getFindWhatKeyPath()).toStringList(), history);
        QCOMPARE(later.getValue(keys.getWhereKeyPath()).toStringList().join(';'), tree.path() + ";/elsewhere");
        request.filter = later.getValue(keys.getFilterKeyPath()).toString();
        QCOMPARE(request.filter, filter.isEmpty() ? "*.old" : filter); // an empty one is not stored
        FifDialog next(&later, nullptr);
        next.setJob(job); next.setFilters({request.filter});
        QCOMPARE(items(box(next, "what")), history);
        QVERIFY(find(next) && job->getInput().toString() == request.toString());
    }

    // Browse puts the chosen folder on top of the list, Append adds it to the
    // folders typed; both open at the last existing folder typed. The list
    // keeps the 20 most recent entries, newest first, each once.
    void theFolderChooser()
    {
        const QString one = tree.filePath("one"), two = tree.filePath("two");
        const QString none = tree.filePath("none"), here = QDir::currentPath();
        QStringList history;
        for (int i = 0; i < 20; ++i)
            history << (i == 7 ? one : QString("/folder%1").arg(i));
        Settings store;
        store.setValue(keys.getWhereKeyPath(), history);
        FifDialog dialog(&store, nullptr);
        struct Step { QString tool, typed, chosen, openedAt, result; };
        for (const Step& step : {Step{"browse", none + ";" + one, two, one, two},
                                 Step{"browse", "", one, here, one},
                                 Step{"browse", "", one, here, one},
                                 Step{"append", "/a", two, here, "/a;" + two},
                                 Step{"append", "  ", two, here, two}}) {
            box(dialog, "where")->setEditText(step.typed);
            QString openedAt;
            const auto answered = FifTest::answer<QFileDialog>([&](QFileDialog* chooser) {
                openedAt = chooser->directory().absolutePath();
                chooser->setDirectory(step.chosen); // with nothing typed, it answers the folder it shows
                chooser->findChild<QLineEdit*>("fileNameEdit")->clear();
                static_cast<QDialog*>(chooser)->accept();
            });
            part<QToolButton>(dialog, step.tool)->click();
            QVERIFY(*answered && openedAt == QDir(step.openedAt).absolutePath());
            history.removeAll(step.result);
            history = (QStringList(step.result) + history).mid(0, 20);
            QCOMPARE(items(box(dialog, "where")), history);
            QCOMPARE(box(dialog, "where")->currentText(), step.result);
        }
    }
};

FIF_HOST_TEST_MAIN(tst_FifDialog)
#include "tst_fifdialog.moc"
