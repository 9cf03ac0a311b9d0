#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifWorker.h"
#include "TestTree.h"

#include <QAbstractItemModelTester>
#include <QStringEncoder>
#include <QtTest>

using namespace Gui::Orba;

namespace {

FifInput makeRequest(const QString& what, const QString& where, const QString& filter = "*")
{
    FifInput request(filter);
    request.what = what;
    request.where = where;
    request.matchCase = Qt::CaseSensitive;
    return request;
}

QList<FifHit> hitsOf(FifJob* job)
{
    QList<FifHit> hits;
    FifHitsModel* model = job->getHitsModel();
    for (int row = 0; row < model->rowCount(); ++row)
        hits.append(model->index(row, 0).data(Qt::UserRole).value<FifHit>());
    return hits;
}

QList<int> linesOf(const QList<FifHit>& hits)
{
    QList<int> lines;
    for (const FifHit& hit : hits)
        lines.append(hit.line);
    return lines;
}

// A worker that records the folders it would walk instead of walking them.
class RecordingWorker : public FifWorker
{
public:
    using FifWorker::FifWorker;
    QList<QDir> folders;

protected:
    void searchFolder(const QDir& folder) override { folders.append(folder); }
};

} // namespace

class tst_FifWorker : public QObject
{
    Q_OBJECT

private:
    QTemporaryDir tree;
    QString root;
    QString savedCurrent;
    QByteArray savedHome;

    // Runs a search on a fresh job of `manager` and waits for its end, with
    // the model under the item-model tester.
    void run(FifManager& manager, const FifInput& request, FifJob*& job,
             QStringList* searched = nullptr)
    {
        job = manager.getJob(0);
        new QAbstractItemModelTester(job->getHitsModel(),
                                     QAbstractItemModelTester::FailureReportingMode::QtTest, job);
        QSignalSpy searching(job, &FifJob::searching);
        FIF_RUN_JOB(job, request, 60000);
        if (searched) {
            for (const QList<QVariant>& args : searching)
                searched->append(args.at(0).toString());
        }
    }

    // A job that holds `request` without having searched anything: a stop
    // requested before the start ends the run at its first poll.
    void prepare(FifManager& manager, const FifInput& request, FifJob*& job)
    {
        job = manager.getJob(0);
        new QAbstractItemModelTester(job->getHitsModel(),
                                     QAbstractItemModelTester::FailureReportingMode::QtTest, job);
        job->stop();
        FIF_RUN_JOB(job, request, 10000);
        QCOMPARE(job->getReadFileCount(), 0);
        QVERIFY(!job->shouldStop());
    }

    static QStringList relative(const QString& base, const QStringList& paths)
    {
        QStringList result;
        for (const QString& path : paths)
            result.append(QDir(base).relativeFilePath(path));
        return result;
    }

private slots:
    void initTestCase()
    {
        QVERIFY(tree.isValid());
        root = QFileInfo(tree.path()).canonicalFilePath();
        savedCurrent = QDir::currentPath();
        savedHome = qgetenv("HOME");
        QVERIFY(TestTree::write(root, "src/a.txt", "needle\n"));
        QVERIFY(TestTree::write(root, "include/b.txt", "needle\n"));
        QVERIFY(TestTree::write(root, "current directory/c.txt", "needle\n"));
        QVERIFY(QDir().mkpath(root + "/home"));
        QVERIFY(QDir::setCurrent(root));
        qputenv("HOME", QFile::encodeName(root + "/home"));
    }

    void cleanupTestCase()
    {
        QDir::setCurrent(savedCurrent);
        qputenv("HOME", savedHome);
    }

    // --- folders -----------------------------------------------------------

    void folderGrammar_data()
    {
        QTest::addColumn<QString>("where");
        QTest::addColumn<QStringList>("folders");
        const QString home = root + "/home";
        QTest::newRow("empty part skipped") << "src;;include" << QStringList{"src", "include"};
        QTest::newRow("blank kept in part") << "src; include" << QStringList{"src"};
        QTest::newRow("leading blank") << " src" << QStringList{};
        QTest::newRow("same folder twice") << "src;src" << QStringList{"src", "src"};
        QTest::newRow("file is no folder") << "src/a.txt" << QStringList{};
        QTest::newRow("nothing") << "" << QStringList{};
        QTest::newRow("only separators") << ";;" << QStringList{};
        QTest::newRow("absolute") << root + "/include" << QStringList{root + "/include"};
        QTest::newRow("current") << "Current Directory" << QStringList{root};
        QTest::newRow("lower case is a path")
            << "current directory" << QStringList{"current directory"};
        QTest::newRow("not whole part") << "Current Directory " << QStringList{};
        QTest::newRow("home") << "Home Directory" << QStringList{home};
        QTest::newRow("root") << "Root Directory" << QStringList{"/"};
        QTest::newRow("mixed") << "src;Root Directory;Home Directory;nowhere"
                               << QStringList{"src", "/", home};
    }

    void folderGrammar()
    {
        QFETCH(QString, where);
        QFETCH(QStringList, folders);
        FifManager manager;
        FifJob* job = nullptr;
        prepare(manager, makeRequest("needle", where, "*.cpp; *.h;;"), job);
        RecordingWorker worker(job);
        worker.searchFolders();
        QStringList paths;
        for (const QDir& folder : qAsConst(worker.folders)) {
            paths.append(folder.path());
            // The file patterns are split like the folders, blanks kept.
            QCOMPARE(folder.nameFilters(), QStringList({"*.cpp", " *.h"}));
            QCOMPARE(folder.filter(), QDir::Files | QDir::NoSymLinks | QDir::Hidden
                                          | QDir::AllDirs | QDir::NoDotAndDotDot);
            QCOMPARE(folder.sorting(), QDir::NoSort);
        }
        QCOMPARE(paths, folders);
    }

    // Hits keep the path as the folder was given: relative stays relative.
    void hitPathsFollowTheFolderText()
    {
        FifManager manager;
        FifJob* job = nullptr;
        run(manager, makeRequest("needle", "src;src;" + root + "/include"), job);
        const QList<FifHit> hits = hitsOf(job);
        QCOMPARE(hits.size(), 3);
        QCOMPARE(hits[0].file, QStringLiteral("src/a.txt"));
        QCOMPARE(hits[1].file, QStringLiteral("src/a.txt"));
        QCOMPARE(hits[2].file, root + "/include/b.txt");
        QCOMPARE(hits[0].toString(), QStringLiteral("src/a.txt (1): needle"));
        QCOMPARE(job->getReadFileCount(), 3);
        QCOMPARE(job->getFileHitCount(), 3);
    }

    // --- listing -----------------------------------------------------------

    void listing_data()
    {
        QTest::addColumn<QString>("filter");
        QTest::addColumn<bool>("subFolders");
        QTest::addColumn<QStringList>("files");
        const QStringList cpp{".hidden.cpp", ".hiddendir/d.cpp", "a.cpp", "sub/c.cpp"};
        QStringList cppAndH = cpp + QStringList{"B.H", "b.h"};
        cppAndH.sort();
        QStringList all = cppAndH + QStringList{"a.txt", "sub/a1.txt"};
        all.sort();
        QTest::newRow("two patterns") << "*.cpp;*.h" << true << cppAndH;
        QTest::newRow("blank before pattern") << "*.cpp; *.h" << true << cpp;
        QTest::newRow("case ignored") << "*.CPP" << true << cpp;
        QTest::newRow("folders pass any pattern")
            << "a*" << true << QStringList{"a.cpp", "a.txt", "sub/a1.txt"};
        QTest::newRow("empty filter lets all through") << "" << true << all;
        QTest::newRow("star") << "*" << true << all;
        QTest::newRow("no subfolders")
            << "*" << false << QStringList{".hidden.cpp", "B.H", "a.cpp", "a.txt", "b.h"};
    }

    // Files match a pattern without regard to case, every folder is
    // entered, hidden entries are searched and links never followed.
    void listing()
    {
        QFETCH(QString, filter);
        QFETCH(bool, subFolders);
        QFETCH(QStringList, files);
        const QString base = root + "/listing";
        if (!QFileInfo::exists(base)) {
            for (const char* name : {"a.cpp", "B.H", "b.h", "a.txt", "sub/c.cpp", "sub/a1.txt",
                                     ".hidden.cpp", ".hiddendir/d.cpp"})
                QVERIFY(TestTree::write(base, name, "x\n"));
            QVERIFY(QFile::link(base + "/a.cpp", base + "/link.cpp"));
            QVERIFY(QFile::link(base + "/sub", base + "/linkdir"));
        }
        FifManager manager;
        FifJob* job = nullptr;
        FifInput request = makeRequest("x", base, "");
        request.filter = filter;
        request.includeSubFolders = subFolders;
        QStringList searched;
        run(manager, request, job, &searched);
        searched = relative(base, searched);
        searched.sort();
        QCOMPARE(searched, files);
        QCOMPARE(job->getLineHitCount(), files.size());
        QCOMPARE(job->getReadFileCount(), files.size());
    }

    // Each subfolder is searched completely when its entry comes up, in the
    // order in which the folder lists its entries.
    void depthFirst()
    {
        const QString base = root + "/walk";
        const QStringList names{"f1.txt",      "d1/g1.txt", "d1/d2/h1.txt", "d1/g2.txt",
                                "d1/d2/h2.txt", "f2.txt",   "d3/k1.txt",    "d3/d4/m1.txt",
                                "d5/d6/d7/n1.txt"};
        for (const QString& name : names)
            QVERIFY(TestTree::write(base, name, "x\n"));
        FifManager manager;
        FifJob* job = nullptr;
        QStringList searched;
        run(manager, makeRequest("x", base), job, &searched);
        searched = relative(base, searched);
        QCOMPARE(searched.size(), names.size());
        for (const QString folder : {"d1", "d1/d2", "d3", "d3/d4", "d5", "d5/d6"}) {
            QList<int> places;
            for (int i = 0; i < searched.size(); ++i) {
                if (searched[i].startsWith(folder + "/"))
                    places.append(i);
            }
            QVERIFY(!places.isEmpty());
            QCOMPARE(places.last() - places.first() + 1, places.size());
        }
        // The top level comes in listing order.
        QStringList topLevel;
        for (const QString& path : qAsConst(searched)) {
            const QString first = path.section('/', 0, 0);
            if (topLevel.isEmpty() || topLevel.last() != first)
                topLevel.append(first);
        }
        QDir folder(base);
        folder.setFilter(QDir::Files | QDir::NoSymLinks | QDir::Hidden | QDir::AllDirs
                         | QDir::NoDotAndDotDot);
        folder.setSorting(QDir::NoSort);
        QStringList listed;
        for (const QFileInfo& entry : folder.entryInfoList())
            listed.append(entry.fileName());
        QCOMPARE(topLevel, listed);
    }

    // --- the text test -----------------------------------------------------

    void textTest_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<bool>("text");
        QByteArray twenty;
        for (int i = 1; i < 20; ++i)
            twenty += "line\n";
        QTest::newRow("empty") << QByteArray() << true;
        QTest::newRow("plain") << QByteArray("int main()\n{\n}\n") << true;
        QTest::newRow("white space controls") << QByteArray("a\tb\r\nc\vd\fe\r") << true;
        QTest::newRow("zero byte in line 1") << QByteArray("ab\0cd\n", 6) << false;
        QTest::newRow("zero byte in line 20") << twenty + QByteArray("x\0\n", 3) << false;
        QTest::newRow("zero byte in line 21")
            << twenty + "x\n" + QByteArray("\0\n", 2) << true;
        QTest::newRow("SOH") << QByteArray("a\x01") << false;
        QTest::newRow("unit separator") << QByteArray("a\x1F") << false;
        QTest::newRow("DEL") << QByteArray("a\x7F") << false;
        QTest::newRow("latin-1 letters") << QByteArray("caf\xE9 na\xEFve\n") << true;
        QTest::newRow("utf-8") << QByteArray("caf\xC3\xA9\n") << true;
        QTest::newRow("utf-16 le with mark") << QByteArray("\xFF\xFE" "a\0\n\0", 6) << true;
        QTest::newRow("utf-16 be with mark") << QByteArray("\xFE\xFF\0a\0\n", 6) << true;
        QTest::newRow("utf-16 without mark") << QByteArray("a\0\n\0", 4) << false;
        QTest::newRow("control after a long first line")
            << QByteArray(3 * 1024 * 1024, 'x') + '\x02' << false;
    }

    void textTest()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(bool, text);
        const QString path = root + "/texttest/" + QTest::currentDataTag();
        QVERIFY(TestTree::write(root + "/texttest", QTest::currentDataTag(), bytes));
        QCOMPARE(FifWorker::isTextFile(QFileInfo(path)), text);
    }

    void folderIsNoTextFile()
    {
        QVERIFY(!FifWorker::isTextFile(QFileInfo(root + "/src")));
        QVERIFY(!FifWorker::isTextFile(QFileInfo(root + "/no such file")));
    }

    // Files that fail the test are neither opened for the scan nor counted.
    void binaryFilesAreSkipped()
    {
        const QString base = root + "/binary";
        QByteArray twenty;
        for (int i = 1; i < 20; ++i)
            twenty += "needle\n";
        QVERIFY(TestTree::write(base, "line20.txt", twenty + QByteArray("needle\0\n", 8)));
        QVERIFY(TestTree::write(base, "line21.txt", twenty + "x\n" + QByteArray("\0needle\n", 8)));
        QVERIFY(TestTree::write(base, "empty.txt", ""));
        FifManager manager;
        FifJob* job = nullptr;
        QStringList searched;
        run(manager, makeRequest("needle", base), job, &searched);
        searched = relative(base, searched);
        searched.sort();
        QCOMPARE(searched, QStringList({"empty.txt", "line21.txt"}));
        QCOMPARE(job->getReadFileCount(), 2);
        QCOMPARE(job->getFileHitCount(), 1);
        const QList<FifHit> hits = hitsOf(job);
        QCOMPARE(hits.size(), 20);
        QCOMPARE(hits.last().line, 21);
        QCOMPARE(hits.last().text, QString::fromLatin1("\0needle", 7));
        QCOMPARE(hits.last().offset, 19 * 7 + 2 + 1);
    }

    // --- scanning ----------------------------------------------------------

    // One hit per line at its first match. Offsets count characters as
    // decoded, a line end as one; raw offsets count "\r\n" as two.
    void scanning_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QString>("what");
        QTest::addColumn<int>("type");
        QTest::addColumn<QList<int>>("lines");
        QTest::addColumn<QList<int>>("offsets");
        QTest::addColumn<QList<int>>("rawOffsets"); // empty: not checked
        QTest::addColumn<QStringList>("texts");
        const int fixed = QRegExp::FixedString;
        QTest::newRow("crlf, last line without line feed")
            << QByteArray("one\r\nthree\r\nneedle needle\r\nlast needle") << "needle" << fixed
            << QList<int>{3, 4} << QList<int>{10, 29} << QList<int>{12, 32}
            << QStringList{"needle needle", "last needle"};
        QTest::newRow("lone carriage return")
            << QByteArray("one\rneedle\ntwo") << "needle" << fixed << QList<int>{1}
            << QList<int>{4} << QList<int>{} << QStringList{"one\rneedle"};
        QTest::newRow("empty match hits every line")
            << QByteArray("a\n\n\r\nbc\n") << "*" << int(QRegExp::Wildcard)
            << QList<int>{1, 2, 3, 4} << QList<int>{0, 2, 3, 4} << QList<int>{0, 2, 3, 5}
            << QStringList{"a", "", "", "bc"};
        // A physical line is one line: later lines keep their numbers and a
        // match across any 1023-byte boundary is found.
        QByteArray longLine(2499, 'x');
        longLine.replace(1020, 6, "needle");
        QTest::newRow("long line") << longLine + "\nneedle\n" << "needle" << fixed
                                   << QList<int>{1, 2} << QList<int>{1020, 2500}
                                   << QList<int>{1020, 2500}
                                   << QStringList{QString::fromLatin1(longLine), "needle"};
        // Lines decode as UTF-8: found as written, case ignored.
        QTest::newRow("utf-8") << QByteArray("caf\xC3\xA9 NA\xC3\x8FVE\nna\xC3\xAFve\n")
                               << QString::fromUtf8("naïve") << fixed << QList<int>{1, 2}
                               << QList<int>{5, 11} << QList<int>{}
                               << QStringList{QString::fromUtf8("café NAÏVE"),
                                              QString::fromUtf8("naïve")};
        // A zero byte after line 20 is a character like any other: it cuts
        // neither its line's text nor the offsets of later lines.
        QByteArray zero;
        for (int i = 1; i <= 21; ++i)
            zero += "abc\n";
        QTest::newRow("zero byte after line 20")
            << zero + QByteArray("x\0y needle\nneedle\n", 18) << "needle" << fixed
            << QList<int>{22, 23} << QList<int>{88, 95} << QList<int>{88, 95}
            << QStringList{QString::fromLatin1("x\0y needle", 10), "needle"};
        // Read in the encoding of the byte-order mark, which is not counted.
        for (auto encoding : {QStringConverter::Utf16LE, QStringConverter::Utf16BE,
                              QStringConverter::Utf32LE, QStringConverter::Utf32BE}) {
            QStringEncoder encoder(encoding, QStringConverter::Flag::WriteBom);
            const QByteArray bytes =
                encoder.encode(QString::fromUtf8("alpha\r\nna\xC3\xAFve needle\nneedle"));
            QTest::addRow("byte-order mark, %s", QStringConverter::nameForEncoding(encoding))
                << bytes << "needle" << fixed << QList<int>{2, 3} << QList<int>{12, 19}
                << QList<int>{13, 20} << QStringList{QString::fromUtf8("naïve needle"), "needle"};
        }
    }

    void scanning()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(QString, what);
        QFETCH(int, type);
        QFETCH(QList<int>, lines);
        QFETCH(QList<int>, offsets);
        QFETCH(QList<int>, rawOffsets);
        QFETCH(QStringList, texts);
        const QString base = root + "/scan/" + QTest::currentDataTag();
        QVERIFY(TestTree::write(base, "f.txt", bytes));
        FifManager manager;
        FifJob* job = nullptr;
        FifInput request = makeRequest(what, base);
        request.matchType = type;
        request.matchCase = Qt::CaseInsensitive;
        run(manager, request, job);
        const QList<FifHit> hits = hitsOf(job);
        QCOMPARE(job->getReadFileCount(), 1);
        QCOMPARE(linesOf(hits), lines);
        for (int i = 0; i < hits.size(); ++i) {
            QCOMPARE(hits[i].file, base + "/f.txt");
            QCOMPARE(hits[i].job.data(), job);
            QCOMPARE(hits[i].offset, offsets[i]);
            if (!rawOffsets.isEmpty())
                QCOMPARE(hits[i].rawOffset, rawOffsets[i]);
            QCOMPARE(hits[i].text, texts[i]);
        }
    }

    // A line of 16 MiB is matched whole; a longer one may be cut for
    // matching, yet the lines after it keep true numbers and offsets.
    void hugeLines()
    {
        const QString base = root + "/huge";
        const qint64 mib16 = 16 * 1024 * 1024;
        QByteArray first(mib16, 'x');
        first.replace(mib16 - 6, 6, "needle");
        QByteArray second(mib16 + 1000, 'y');
        second.replace(0, 6, "needle");
        {
            QFile file(base + "/h.txt");
            QVERIFY(QDir().mkpath(base));
            QVERIFY(file.open(QIODevice::WriteOnly));
            file.write(first + "\r\n");
            file.write(second + "\r\n");
            file.write("a needle\n");
        }
        first.clear();
        second.clear();
        FifManager manager;
        FifJob* job = nullptr;
        run(manager, makeRequest("needle", base), job);
        const QList<FifHit> hits = hitsOf(job);
        QCOMPARE(linesOf(hits), QList<int>({1, 2, 3}));
        QCOMPARE(hits[0].offset, int(mib16 - 6));
        QCOMPARE(hits[0].text.size(), mib16);
        QCOMPARE(hits[1].offset, int(mib16 + 1));
        QCOMPARE(hits[1].rawOffset, int(mib16 + 2));
        QVERIFY(hits[1].text.size() <= mib16);
        QVERIFY(hits[1].text.startsWith("needleyyy"));
        QCOMPARE(hits[2].offset, int(mib16 + 1 + mib16 + 1000 + 1 + 2));
        QCOMPARE(hits[2].rawOffset, int(mib16 + 2 + mib16 + 1000 + 2 + 2));
    }

    // --- sending hits ------------------------------------------------------

    void batching_data()
    {
        QTest::addColumn<int>("rowsBefore");
        QTest::addColumn<QList<int>>("matchesPerFile");
        QTest::addColumn<QList<int>>("insertions");
        QTest::newRow("empty model: singles") << 0 << QList<int>{5} << QList<int>{1, 1, 1, 1, 1};
        QTest::newRow("3 rows: singles") << 3 << QList<int>{5} << QList<int>{1, 1, 1, 1, 1};
        QTest::newRow("9 rows: singles") << 9 << QList<int>{3} << QList<int>{1, 1, 1};
        QTest::newRow("10 rows: L = 20") << 10 << QList<int>{45} << QList<int>{21, 21, 3};
        QTest::newRow("50 rows: L = 100") << 50 << QList<int>{150} << QList<int>{101, 49};
        QTest::newRow("60 rows: capped at 100")
            << 60 << QList<int>{250} << QList<int>{101, 101, 48};
        QTest::newRow("no batch spans two files") << 50 << QList<int>{30, 30}
                                                  << QList<int>{30, 30};
    }

    // While the search runs and the GUI thread stores nothing, the model's
    // row count stays where it was: hits go singly below 10 rows, else in
    // batches of L + 1, the rest at the end of each file.
    void batching()
    {
        QFETCH(int, rowsBefore);
        QFETCH(QList<int>, matchesPerFile);
        QFETCH(QList<int>, insertions);
        const QString base = root + "/batching/" + QTest::currentDataTag();
        for (int f = 0; f < matchesPerFile.size(); ++f) {
            QByteArray bytes;
            for (int i = 0; i < matchesPerFile[f]; ++i)
                bytes += "needle\n";
            QVERIFY(TestTree::write(base, QString("sub%1/f.txt").arg(f), bytes));
        }
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifHitsModel* model = job->getHitsModel();
        new QAbstractItemModelTester(model, QAbstractItemModelTester::FailureReportingMode::QtTest,
                                     job);
        connect(job, &FifJob::aboutToStart, job, [job, rowsBefore] {
            for (int i = 0; i < rowsBefore; ++i)
                job->appendHit(FifHit("earlier", i, "earlier", 0, 0, job));
        });
        QVERIFY(job->start(makeRequest("needle", base)));
        QCOMPARE(model->rowCount(), rowsBefore);
        QList<int> sizes;
        connect(model, &QAbstractItemModel::rowsInserted, this,
                [&](const QModelIndex&, int first, int last) { sizes.append(last - first + 1); });
        // Block without handling events until the search has ended.
        QVERIFY(job->wait(60000));
        QCOMPARE(model->rowCount(), rowsBefore);
        QTRY_VERIFY(!sizes.isEmpty());
        QCoreApplication::processEvents();
        QCOMPARE(sizes, insertions);
        // The hits keep the order in which they were found.
        const QList<FifHit> hits = hitsOf(job).mid(rowsBefore);
        int total = 0;
        for (int n : matchesPerFile)
            total += n;
        QCOMPARE(hits.size(), total);
        for (int i = 1; i < hits.size(); ++i) {
            if (hits[i].file == hits[i - 1].file)
                QCOMPARE(hits[i].line, hits[i - 1].line + 1);
        }
    }

    // When the view is cleared during a search while a batch waits, the next
    // hits go singly again; the waiting batch is sent first, so no hit
    // overtakes an earlier one.
    void batchSentBeforeSinglesWhenModelShrinks()
    {
        const QString base = root + "/shrink";
        QByteArray bytes;
        for (int i = 0; i < 60; ++i)
            bytes += "needle\n";
        QVERIFY(TestTree::write(base, "s.txt", bytes));
        FifManager manager;
        FifJob* job = nullptr;
        prepare(manager, makeRequest("needle", base), job);
        FifHitsModel* model = job->getHitsModel();
        for (int i = 0; i < 8; ++i)
            job->appendHit(FifHit("earlier", i, "earlier", 0, 0, job));
        // The worker runs in this thread, so its hits reach the model at
        // once. Lines 1 and 2 go singly (8 and 9 rows); lines 3 to 23 wait
        // in a batch that is sent when line 24 comes (L = 20). Clearing the
        // model right then leaves line 24 waiting while line 25 sees 0 rows.
        bool cleared = false;
        connect(model, &QAbstractItemModel::dataChanged, this, [&](const QModelIndex& index) {
            if (!cleared && model->rowCount() == 31 && index.row() == 30) {
                cleared = true;
                model->removeRows(0, model->rowCount(), QModelIndex());
            }
        });
        {
            FifWorker worker(job);
            worker.searchFolders();
        }
        QVERIFY(cleared);
        const QList<FifHit> hits = hitsOf(job);
        QList<int> expected;
        for (int line = 24; line <= 60; ++line)
            expected.append(line);
        QCOMPARE(linesOf(hits), expected);
    }

    // --- stopping ----------------------------------------------------------

    // A stop during a long file ends its scan within 100 lines; the waiting
    // batch is still sent and the file counts as hit. The next folder is
    // not entered.
    void stopDuringLongFile()
    {
        const QString base = root + "/stoplong";
        QByteArray bytes;
        for (int i = 0; i < 10000; ++i)
            bytes += "x\n";
        QVERIFY(TestTree::write(base, "a/long.txt", bytes));
        QVERIFY(TestTree::write(base, "b/other.txt", "x\n"));
        FifManager manager;
        FifJob* job = nullptr;
        prepare(manager, makeRequest("x", base + "/a;" + base + "/b"), job);
        FifHitsModel* model = job->getHitsModel();
        for (int i = 0; i < 50; ++i)
            job->appendHit(FifHit("earlier", i, "earlier", 0, 0, job));
        int stoppedAtLine = 0;
        // Stop as soon as the first batch of the file is stored.
        connect(model, &QAbstractItemModel::dataChanged, this, [&](const QModelIndex& index) {
            if (!stoppedAtLine && model->rowCount() > 50 && index.row() == model->rowCount() - 1) {
                stoppedAtLine = index.data(Qt::UserRole).value<FifHit>().line;
                job->stop();
            }
        });
        {
            FifWorker worker(job);
            worker.searchFolders();
            QVERIFY(job->shouldStop());
        }
        // Destroying the worker clears the flag.
        QVERIFY(!job->shouldStop());
        QVERIFY(stoppedAtLine > 0);
        const QList<int> lines = linesOf(hitsOf(job).mid(50));
        QVERIFY(lines.size() > stoppedAtLine);
        QVERIFY(lines.size() < stoppedAtLine + 100);
        for (int i = 0; i < lines.size(); ++i)
            QCOMPARE(lines[i], i + 1);
        QCOMPARE(job->getReadFileCount(), 1);
        QCOMPARE(job->getFileHitCount(), 1);
    }

    // A stop deep inside a subfolder ends every level at its next entry, and
    // no further folder is entered.
    void stopInDeepFolder()
    {
        const QString base = root + "/stopdeep";
        QVERIFY(TestTree::write(base, "a/d1/d2/d3/deep.txt", "x\n"));
        for (int i = 0; i < 5; ++i) {
            QVERIFY(TestTree::write(base, QString("a/d1/d2/f%1.txt").arg(i), "x\n"));
            QVERIFY(TestTree::write(base, QString("a/d1/g%1.txt").arg(i), "x\n"));
            QVERIFY(TestTree::write(base, QString("a/h%1.txt").arg(i), "x\n"));
        }
        QVERIFY(TestTree::write(base, "b/other.txt", "x\n"));
        FifManager manager;
        FifJob* job = nullptr;
        prepare(manager, makeRequest("x", base + "/a;" + base + "/b"), job);
        connect(job->getHitsModel(), &QAbstractItemModel::rowsInserted, job, &FifJob::stop);
        {
            FifWorker worker(job);
            worker.searchFolders();
        }
        QCOMPARE(job->getReadFileCount(), 1);
        QCOMPARE(job->getLineHitCount(), 1);
        QVERIFY(!job->shouldStop());
    }

    // A job stopped while its thread runs can be started again at once and
    // then searches to the end.
    void restartAfterStop()
    {
        const QString base = root + "/restart";
        QByteArray bytes;
        for (int i = 0; i < 20000; ++i)
            bytes += "x\n";
        for (int f = 0; f < 5; ++f)
            QVERIFY(TestTree::write(base, QString("d%1/f.txt").arg(f), bytes));
        FifManager manager;
        FifJob* job = manager.getJob(0);
        connect(job, &FifJob::searching, job, &FifJob::stop);
        FIF_RUN_JOB(job, makeRequest("x", base), 60000);
        QVERIFY(!job->shouldStop());
        QVERIFY(job->getReadFileCount() >= 1);
        disconnect(job, &FifJob::searching, job, &FifJob::stop);
        FIF_RUN_JOB(job, makeRequest("x", base), 60000);
        QCOMPARE(job->getReadFileCount(), 5);
        QCOMPARE(job->getFileHitCount(), 5);
        QCOMPARE(job->getLineHitCount(), 5 * 20000);
    }
};

QTEST_GUILESS_MAIN(tst_FifWorker)
#include "tst_fifworker.moc"
