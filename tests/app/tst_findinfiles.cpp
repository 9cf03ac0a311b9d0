// The findinfiles application: from the find command to the hit shown in
// the viewer, and where the viewer puts the selection for each kind of hit.

#include "FifActions.h"
#include "FifDialog.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "FifTest.h"
#include "FileViewer.h"
#include "FindInFilesWindow.h"
#include <QtTest>
#include <QtWidgets>

using namespace Gui::Orba;

static const QByteArray crlfFile = "x\r\nab needle\r\n";

static QByteArray utf16(bool littleEndian)
{
    QByteArray bytes(littleEndian ? "\xff\xfe" : "\xfe\xff");
    for (char c : crlfFile)
        littleEndian ? bytes.append(c).append('\0') : bytes.append('\0').append(c);
    return bytes;
}

// The viewer's line, its text, the selection's column and the selected text.
static QStringList onScreen(const FileViewer* viewer)
{
    const QTextCursor cursor = viewer->textCursor();
    return {QString::number(viewer->getCurrentLine()), cursor.block().text(),
            QString::number(cursor.selectionStart() - cursor.block().position()),
            cursor.selectedText()};
}

class tst_FindInFiles : public QObject
{
    Q_OBJECT

private slots:
    void endToEnd() {
        QTemporaryDir dir;
        QVERIFY(FifTest::write(dir.path(), "a.txt", "x\r\nsome Needle at \xc3\xa4\xc3\xb6 needle\r\nneedle\r\n"));
        QVERIFY(FifTest::write(dir.path(), "sub/c.txt", utf16(true)));
        QVERIFY(FifTest::write(dir.path(), "d.txt", "no match\n"));
        FindInFilesWindow window(dir.path());
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        FifJob* job = FifManager::getInstance(&window)->getJob(0);
        FifTest::watch(job->getHitsModel());
        FifTest::EndWatcher end(job);
        QString offered;
        auto answered = FifTest::answer<FifDialog>([&](FifDialog* dialog) {
            offered = dialog->findChild<QComboBox*>("where")->currentText();
            dialog->findChild<QComboBox*>("what")->setEditText("needle");
            dialog->findChild<QPushButton*>("start")->click();
        });
        window.getFindAction()->trigger();
        QVERIFY(*answered && end.wait());
        QCOMPARE(offered, QDir::toNativeSeparators(dir.path()));
        auto* view = qobject_cast<FifHitsView*>(window.getResultsDock(0)->widget());
        QTRY_COMPARE(view->getStatusLabel()->text(), QString("Found 3 line(s) in 2 file(s) out of 3 file(s)"));

        // Each hit in turn through the shared next action, each file read once.
        QSignalSpy opened(window.getViewer(), &FileViewer::fileOpened);
        auto* tree = view->findChild<QTreeView*>();
        tree->selectionModel()->clearCurrentIndex();
        const QList<FifHit> hits = FifTest::hits(job->getHitsModel());
        QCOMPARE(hits.size(), 3);
        for (const FifHit& hit : hits) {
            window.getNextAction()->trigger();
            const QString path = QDir(dir.path()).absoluteFilePath(hit.file);
            const int column = hit.text.indexOf("needle", 0, Qt::CaseInsensitive);
            QCOMPARE(window.getViewer()->getFilePath(), QFileInfo(path).canonicalFilePath());
            QCOMPARE(onScreen(window.getViewer()), (QStringList{QString::number(hit.line), hit.text,
                                                               QString::number(column), hit.text.mid(column, 6)}));
            QCOMPARE(window.statusBar()->currentMessage(),
                     QString("%1, line %2").arg(QDir::toNativeSeparators(path)).arg(hit.line));
        }
        QCOMPARE(opened.count(), 2);
        // A file gone since: a message, and the viewer stays as it was.
        const QStringList before = onScreen(window.getViewer()) << window.getViewer()->toPlainText();
        const QString gone = QDir(dir.path()).absoluteFilePath(hits.first().file);
        QVERIFY(QFile::remove(gone));
        emit tree->doubleClicked(tree->model()->index(0, 0));
        QCOMPARE(window.statusBar()->currentMessage(), QDir::toNativeSeparators(gone) + " no longer exists.");
        QCOMPARE(onScreen(window.getViewer()) << window.getViewer()->toPlainText(), before);
    }

    void viewerSelectsTheMatch_data() {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QString>("what");
        QTest::addColumn<int>("type"); // -1: a literal (2) matched as a whole word
        QTest::addColumn<QByteArray>("changed"); // the file when shown, if changed since
        QTest::addColumn<QStringList>("shown");
        const auto row = [](const char* name, const QByteArray& bytes, const QStringList& shown,
                            const char* what = "needle", int type = QRegExp::FixedString,
                            const QByteArray& changed = QByteArray()) {
            QTest::newRow(name) << bytes << QString(what) << type << changed << shown;
        };
        row("UTF-8 mark", "\xef\xbb\xbfx\nneedle\n", {"2", "needle", "0", "needle"});
        row("lone CR", "a\rb needle\nc\n", {"1", "a\uFFFDb needle", "4", "needle"});
        row("UTF-16 BE", utf16(false), {"2", "ab needle", "3", "needle"});
        row("regexp", "call getJob(12)\n", {"1", "call getJob(12)", "5", "getJob(12)"},
            "get[A-Za-z]+\\(\\d+\\)", QRegExp::RegExp2);
        row("word", "needles, needle\n", {"1", "needles, needle", "9", "needle"}, "needle", -1);
        row("wildcard", "a x1y b\n", {"1", "a x1y b", "2", "x1y"}, "x*y", QRegExp::Wildcard);
        const int literal = QRegExp::FixedString;
        row("changed: moved on its line", crlfFile, {"2", "longer, needle", "8", "needle"},
            "needle", literal, "x\nlonger, needle\n");
        row("changed: to the line's start", crlfFile, {"2", "needle ab", "0", "needle"},
            "needle", literal, "x\nneedle ab\n");
        row("changed: gone from its line", crlfFile, {"2", "x", "0", "x"}, "needle", literal,
            "new\nx\nab needle\n");
    }
    void viewerSelectsTheMatch() {
        QFETCH(QByteArray, bytes);
        QFETCH(QString, what);
        QFETCH(int, type);
        QFETCH(QByteArray, changed);
        QFETCH(QStringList, shown);
        QTemporaryDir dir;
        QVERIFY(FifTest::write(dir.path(), "f.txt", bytes));
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifTest::watch(job->getHitsModel());
        QVERIFY(FifTest::run(job, FifTest::request(what, dir.path(), type < 0 ? 2 : type, false, type < 0)));
        const QList<FifHit> hits = FifTest::hits(job->getHitsModel());
        QCOMPARE(hits.size(), 1);
        QVERIFY(changed.isNull() || FifTest::write(dir.path(), "f.txt", changed));
        FileViewer viewer;
        QString error;
        QVERIFY(viewer.showHit(hits[0], &error) && error.isEmpty());
        QCOMPARE(viewer.getFilePath(), QFileInfo(dir.filePath("f.txt")).canonicalFilePath());
        QCOMPARE(onScreen(&viewer), shown);
    }
};

FIF_HOST_TEST_MAIN(tst_FindInFiles)
#include "tst_findinfiles.moc"
