#include "DockTest.h"
#include "FindDialogAnswer.h"
#include "FileViewer.h"
#include "FindInFilesWindow.h"

#include "FifDialog.h"
#include "FifHandler.h"
#include "FifHit.h"
#include "FifHitsModel.h"
#include "FifHitsView.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "FifSettings.h"
#include "HostTestMain.h"
#include "JobRunner.h"
#include "TestTree.h"

#include <QComboBox>
#include <QLabel>
#include <QMenu>
#include <QMenuBar>
#include <QProcess>
#include <QPushButton>
#include <QStatusBar>
#include <QTextBlock>
#include <QTimer>
#include <QTreeView>
#include <QtTest>

#include <functional>

using namespace Gui::Orba;

namespace {

// Answers the find dialog once it is up: `answer` fills it and presses a
// button. Returns false if no dialog came.
bool answerDialog(QAction* command, const std::function<void(FifDialog*)>& answer)
{
    return answerFindDialog([command] { command->trigger(); }, answer);
}

void search(FifDialog* dialog, const QString& what, const QString& where)
{
    dialog->findChild<QComboBox*>("what")->setEditText(what);
    dialog->findChild<QComboBox*>("where")->setEditText(where);
    dialog->findChild<QPushButton*>("start")->click();
}

QStringList menuTexts(QMenu* menu)
{
    QStringList texts;
    for (QAction* action : menu->actions())
        texts << (action->isSeparator() ? QString("-") : action->text());
    return texts;
}

QMenu* menuNamed(QMainWindow& window, const QString& title)
{
    for (QAction* action : window.menuBar()->actions()) {
        if (action->menu() && action->text().remove('&') == title)
            return action->menu();
    }
    return nullptr;
}

} // namespace

class tst_FindInFiles : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        const FifSettings keys;
        Settings* store = ApplicationBase::getInstance()->getSettings();
        for (const QString& key : {keys.getFindWhatKeyPath(), keys.getWhereKeyPath(),
                                   keys.getFilterKeyPath(), keys.getMatchTypeKeyPath(),
                                   keys.getMatchCaseKeyPath(), keys.getMatchWordKeyPath(),
                                   keys.getIncludeSubFolderKeyPath()})
            store->setValue(key, QVariant());
    }

    // Menus, tool bar and docks as the application sets them up.
    void startUp()
    {
        FindInFilesWindow window;
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));

        FifResultsDockWidget* first = window.getResultsDock(0);
        FifResultsDockWidget* second = window.getResultsDock(1);
        QVERIFY(first && second);
        QCOMPARE(first->objectName(), FifResultsDockWidget::Results1ObjectName());
        QCOMPARE(second->objectName(), FifResultsDockWidget::Results2ObjectName());
        QCOMPARE(window.dockWidgetArea(first), Qt::BottomDockWidgetArea);
        QCOMPARE(window.dockWidgetArea(second), Qt::BottomDockWidgetArea);
        QVERIFY(window.tabifiedDockWidgets(first).contains(second));
        QVERIFY(first->isVisible());
        QVERIFY(!second->isVisible());
        FifManager* manager = FifManager::getInstance(&window);
        QCOMPARE(viewOf(first)->getJob(), manager->getJob(0));
        QCOMPARE(viewOf(second)->getJob(), manager->getJob(1));
        QCOMPARE(window.centralWidget(), window.getViewer());
        QVERIFY(window.getViewer()->isReadOnly());

        QVERIFY(window.getFindAction()->isEnabled());
        QVERIFY(window.getHandler()->getActions().contains(window.getFindAction()));
        QVERIFY(!window.getNextAction()->isEnabled());
        QVERIFY(!window.getStopAction()->isEnabled());

        QMenu* edit = menuNamed(window, "Edit");
        QVERIFY(edit);
        QCOMPARE(menuTexts(edit), (QStringList{"Find in Files", "-", "Show Next Result",
                                               "Show Previous Result", "Stop"}));
        QMenu* view = menuNamed(window, "View");
        QVERIFY(view);
        QCOMPARE(view->actions(),
                 (QList<QAction*>{first->toggleViewAction(), second->toggleViewAction()}));
        QVERIFY(menuNamed(window, "Help"));

        // Showing the second dock from the View menu puts it in the tab group.
        second->toggleViewAction()->trigger();
        QTRY_VERIFY(second->isVisible());
        QVERIFY(window.tabifiedDockWidgets(first).contains(second));
    }

    // The find command follows the first dock whenever the Edit menu opens.
    void findCommandFollowsFirstDock()
    {
        FindInFilesWindow window;
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        QMenu* edit = menuNamed(window, "Edit");
        delete window.getResultsDock(0);
        QTRY_VERIFY(!window.getFindAction()->isEnabled());
        window.getFindAction()->setEnabled(true);
        emit edit->aboutToShow();
        QVERIFY(!window.getFindAction()->isEnabled());
    }

    // From the command to the hit shown in the viewer.
    void endToEnd()
    {
        QTemporaryDir dir;
        // CRLF line ends, characters outside ASCII before the match and a
        // UTF-16 file: the viewer must still land on the match itself.
        QVERIFY(TestTree::write(dir.path(), "a.txt",
                                "first line\r\nnothing here\r\nsome Needle at \xc3\xa4\xc3\xb6 needle\r\n"));
        QVERIFY(TestTree::write(dir.path(), "sub/b.txt", "\xc3\xa9t\xc3\xa9 needle\nend\n"));
        QByteArray utf16("\xff\xfe", 2);
        for (char c : QByteArray("x\r\nab needle\r\n"))
            utf16 += QByteArray(1, c) + QByteArray(1, '\0');
        QVERIFY(TestTree::write(dir.path(), "sub/c.txt", utf16));
        QVERIFY(TestTree::write(dir.path(), "d.txt", "no match\n"));

        FindInFilesWindow window(dir.path());
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        FifJob* job = FifManager::getInstance(&window)->getJob(0);
        JobRunner::EndWatcher watcher(job);

        QString offeredFolder;
        QVERIFY(answerDialog(window.getFindAction(), [&](FifDialog* dialog) {
            offeredFolder = dialog->findChild<QComboBox*>("where")->currentText();
            search(dialog, "needle", dir.path());
        }));
        QCOMPARE(offeredFolder, QDir::toNativeSeparators(dir.path()));
        QVERIFY(watcher.wait());

        FifHitsView* view = viewOf(window.getResultsDock(0));
        QTRY_COMPARE(view->getStatusLabel()->text(),
                     QString("Found 3 line(s) in 3 file(s) out of 4 file(s)"));
        QVERIFY(window.getNextAction()->isEnabled());
        QVERIFY(window.getPreviousAction()->isEnabled());
        QVERIFY(!window.getStopAction()->isEnabled());
        QVERIFY(window.getResultsDock(0)->isVisible());
        QVERIFY(!window.getResultsDock(1)->isVisible()); // not its search

        // Step through every hit with the shared next action.
        QAbstractItemModel* model = job->getHitsModel();
        QCOMPARE(model->rowCount(), 3);
        FileViewer* viewer = window.getViewer();
        auto* tree = view->findChild<QTreeView*>("treeView");
        tree->selectionModel()->clearCurrentIndex();
        for (int row = 0; row < model->rowCount(); ++row) {
            const FifHit hit = model->index(row, 0).data(Qt::UserRole).value<FifHit>();
            window.getNextAction()->trigger();
            QCOMPARE(viewer->getFilePath(), QFileInfo(QDir(dir.path()).absoluteFilePath(hit.file)).canonicalFilePath());
            QCOMPARE(viewer->getCurrentLine(), hit.line);
            QTextCursor cursor = viewer->textCursor();
            QCOMPARE(cursor.selectedText().toLower(), QString("needle"));
            QCOMPARE(cursor.block().text(), hit.text);
            QCOMPARE(cursor.selectionStart() - cursor.block().position(),
                     int(hit.text.indexOf("needle", 0, Qt::CaseInsensitive)));
            QVERIFY(window.statusBar()->currentMessage().contains(QString::number(hit.line)));
        }

        // The entries are stored for the next session.
        Settings* store = ApplicationBase::getInstance()->getSettings();
        QCOMPARE(store->getValue(FifSettings().getFindWhatKeyPath()).toStringList().value(0),
                 QString("needle"));

        // A file that vanished: a message, and the viewer stays as it was.
        const FifHit first = model->index(0, 0).data(Qt::UserRole).value<FifHit>();
        const QString shownPath = viewer->getFilePath();
        const QString shownText = viewer->toPlainText();
        const int shownLine = viewer->getCurrentLine();
        const QString firstPath = QDir(dir.path()).absoluteFilePath(first.file);
        QVERIFY(QFile::remove(firstPath));
        emit tree->doubleClicked(model->index(0, 0));
        QVERIFY(window.statusBar()->currentMessage().contains("no longer exists"));
        QVERIFY(window.statusBar()->currentMessage().contains(
            QDir::toNativeSeparators(firstPath)));
        QCOMPARE(viewer->getFilePath(), shownPath);
        QCOMPARE(viewer->toPlainText(), shownText);
        QCOMPARE(viewer->getCurrentLine(), shownLine);
    }

    // The executable refuses what it cannot start in, with a message.
    void commandLine_data()
    {
        QTest::addColumn<QStringList>("arguments");
        QTest::addColumn<int>("exitCode");
        QTest::addColumn<QString>("output");
        QTest::newRow("missing folder") << QStringList{"/no/such/folder"} << 2
                                        << "/no/such/folder is not a folder that can be opened.";
        QTest::newRow("a file") << QStringList{QString(FIF_TEST_FILE)} << 2
                                << QString(FIF_TEST_FILE) + " is not a folder that can be opened.";
        QTest::newRow("two folders") << QStringList{"/", "/tmp"} << 2
                                     << "Name one folder at most.";
        QTest::newRow("version") << QStringList{"--version"} << 0 << "findinfiles ";
    }
    void commandLine()
    {
        QFETCH(QStringList, arguments);
        QFETCH(int, exitCode);
        QFETCH(QString, output);
        const QString program = qEnvironmentVariable("FIF_BINARY_DIR") + "/app/findinfiles";
        if (!QFileInfo::exists(program))
            QSKIP("the findinfiles executable is not built");
        QProcess process;
        process.start(program, arguments);
        QVERIFY(process.waitForFinished(30000));
        QCOMPARE(process.exitStatus(), QProcess::NormalExit);
        QCOMPARE(process.exitCode(), exitCode);
        const QString text = QString::fromLocal8Bit(process.readAllStandardOutput()
                                                    + process.readAllStandardError());
        QVERIFY2(text.contains(output), qPrintable(text));
    }

    // The start folder is offered once; later the folder searched last.
    void startFolderOfferedOnce()
    {
        QTemporaryDir start;
        QTemporaryDir other;
        QVERIFY(TestTree::write(other.path(), "x.txt", "word\n"));
        FindInFilesWindow window(start.path());
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        FifJob* job = FifManager::getInstance(&window)->getJob(0);
        JobRunner::EndWatcher watcher(job);

        QVERIFY(answerDialog(window.getFindAction(),
                             [&](FifDialog* dialog) { search(dialog, "word", other.path()); }));
        QVERIFY(watcher.wait());

        QString offered;
        QVERIFY(answerDialog(window.getFindAction(), [&](FifDialog* dialog) {
            offered = dialog->findChild<QComboBox*>("where")->currentText();
        }));
        QCOMPARE(offered, other.path());
    }
};

FIF_HOST_TEST_MAIN(tst_FindInFiles)
#include "tst_findinfiles.moc"
