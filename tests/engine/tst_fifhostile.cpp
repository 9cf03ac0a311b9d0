// Hostile input: odd trees, odd files, odd names and odd patterns. The engine
// must end every search, read only what a request names, never write, and
// keep its results exact.

#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifSettings.h"
#include "Settings.h"
#include "TestTree.h"

#include <QElapsedTimer>
#include <QtTest>

#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/types.h>
#include <fcntl.h>
#include <unistd.h>

using namespace Gui::Orba;

namespace {

QList<FifHit> hitsOf(FifJob* job)
{
    QList<FifHit> hits;
    FifHitsModel* model = job->getHitsModel();
    for (int row = 0; row < model->rowCount(); ++row)
        hits.append(model->data(model->index(row, 0), Qt::UserRole).value<FifHit>());
    return hits;
}

FifInput requestFor(const QString& where, const QString& what,
                    int matchType = QRegExp::FixedString)
{
    FifInput request;
    request.where = where;
    request.what = what;
    request.matchType = matchType;
    return request;
}

} // namespace

class tst_FifHostile : public QObject
{
    Q_OBJECT

private slots:
    void byteOrderMarksInsideText_data();
    void byteOrderMarksInsideText();
    void nestedFolders();
    void symbolicLinks();
    void fifoAndSocket();
    void unreadableEntries();
    void filesChangingDuringSearch();
    void sparseFile();
    void longSingleLine();
    void oddNames();
    void nothingIsWritten();
    void longLinesMatchAsBefore_data();
    void longLinesMatchAsBefore();
    void pathologicalPatternStops_data();
    void pathologicalPatternStops();
    void damagedSettingsStore_data();
    void damagedSettingsStore();

private:
    FifManager manager;
};

void tst_FifHostile::byteOrderMarksInsideText_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<int>("line");
    QTest::addColumn<int>("offset");
    QTest::addColumn<int>("rawOffset");
    QTest::addColumn<QString>("text");
    const QString zwnbsp(QChar(0xFEFF));
    // The file's own mark is skipped; a second one is a character of line 1.
    QTest::newRow("utf-8, mark twice") << QByteArray("\xEF\xBB\xBF\xEF\xBB\xBFneedle\n")
                                       << 1 << 1 << 1 << zwnbsp + "needle";
    // Files joined together keep the marks of the later ones at line starts.
    QTest::newRow("utf-8, mark at a line start")
        << QByteArray("\xEF\xBB\xBF" "first\r\n\xEF\xBB\xBFneedle\n") << 2 << 7 << 8
        << zwnbsp + "needle";
    QTest::newRow("utf-16le, mark twice")
        << QByteArray("\xFF\xFE\xFF\xFEn\0e\0e\0d\0l\0e\0", 16) << 1 << 1 << 1
        << zwnbsp + "needle";
    QTest::newRow("utf-16be, mark at a line start")
        << QByteArray("\xFE\xFF\0a\0\n\xFE\xFF\0n\0e\0e\0d\0l\0e", 20) << 2 << 3 << 3
        << zwnbsp + "needle";
}

void tst_FifHostile::byteOrderMarksInsideText()
{
    QFETCH(QByteArray, bytes);
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "marks.txt", bytes));
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 30000);
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 1);
    QTEST(hits.at(0).line, "line");
    QTEST(hits.at(0).offset, "offset");
    QTEST(hits.at(0).rawOffset, "rawOffset");
    QTEST(hits.at(0).text, "text");
}

// 500 folders deep: found at the bottom, nothing lost on the way.
void tst_FifHostile::nestedFolders()
{
    QTemporaryDir dir;
    QString relative;
    for (int depth = 0; depth < 500; ++depth)
        relative += QStringLiteral("n/");
    QVERIFY(TestTree::write(dir.path(), relative + "deep.txt", "x\nthe needle\n"));
    QVERIFY(TestTree::write(dir.path(), "top.txt", "needle\n"));
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 60000);
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 2);
    QCOMPARE(job->getReadFileCount(), 2);
    bool deepFound = false;
    for (const FifHit& hit : hits) {
        if (hit.file.endsWith(relative + "deep.txt")) {
            deepFound = true;
            QCOMPARE(hit.line, 2);
            QCOMPARE(hit.offset, 2 + 4);
        }
    }
    QVERIFY(deepFound);
}

// Links are never followed: loops end, and nothing outside the tree is read.
void tst_FifHostile::symbolicLinks()
{
    QTemporaryDir dir;
    QTemporaryDir outside;
    QVERIFY(TestTree::write(dir.path(), "real/a.txt", "needle inside\n"));
    QVERIFY(TestTree::write(outside.path(), "secret.txt", "needle outside\n"));
    const QString root = dir.path();
    QVERIFY(QFile::link(root, root + "/real/up"));                 // loop to the top
    QVERIFY(QFile::link("..", root + "/real/parent"));             // relative loop
    QVERIFY(QFile::link(root + "/x", root + "/y"));                // y -> x -> y
    QVERIFY(QFile::link(root + "/y", root + "/x"));
    QVERIFY(QFile::link(root + "/self.txt", root + "/self.txt"));  // itself
    QVERIFY(QFile::link(outside.path(), root + "/out"));
    QVERIFY(QFile::link(outside.path() + "/secret.txt", root + "/secret.txt"));
    QVERIFY(QFile::link(root + "/real/a.txt", root + "/a-link.txt"));
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(root, "needle"), 60000);
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 1);
    QCOMPARE(hits.at(0).file, root + "/real/a.txt");
    QCOMPARE(job->getReadFileCount(), 1);
}

// A FIFO and a socket are not files to read: the search passes them by and
// ends, whatever their names.
void tst_FifHostile::fifoAndSocket()
{
    QTemporaryDir dir;
    const QByteArray fifo = QFile::encodeName(dir.path() + "/pipe.txt");
    QCOMPARE(::mkfifo(fifo.constData(), 0600), 0);
    const QByteArray socketPath = QFile::encodeName(dir.path() + "/socket.txt");
    const int listener = ::socket(AF_UNIX, SOCK_STREAM, 0);
    QVERIFY(listener >= 0);
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    QVERIFY(size_t(socketPath.size()) < sizeof address.sun_path);
    qstrcpy(address.sun_path, socketPath.constData());
    QCOMPARE(::bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
    QCOMPARE(::listen(listener, 1), 0);
    auto closeListener = qScopeGuard([listener] { ::close(listener); });
    QVERIFY(QFileInfo::exists(dir.path() + "/socket.txt"));
    QVERIFY(TestTree::write(dir.path(), "plain.txt", "needle\n"));

    FifJob* job = manager.getJob(0);
    QEventLoop loop;
    bool ended = false;
    connect(job, &QThread::finished, &loop, [&] { ended = true; loop.quit(); },
            Qt::QueuedConnection);
    QVERIFY(job->start(requestFor(dir.path(), "needle")));
    QTimer::singleShot(30000, &loop, &QEventLoop::quit);
    if (!ended)
        loop.exec();
    if (!ended) {
        // Release a reader blocked on the FIFO so that the test can end.
        const int fd = ::open(fifo.constData(), O_WRONLY | O_NONBLOCK);
        if (fd >= 0)
            ::close(fd);
        job->stop();
        QTRY_VERIFY_WITH_TIMEOUT(!job->isRunning(), 30000);
        QFAIL("the search blocked on a FIFO or socket");
    }
    QCoreApplication::processEvents();
    QCOMPARE(hitsOf(job).size(), 1);
    QCOMPARE(job->getReadFileCount(), 1);
}

void tst_FifHostile::unreadableEntries()
{
    if (::geteuid() == 0)
        QSKIP("running as root: file permissions do not keep root from reading");
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "closed.txt", "needle\n"));
    QVERIFY(TestTree::write(dir.path(), "shut/inner.txt", "needle\n"));
    QVERIFY(TestTree::write(dir.path(), "open.txt", "needle\n"));
    QVERIFY(QFile::setPermissions(dir.path() + "/closed.txt", QFileDevice::Permissions()));
    QVERIFY(QFile::setPermissions(dir.path() + "/shut", QFileDevice::Permissions()));
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 30000);
    QFile::setPermissions(dir.path() + "/shut", QFileDevice::ReadOwner | QFileDevice::WriteOwner
                                                    | QFileDevice::ExeOwner);
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 1);
    QCOMPARE(hits.at(0).file, dir.path() + "/open.txt");
}

// Files deleted, truncated and growing while the search reads them: every
// run ends, and every hit is a true line of some version of its file.
void tst_FifHostile::filesChangingDuringSearch()
{
    QTemporaryDir dir;
    constexpr int files = 200;
    constexpr int lines = 300;
    const QByteArray lineBytes = "needle 000000\n"; // 14 bytes, every line alike in length
    QByteArray body;
    for (int i = 0; i < lines; ++i)
        body += "needle " + QByteArray::number(100000 + i) + "\n";
    QCOMPARE(body.size(), lines * lineBytes.size());
    qint64 hitsChecked = 0;
    for (int run = 0; run < 3; ++run) {
        for (int i = 0; i < files; ++i)
            QVERIFY(TestTree::write(dir.path(), QStringLiteral("f%1.txt").arg(i), body));
        FifJob* job = manager.getJob(0);
        std::atomic<bool> done{false};
        QThread* mutator = QThread::create([&] {
            for (int round = 0; !done.load(); ++round) {
                for (int i = (round + run) % 4; i < files && !done.load(); i += 4) {
                    const QString path = dir.path() + QStringLiteral("/f%1.txt").arg(i);
                    QFile file(path);
                    switch ((i + round) % 4) {
                    case 0: QFile::remove(path); break;
                    case 1: // whole lines off the end
                        if (file.open(QIODevice::ReadWrite))
                            file.resize(qMax<qint64>(0, file.size() - 50 * 14));
                        break;
                    case 2: // grows by whole lines
                        if (file.open(QIODevice::Append))
                            file.write("needle 999999\n");
                        break;
                    default: // rewritten from the start
                        if (file.open(QIODevice::WriteOnly))
                            file.write(body.left(14 * 20));
                        break;
                    }
                }
                QThread::usleep(200);
            }
        });
        mutator->start();
        FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 120000);
        done = true;
        mutator->wait();
        delete mutator;
        const QList<FifHit> hits = hitsOf(job);
        static const QRegularExpression shape(QStringLiteral("^needle \\d{6}$"));
        for (const FifHit& hit : hits) {
            QVERIFY2(shape.match(hit.text).hasMatch(), qPrintable(hit.text));
            QCOMPARE(hit.offset, (hit.line - 1) * 14);
            QCOMPARE(hit.rawOffset, hit.offset);
        }
        QVERIFY(job->getFileHitCount() <= job->getReadFileCount());
        QVERIFY(job->getReadFileCount() <= files);
        hitsChecked += hits.size();
    }
    qInfo("changing files: 3 runs over %d files, %lld hits checked", files, hitsChecked);
}

// A sparse 2 GiB file of zero bytes, with and without a text line ahead of
// them: both binary, passed over; the search goes on to the next file.
void tst_FifHostile::sparseFile()
{
    QTemporaryDir dir;
    const qint64 size = qint64(2) << 30;
    QFile zeros(dir.path() + "/zeros.txt");
    QVERIFY(zeros.open(QIODevice::WriteOnly));
    QVERIFY(zeros.resize(size));
    zeros.close();
    QFile headed(dir.path() + "/headed.txt");
    QVERIFY(headed.open(QIODevice::WriteOnly));
    QVERIFY(headed.write("needle\n") == 7);
    QVERIFY(headed.resize(size));
    headed.close();
    QVERIFY(TestTree::write(dir.path(), "plain.txt", "needle\n"));
    FifJob* job = manager.getJob(0);
    QElapsedTimer timer;
    timer.start();
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 300000);
    qInfo("two sparse 2 GiB files passed over in %lld ms", timer.elapsed());
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 1);
    QCOMPARE(hits.at(0).file, dir.path() + "/plain.txt");
}

// A 64 MiB line: counted in full, the next line's hit lands where it is.
void tst_FifHostile::longSingleLine()
{
    QTemporaryDir dir;
    const qint64 length = qint64(64) << 20;
    {
        QFile file(dir.path() + "/long.txt");
        QVERIFY(file.open(QIODevice::WriteOnly));
        QVERIFY(file.write("needle ") == 7);
        const QByteArray chunk(1 << 20, 'a');
        for (qint64 written = 7; written < length; written += chunk.size())
            QVERIFY(file.write(chunk.left(int(qMin<qint64>(chunk.size(), length - written)))) > 0);
        QVERIFY(file.write("\nneedle\n") == 8);
    }
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 300000);
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 2);
    QCOMPARE(hits.at(0).line, 1);
    QCOMPARE(hits.at(0).offset, 0);
    QCOMPARE(hits.at(1).line, 2);
    QCOMPARE(hits.at(1).offset, int(length) + 1);
    QCOMPARE(hits.at(1).text, QStringLiteral("needle"));
}

// Names that are hard on tools: a line break, blanks, leading dashes, and
// bytes that are not UTF-8.
void tst_FifHostile::oddNames()
{
    QTemporaryDir dir;
    const QStringList names = {"new\nline.txt", " leading blank.txt", "trailing blank .txt",
                               "-rf.txt", "--help.txt", "-"};
    for (const QString& name : names)
        QVERIFY(TestTree::write(dir.path(), name, "needle\n"));
    const QByteArray raw = QFile::encodeName(dir.path()) + "/bad\xff\xfe.txt";
    const int fd = ::open(raw.constData(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    QVERIFY(fd >= 0);
    QCOMPARE(::write(fd, "needle\n", 7), ssize_t(7));
    ::close(fd);

    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 30000);
    QStringList found;
    for (const FifHit& hit : hitsOf(job)) {
        found.append(QFileInfo(hit.file).fileName());
        QVERIFY2(!hit.getCanonicalFilePath().isEmpty(), qPrintable(hit.file));
    }
    for (const QString& name : names)
        QVERIFY2(found.contains(name), qPrintable(name));
    // A name that is not UTF-8 has no exact QString; the file is either read
    // under a name that opens it, or passed over: never another file.
    QVERIFY(found.size() == names.size() || found.size() == names.size() + 1);
    qInfo("non-UTF-8 name %s", found.size() > names.size() ? "searched" : "passed over");
    // QTemporaryDir cannot name it either.
    ::unlink(raw.constData());
}

// Searching reads: bytes, sizes and modification times stay as they were.
void tst_FifHostile::nothingIsWritten()
{
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "a.txt", "needle\r\nmore\n"));
    QVERIFY(TestTree::write(dir.path(), "sub/b.txt", QByteArray("\xFF\xFEn\0e\0", 6)));
    QVERIFY(TestTree::write(dir.path(), "sub/bin.dat", QByteArray("\0\1\2needle", 9)));
    QVERIFY(TestTree::write(dir.path(), "empty.txt", QByteArray()));
    QVERIFY(TestTree::write(dir.path(), "-odd name\n.txt", "needle"));
    auto snapshot = [&] {
        QStringList state;
        QDirIterator it(dir.path(), QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
        while (it.hasNext()) {
            const QString path = it.next();
            struct stat info = {};
            ::stat(QFile::encodeName(path).constData(), &info);
            QFile file(path);
            file.open(QIODevice::ReadOnly);
            state.append(QStringLiteral("%1 %2 %3.%4 %5")
                             .arg(path).arg(info.st_size).arg(info.st_mtim.tv_sec)
                             .arg(info.st_mtim.tv_nsec)
                             .arg(QString::fromLatin1(file.readAll().toHex())));
        }
        state.sort();
        return state;
    };
    const QStringList before = snapshot();
    QCOMPARE(before.size(), 5);
    FifJob* job = manager.getJob(0);
    for (int type : {int(QRegExp::FixedString), int(QRegExp::Wildcard), int(QRegExp::RegExp2)})
        FIF_RUN_JOB(job, requestFor(dir.path(), "ne*e", type), 30000);
    QCOMPARE(snapshot(), before);
}

void tst_FifHostile::longLinesMatchAsBefore_data()
{
    QTest::addColumn<QString>("what");
    QTest::addColumn<int>("matchType");
    QTest::addColumn<bool>("matchCase");
    QTest::addColumn<bool>("matchWord");
    const int rx = QRegExp::RegExp2;
    QTest::newRow("literal as expression") << "needle" << rx << false << false;
    QTest::newRow("word") << "needle" << int(QRegExp::FixedString) << false << true;
    QTest::newRow("case") << "NEEDLE" << rx << true << false;
    QTest::newRow("end anchor") << "x+$" << rx << false << false;
    QTest::newRow("caret kept whole") << "^a|needle" << rx << false << false;
    QTest::newRow("back reference") << "(\\d)\\1" << rx << false << false;
    QTest::newRow("lookahead") << "e(?=d)" << rx << false << false;
    QTest::newRow("negative lookahead") << "n(?!e)" << rx << false << false;
    QTest::newRow("alternation") << "zz|yx|needle" << rx << false << false;
    QTest::newRow("boundaries") << "\\Ba\\b" << rx << false << false;
    QTest::newRow("repetition") << "a*b" << rx << false << false;
    QTest::newRow("classes") << "[^a-z ]{2}" << rx << false << false;
    QTest::newRow("wildcard") << "n?ed*x" << int(QRegExp::Wildcard) << false << false;
    QTest::newRow("wildcard word") << "ne?dle" << int(QRegExp::Wildcard) << false << true;
    QTest::newRow("matches empty") << "q*" << rx << false << false;
}

// Lines above the length where matching goes position by position give
// exactly what Qt's own search of the whole line gives.
void tst_FifHostile::longLinesMatchAsBefore()
{
    QFETCH(QString, what);
    QFETCH(int, matchType);
    QFETCH(bool, matchCase);
    QFETCH(bool, matchWord);
    FifInput request = requestFor(QString(), what, matchType);
    request.matchCase = matchCase ? Qt::CaseSensitive : Qt::CaseInsensitive;
    request.matchWord = matchWord;
    QVERIFY(request.isValid());

    // Lines of 1000 to 5000 characters from a small alphabet, some holding
    // the needle near the start, the middle or the end.
    QStringList lines;
    quint32 seed = 12345;
    auto next = [&seed] { seed = seed * 1103515245u + 12345u; return (seed >> 16) & 0x7fff; };
    const char alphabet[] = "aab xyzd11N";
    for (int i = 0; i < 40; ++i) {
        QString line;
        const int length = 1000 + int(next() % 4000);
        for (int c = 0; c < length; ++c)
            line += QLatin1Char(alphabet[next() % (sizeof alphabet - 1)]);
        if (i % 3 == 0)
            line.insert(int(next()) % line.size(), QStringLiteral(" needle "));
        if (i % 5 == 0)
            line += QStringLiteral("x needle x");
        lines.append(line);
    }
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "long.txt", lines.join(QLatin1Char('\n')).toUtf8()));
    request.where = dir.path();

    QList<int> expected;
    const QRegExp plain = request.getRegExp();
    for (const QString& line : lines) {
        QRegExp rx = plain;
        expected.append(rx.indexIn(line, 0, QRegExp::CaretAtZero));
    }
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, request, 120000);
    QList<int> got(lines.size(), -1);
    int offset = 0;
    QList<int> lineStart;
    for (const QString& line : lines) {
        lineStart.append(offset);
        offset += int(line.size()) + 1;
    }
    for (const FifHit& hit : hitsOf(job)) {
        QVERIFY(hit.line >= 1 && hit.line <= lines.size());
        got[hit.line - 1] = hit.offset - lineStart.at(hit.line - 1);
    }
    QCOMPARE(got, expected);
}

void tst_FifHostile::pathologicalPatternStops_data()
{
    QTest::addColumn<QString>("what");
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<int>("fullHits");
    QTest::newRow("(a*)*b on a's") << "(a*)*b" << QByteArray(200000, 'a') << 0;
    QTest::newRow("(a|aa)*b on a's, c, b") << "(a|aa)*b" << QByteArray(200000, 'a') + "cb" << 1;
    QTest::newRow(".*x on a's") << ".*x" << QByteArray(200000, 'a') << 0;
}

// How long a stop takes while a pattern that Qt matches in quadratic time
// works on a long line. Reported, not asserted.
void tst_FifHostile::pathologicalPatternStops()
{
    QFETCH(QString, what);
    QFETCH(QByteArray, line);
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "line.txt", line + "\n"));
    FifJob* job = manager.getJob(0);
    QEventLoop loop;
    bool ended = false;
    bool opened = false;
    connect(job, &FifJob::searching, &loop, [&] { opened = true; });
    connect(job, &QThread::finished, &loop, [&] { ended = true; loop.quit(); },
            Qt::QueuedConnection);
    QElapsedTimer timer;
    timer.start();
    QVERIFY(job->start(requestFor(dir.path(), what, QRegExp::RegExp2)));
    QTRY_VERIFY_WITH_TIMEOUT(opened || ended, 60000);
    QTest::qWait(200);
    if (ended) {
        qInfo("%s: search ended by itself in %lld ms", qPrintable(what), timer.elapsed());
    } else {
        timer.restart();
        job->stop();
        QTimer::singleShot(600000, &loop, &QEventLoop::quit);
        if (!ended)
            loop.exec();
        QVERIFY(ended);
        qInfo("%s: stop took %lld ms", qPrintable(what), timer.elapsed());
    }
    QCoreApplication::processEvents();
    QVERIFY(!job->isRunning());
    QFETCH(int, fullHits);
    QVERIFY(job->getLineHitCount() <= fullHits);
}

// A damaged or unwritable settings file costs the history, not the search:
// the request keeps what it had for whatever cannot be read, and runs.
void tst_FifHostile::damagedSettingsStore_data()
{
    QTest::addColumn<QByteArray>("ini");
    QTest::newRow("garbage") << QByteArray("\xFF\xFE[[[\n=\n\\\0\x01", 11);
    QTest::newRow("wrong kinds")
        << QByteArray("[FindBar]\nMatchType=@Variant(\\0\\0\\0\\x7f\\0\\0\\0\\x1cQ)\n"
                      "MatchCase=@ByteArray(\\xff)\nFind%20what=@Rect(1 2 3 4)\n"
                      "[ValueTypes]\nFindBar|MatchType=39\nFindBar|MatchCase=1024\n");
}

void tst_FifHostile::damagedSettingsStore()
{
    QFETCH(QByteArray, ini);
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "config.ini", ini));
    QVERIFY(TestTree::write(dir.path(), "tree/a.txt", "needle\n"));
    // A file where the folder of the second store should be: never writable.
    QVERIFY(TestTree::write(dir.path(), "blocked", "x"));
    Settings damaged(dir.path() + "/config.ini");
    Settings unwritable(dir.path() + "/blocked/config.ini");
    unwritable.setValue(FifSettings().getFindWhatKeyPath(), QStringList{"needle"});
    unwritable.sync();
    QVERIFY(!unwritable.isPersistent());
    for (Settings* store : {&damaged, &unwritable}) {
        FifInput request;
        request.setContents(store);
        QVERIFY(request.matchCase == Qt::CaseSensitive || request.matchCase == Qt::CaseInsensitive);
        QVERIFY(request.matchType == QRegExp::FixedString || request.matchType == QRegExp::Wildcard
                || request.matchType == QRegExp::RegExp2);
        request.what = QStringLiteral("needle");
        request.matchType = QRegExp::FixedString;
        request.where = dir.path() + "/tree";
        FifJob* job = manager.getJob(0);
        FIF_RUN_JOB(job, request, 30000);
        QCOMPARE(job->getLineHitCount(), 1);
    }
}

QTEST_MAIN(tst_FifHostile)
#include "tst_fifhostile.moc"
