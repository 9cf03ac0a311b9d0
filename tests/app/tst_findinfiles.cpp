// The application from the find command to the hit in its viewer, and the viewer's selection.

#include "FifActions.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "FifTest.h"
#include "FileViewer.h"
#include "FindInFilesWindow.h"
#include "MatchMarker.h"
#include <QtTest>
#include <QtWidgets>

using namespace Gui::Orba;

// The viewer's line, its text, the selection's column and the selected text.
static QString onScreen(const FileViewer* viewer)
{
    const QTextCursor cursor = viewer->textCursor();
    return QString("%1|%2|%3|%4").arg(viewer->getCurrentLine()).arg(cursor.block().text())
        .arg(cursor.selectionStart() - cursor.block().position()).arg(cursor.selectedText());
}

// The viewer's marks in order, as "line:column:text", a marked line as "line:line".
static QStringList marks(const FileViewer* viewer)
{
    QStringList list;
    for (const QTextEdit::ExtraSelection& mark : viewer->extraSelections())
        list << QString("%1:%2").arg(mark.cursor.blockNumber() + 1).arg(mark.cursor.hasSelection()
            ? QString("%1:%2").arg(mark.cursor.selectionStart() - mark.cursor.block().position())
                  .arg(mark.cursor.selectedText()) : "line");
    list.sort();
    return list;
}

class tst_FindInFiles : public QObject
{
    Q_OBJECT
public slots:
    void open(const QUrl& url) { opened << url; } // the desktop's handler of files, in the test
private:
    QList<QUrl> opened;
private slots:
    void endToEnd() {
        QTemporaryDir dir;
        const QByteArray crlf = "x\r\nsome Needle at \xc3\xa4\xc3\xb6 needle\r\nneedle\r\n";
        QStringEncoder utf16(QStringEncoder::Utf16LE, QStringEncoder::Flag::WriteBom);
        QVERIFY(FifTest::write(dir.path(), "a.txt", crlf) && FifTest::write(dir.path(), "d", "-"));
        QVERIFY(FifTest::write(dir.path(), "sub/c.txt", utf16(u"x\r\nab needle\r\n")));
        FindInFilesWindow window(dir.path());
        window.show();
        FifJob* job = FifManager::getInstance(&window)->getJob(0);
        FifTest::watch(job->getHitsModel());
        FifTest::EndWatcher end(job);
        auto answered = FifTest::answer<QDialog>([&](QDialog* dialog) { // the find dialog
            dialog->findChild<QComboBox*>("what")->setEditText("needle"); // in the folder offered
            dialog->findChild<QPushButton*>("start")->click();
        });
        window.getFindAction()->trigger();
        QVERIFY(*answered && end.wait());
        auto* view = qobject_cast<FifHitsView*>(window.getResultsDock(0)->widget());
        QTRY_COMPARE(view->getStatusLabel()->text(),
                     QString("Found 3 line(s) in 2 file(s) out of 3 file(s)"));
        // Each hit in turn through the shared next action, each file read once.
        FileViewer* viewer = window.getViewer();
        QSignalSpy opened(viewer, &FileViewer::fileOpened);
        auto* tree = view->findChild<QTreeView*>();
        const QList<FifHit> hits = FifTest::hits(job->getHitsModel());
        for (const FifHit& hit : hits) {
            window.getNextAction()->trigger();
            const QString path = QDir(dir.path()).absoluteFilePath(hit.file);
            const int column = hit.text.indexOf("needle", 0, Qt::CaseInsensitive);
            QCOMPARE(viewer->getFilePath(), QFileInfo(path).canonicalFilePath());
            QCOMPARE(onScreen(viewer), QString("%1|%2|%3|%4").arg(hit.line).arg(hit.text)
                                           .arg(column).arg(hit.text.mid(column, 6)));
        }
        QVERIFY(hits.size() == 3 && opened.count() == 2);
        // A file gone since: a message, and the viewer stays as it was.
        const QString before = onScreen(viewer) + viewer->toPlainText();
        const QString gone = QDir(dir.path()).absoluteFilePath(hits.first().file);
        QVERIFY(QFile::remove(gone));
        emit tree->activated(tree->model()->index(0, 0));
        QCOMPARE(window.statusBar()->currentMessage(),
                 QDir::toNativeSeparators(gone) + " no longer exists.");
        QCOMPARE(onScreen(viewer) + viewer->toPlainText(), before);
    }
    // The viewer numbers the lines and marks every match on the lines in view, as they come into
    // view, of a long line those around the part in view; the hit's line stays marked. It opens
    // its file in the desktop's editor (Ctrl+E, menus), copies its path, reloads a changed file.
    void viewerWorthKeepingOpen() {
        QTemporaryDir dir;
        QByteArray bytes, wide;
        for (int i = 1; i <= 1500; ++i)
            bytes += QByteArray::number(i) + (i % 3 ? " needle, xNeedle\n" : " nothing\n");
        for (int i = 0; i < 40; ++i)
            wide += "needle" + QByteArray(100, '.');
        QVERIFY(FifTest::write(dir.path(), "f.txt", bytes + wide + "\n"));
        FindInFilesWindow window(dir.path());
        window.show();
        QApplication::setActiveWindow(&window);
        FifJob* job = FifManager::getInstance(&window)->getJob(0);
        FifTest::watch(job->getHitsModel());
        QVERIFY(QTest::qWaitForWindowActive(&window) && FifTest::run(job, FifTest::request("needle", dir.path())));
        const QList<FifHit> hits = FifTest::hits(job->getHitsModel());
        FileViewer* viewer = window.getViewer();
        auto* gutter = viewer->findChild<QWidget*>("lineNumbers");
        QCOMPARE(viewer->getOpenInEditorAction()->isEnabled(), false);
        window.showHit(hits.value(500)); // line 751
        const auto inView = [viewer](bool first) {
            return viewer->cursorForPosition(QPoint(0, first ? 0 : viewer->viewport()->height())).blockNumber() + 1;
        };
        const auto expected = [&] { // plain matching of the lines in view
            QStringList list{"751:line"};
            for (int line = inView(true); line <= inView(false) && line <= 1500; ++line) {
                const QString text = viewer->document()->findBlockByNumber(line - 1).text();
                for (int at = 0; (at = text.indexOf("needle", at, Qt::CaseInsensitive)) >= 0; at += 6)
                    list << QString("%1:%2:%3").arg(line).arg(at).arg(text.mid(at, 6));
            }
            list.sort();
            return list;
        };
        QVERIFY(inView(true) > 700 && inView(false) < 800 && viewer->getMarkedLine() == 751);
        QTRY_COMPARE(marks(viewer), expected());
        const QImage numbers = gutter->grab().toImage();
        viewer->verticalScrollBar()->setValue(viewer->verticalScrollBar()->value() + 40);
        QTRY_COMPARE(marks(viewer), expected());
        QVERIFY(gutter->grab().toImage() != numbers && gutter->width() > gutter->fontMetrics().horizontalAdvance("1501"));
        QCOMPARE(viewer->viewport()->x(), gutter->geometry().right() + 1); // beside the text
        window.showHit(hits.constLast()); // the wide line: the matches around the part in view
        QTRY_VERIFY(marks(viewer).contains("1501:0:needle") && !marks(viewer).contains("1501:3180:needle"));
        viewer->horizontalScrollBar()->setValue(viewer->horizontalScrollBar()->maximum());
        QTRY_VERIFY(!marks(viewer).contains("1501:0:needle") && marks(viewer).contains("1501:4134:needle"));
        QVERIFY(marks(viewer).filter(QRegularExpression("^1501:")).size() <= MatchMarker::lineWindow / 106 + 2);
        // Open in Editor through its shortcut, the menu and the viewer's context menu; Copy Path.
        QDesktopServices::setUrlHandler("file", this, "open");
        QTest::keyClick(&window, Qt::Key_E, Qt::ControlModifier);
        window.findChild<QMenu*>("fileMenu")->actions().at(0)->trigger();
        QTimer::singleShot(100, viewer, [] { // in the viewer's context menu
            auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
            for (QAction* action : menu->actions())
                if (action->objectName() == "openInEditor")
                    action->trigger();
            menu->close();
        });
        QContextMenuEvent menuEvent(QContextMenuEvent::Mouse, QPoint(5, 5), viewer->mapToGlobal(QPoint(5, 5)));
        QApplication::sendEvent(viewer->viewport(), &menuEvent);
        QDesktopServices::unsetUrlHandler("file");
        QCOMPARE(opened, QList<QUrl>(3, QUrl::fromLocalFile(viewer->getFilePath())));
        window.findChild<QToolBar*>("mainToolBar")->actions().constLast()->trigger(); // Copy Path
        QCOMPARE(QGuiApplication::clipboard()->text(), QDir::toNativeSeparators(viewer->getFilePath()));
        QVERIFY(FifTest::write(dir.path(), "f.txt", "needle\n"));
        window.showHit(hits.first());
        QCOMPARE(viewer->toPlainText(), QString("needle\n"));
    }
    // The viewer selects what the hit's search matched on the hit's line; in
    // a file changed since, the match on that line, else the whole line.
    void viewerSelectsTheMatch_data() {
        QTest::addColumn<FifInput>("request");
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QByteArray>("changed"); // the file when shown, if changed since
        QTest::addColumn<QString>("shown");
        const auto row = [](const char* name, const FifInput& request, const char* bytes,
                            const char* changed, const char* shown) {
            QTest::newRow(name) << request << QByteArray(bytes) << QByteArray(changed) << shown;
        };
        const FifInput literal = FifTest::request("needle", {});
        row("regexp", FifTest::request("get[A-Za-z]+\\(\\d+\\)", {}, QRegExp::RegExp2),
            "call getJob(12)", nullptr, "1|call getJob(12)|5|getJob(12)");
        row("word", FifTest::request("needle", {}, QRegExp::FixedString, false, true),
            "needles, needle", nullptr, "1|needles, needle|9|needle");
        row("moved to its start", literal, "x\nab needle", "x\nneedle ab", "2|needle ab|0|needle");
        row("gone from its line", literal, "x\nab needle", "new\nx\nab needle", "2|x|0|x");
        // Decoded as the search read it: UTF-32, and a second mark that is text.
        QTest::newRow("UTF-32") << literal << QByteArray(QStringEncoder(QStringEncoder::Utf32BE,
            QStringEncoder::Flag::WriteBom).encode(u"x\nab needle")) << QByteArray() << QString("2|ab needle|3|needle");
        QTest::newRow("UTF-8, mark twice") << literal << QByteArray("\xEF\xBB\xBF\xEF\xBB\xBFx needle")
                                           << QByteArray() << QString("1|%1x needle|3|needle").arg(QChar(0xFEFF));
    }
    void viewerSelectsTheMatch() {
        QFETCH(FifInput, request); QFETCH(QByteArray, bytes); QFETCH(QByteArray, changed);
        QFETCH(QString, shown);
        QTemporaryDir dir;
        QVERIFY(FifTest::write(dir.path(), "f.txt", bytes));
        request.where = dir.path();
        FifManager manager;
        FifTest::watch(manager.getJob(0)->getHitsModel());
        QVERIFY(FifTest::run(manager.getJob(0), request));
        QVERIFY(changed.isNull() || FifTest::write(dir.path(), "f.txt", changed));
        FileViewer viewer;
        QVERIFY(viewer.showHit(FifTest::hits(manager.getJob(0)->getHitsModel()).value(0), nullptr));
        QCOMPARE(viewer.getFilePath(), QFileInfo(dir.filePath("f.txt")).canonicalFilePath());
        QCOMPARE(onScreen(&viewer), shown);
    }
};

FIF_HOST_TEST_MAIN(tst_FindInFiles)
#include "tst_findinfiles.moc"
