#include "FileViewer.h"

#include "FifHit.h"
#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "JobRunner.h"
#include "TestTree.h"

#include <QTextBlock>
#include <QtTest>

#include <unistd.h>

using namespace Gui::Orba;

namespace {

// Searches `folder` for `what` on `job` and returns the hits in model order.
FifHitList search(FifJob* job, const QString& folder, const QString& what)
{
    FifInput request;
    request.what = what;
    request.where = folder;
    if (!JobRunner::run(job, request))
        return {};
    FifHitList hits;
    const FifHitsModel* model = job->getHitsModel();
    for (int row = 0; row < model->rowCount(QModelIndex()); ++row)
        hits << model->index(row, 0).data(Qt::UserRole).value<FifHit>();
    return hits;
}

QString lineOfCursor(const FileViewer& viewer)
{
    return viewer.textCursor().block().text();
}

int columnOfSelection(const FileViewer& viewer)
{
    const QTextCursor cursor = viewer.textCursor();
    return cursor.selectionStart() - cursor.block().position();
}

} // namespace

class tst_FileViewer : public QObject
{
    Q_OBJECT

private slots:
    void readOnly()
    {
        FileViewer viewer;
        QVERIFY(viewer.isReadOnly());
        QVERIFY(viewer.getFilePath().isEmpty());
    }

    // Encodings and line ends as the search reads them: the selection lands
    // on the match that the hit reports.
    void selectsTheMatch_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<int>("line");
        QTest::addColumn<QString>("lineText");
        QTest::addColumn<int>("column");

        QTest::newRow("utf-8, LF") << QByteArray("one\ntwo needle\n") << 2
                                   << "two needle" << 4;
        QTest::newRow("utf-8, CRLF, accents before")
            << QByteArray("\xc3\xa9\xc3\xa9\r\n\xc3\xa0 b NEEDLE x\r\n") << 2
            << QString::fromUtf8("\xc3\xa0 b NEEDLE x") << 4;
        QTest::newRow("utf-8 with byte-order mark")
            << QByteArray("\xef\xbb\xbfx\nneedle\n") << 2 << "needle" << 0;
        QTest::newRow("lone CR inside a line")
            << QByteArray("a\rb needle\nc\n") << 1 << QString("a") + QChar(0xFFFD) + "b needle"
            << 4;
        QTest::newRow("no line end at the end") << QByteArray("x\ny\nzz needle") << 3
                                                << "zz needle" << 3;

        QByteArray le("\xff\xfe", 2);
        QByteArray be("\xfe\xff", 2);
        for (char c : QByteArray("x\r\nab needle\r\n")) {
            le += QByteArray(1, c) + QByteArray(1, '\0');
            be += QByteArray(1, '\0') + QByteArray(1, c);
        }
        QTest::newRow("utf-16 LE") << le << 2 << "ab needle" << 3;
        QTest::newRow("utf-16 BE") << be << 2 << "ab needle" << 3;
    }
    void selectsTheMatch()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(int, line);
        QFETCH(QString, lineText);
        QFETCH(int, column);

        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "f.txt", bytes));
        FifManager manager;
        const FifHitList hits = search(manager.getJob(0), dir.path(), "needle");
        QCOMPARE(hits.size(), 1);
        QCOMPARE(hits.first().line, line);

        FileViewer viewer;
        QSignalSpy opened(&viewer, &FileViewer::fileOpened);
        QString error;
        QVERIFY(viewer.showHit(hits.first(), &error));
        QVERIFY(error.isEmpty());
        QCOMPARE(opened.count(), 1);
        QCOMPARE(viewer.getFilePath(), QFileInfo(dir.filePath("f.txt")).canonicalFilePath());
        QCOMPARE(viewer.getCurrentLine(), line);
        QCOMPARE(lineOfCursor(viewer), lineText);
        QCOMPARE(columnOfSelection(viewer), column);
        QCOMPARE(viewer.textCursor().selectedText().toLower(), QString("needle"));
    }

    // Several hits in one file: the file is read once, each match selected.
    void stepsWithinOneFile()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "f.txt", "needle\nx needle\n\nxx needle y\n"));
        FifManager manager;
        const FifHitList hits = search(manager.getJob(0), dir.path(), "needle");
        QCOMPARE(hits.size(), 3);
        FileViewer viewer;
        QSignalSpy opened(&viewer, &FileViewer::fileOpened);
        const int lines[] = {1, 2, 4};
        const int columns[] = {0, 2, 3};
        for (int i = 0; i < 3; ++i) {
            QVERIFY(viewer.showHit(hits.at(i), nullptr));
            QCOMPARE(viewer.getCurrentLine(), lines[i]);
            QCOMPARE(columnOfSelection(viewer), columns[i]);
            QCOMPARE(viewer.textCursor().selectedText(), QString("needle"));
        }
        QCOMPARE(opened.count(), 1);
    }

    // A regular expression: the selection covers what it matched.
    void regularExpressionLength()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "f.txt", "call getJob(12) now\n"));
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifInput request;
        request.what = "get[A-Za-z]+\\(\\d+\\)";
        request.matchType = 3; // QRegExp::RegExp2
        request.where = dir.path();
        QVERIFY(JobRunner::run(job, request));
        QCOMPARE(job->getHitsModel()->rowCount(QModelIndex()), 1);
        const FifHit hit = job->getHitsModel()->index(0, 0).data(Qt::UserRole).value<FifHit>();

        FileViewer viewer;
        QVERIFY(viewer.showHit(hit, nullptr));
        QCOMPARE(viewer.textCursor().selectedText(), QString("getJob(12)"));
    }

    // A file changed since the search is shown as it is now: the match is
    // looked for on the hit's line, else the line is selected; lost lines
    // take the viewer to the end.
    void changedFile()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "f.txt", "x\nab needle\n"));
        FifManager manager;
        const FifHitList hits = search(manager.getJob(0), dir.path(), "needle");
        QCOMPARE(hits.size(), 1);
        FileViewer viewer;

        QVERIFY(TestTree::write(dir.path(), "f.txt", "x\nlonger text, needle\n"));
        QVERIFY(viewer.showHit(hits.first(), nullptr));
        QCOMPARE(viewer.textCursor().selectedText(), QString("needle"));
        QCOMPARE(columnOfSelection(viewer), 13);

        QVERIFY(TestTree::write(dir.path(), "f.txt", "new first line\nx\nab needle\n"));
        QVERIFY(viewer.showHit(hits.first(), nullptr));
        QCOMPARE(viewer.getCurrentLine(), 2);
        QCOMPARE(viewer.textCursor().selectedText(), QString("x"));

        QVERIFY(TestTree::write(dir.path(), "f.txt", ""));
        QVERIFY(viewer.showHit(hits.first(), nullptr));
        QCOMPARE(viewer.toPlainText(), QString());
    }

    // A file that is gone, or unreadable: false with a message, and the
    // viewer keeps what it showed.
    void fileThatCannotBeShown()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "needle a\n"));
        QVERIFY(TestTree::write(dir.path(), "b.txt", "needle b\n"));
        FifManager manager;
        const FifHitList hits = search(manager.getJob(0), dir.path(), "needle");
        QCOMPARE(hits.size(), 2);
        FileViewer viewer;
        QVERIFY(viewer.showHit(hits.at(0), nullptr));
        const QString path = viewer.getFilePath();
        const QString text = viewer.toPlainText();

        const QString otherPath = QDir(dir.path()).absoluteFilePath(hits.at(1).file);
        QVERIFY(QFile::remove(otherPath));
        QString error;
        QVERIFY(!viewer.showHit(hits.at(1), &error));
        QCOMPARE(error, QString("%1 no longer exists.").arg(QDir::toNativeSeparators(otherPath)));
        QCOMPARE(viewer.getFilePath(), path);
        QCOMPARE(viewer.toPlainText(), text);

        if (geteuid() != 0) { // root reads anything
            QVERIFY(TestTree::write(dir.path(), QFileInfo(otherPath).fileName(), "needle b\n"));
            QVERIFY(QFile::setPermissions(otherPath, QFileDevice::WriteOwner));
            QVERIFY(!viewer.showHit(hits.at(1), &error));
            QVERIFY(error.startsWith("Cannot open "));
            QCOMPARE(viewer.getFilePath(), path);
        }
    }

    // A hit whose search is gone cannot be placed.
    void hitOfDestroyedJob()
    {
        QTemporaryDir dir;
        QVERIFY(TestTree::write(dir.path(), "a.txt", "needle\n"));
        FifHit hit;
        {
            FifManager manager;
            const FifHitList hits = search(manager.getJob(0), dir.path(), "needle");
            QCOMPARE(hits.size(), 1);
            hit = hits.first();
        }
        FileViewer viewer;
        QString error;
        QVERIFY(!viewer.showHit(hit, &error));
        QVERIFY(!error.isEmpty());
        QVERIFY(viewer.getFilePath().isEmpty());
    }
};

QTEST_MAIN(tst_FileViewer)
#include "tst_fileviewer.moc"
