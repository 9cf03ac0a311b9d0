// Whole searches over real trees, compared with a plain reading of every file
// (walk order, hits, offsets and counters at once); how hits reach the model;
// stopping and restarting; jobs, managers and windows coming and going.

#include "FifManager.h"
#include "FifScanPool.h"
#include "FifSettings.h"
#include "FifReference.h"
#include "FifTest.h"
#include "FifWorker.h"
#include "MainWindow.h"

#include <QStringEncoder>
#include <QtTest>

#include <atomic>
#include <fcntl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

using namespace Gui::Orba;

namespace {

// The files a search reads, by the rules of QDir's listing: depth-first in
// listing order, links and all but regular files passed over, file patterns
// without case; patterns after "!" leave out files and folders.
void walk(const QString& folder, const FifInput& in, QStringList* files)
{
    QStringList patterns, exclusions;
    for (const QString& pattern : in.filter.split(';', Qt::SkipEmptyParts))
        (pattern.startsWith('!') ? exclusions : patterns) << pattern.mid(pattern.startsWith('!') ? 1 : 0);
    QDir dir(folder, QString(), QDir::NoSort, QDir::Files | QDir::NoSymLinks | QDir::Hidden | QDir::AllDirs | QDir::NoDotAndDotDot);
    dir.setNameFilters(patterns);
    for (const QFileInfo& entry : dir.entryInfoList()) {
        if (!exclusions.isEmpty() && QDir::match(exclusions, entry.fileName()))
            continue;
        if (entry.isFile())
            files->append(entry.filePath());
        else if (in.includeSubFolders)
            walk(entry.filePath(), in, files);
    }
}

QString hitLine(const QString& file, int line, const QString& text, int offset, int rawOffset)
{
    return QStringLiteral("%1 (%2): %3 @%4/%5|%3").arg(QDir::toNativeSeparators(file), QString::number(line), text,
                                                       QString::number(offset), QString::number(rawOffset));
}

// "searching <file>" for every text file, then one line per hit as shown.
QStringList expected(const FifInput& in)
{
    QStringList files, events;
    for (const QString& where : in.where.split(';'))
        walk(where, in, &files);
    for (const QString& path : qAsConst(files)) {
        QFile file(path);
        if (!file.open(QIODevice::ReadOnly) || !FifReference::isText(file.read(1 << 20)) || !file.seek(0))
            continue;
        events << "searching " + path;
        for (const FifReference::Match& m : FifReference::matches(file.readAll(), in.getRegExp()))
            events << hitLine(path, m.line, m.text, m.offset, m.rawOffset);
    }
    return events;
}

// Names, times, sizes and (when small) bytes of all below `root`.
QStringList snapshot(const QString& root)
{
    QStringList state;
    for (QDirIterator it(root, QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                         QDirIterator::Subdirectories); it.hasNext();) {
        QFile file(it.next());
        const bool small = it.fileInfo().isFile() && file.size() < 65536 && file.open(QIODevice::ReadOnly);
        state << file.fileName() + it.fileInfo().lastModified().toString(Qt::ISODateWithMs)
                     + QString::number(file.size()) + (small ? file.readAll().toHex() : QByteArray());
    }
    return state;
}

// Notes what the GUI thread learns of a job's search, as expected() has it;
// batches start at 10 rows and hold one file's hits.
void record(FifJob* job, QStringList* events, QSet<QString>* hitFiles)
{
    FifHitsModel* model = job->getHitsModel();
    QObject::connect(job, &FifJob::searching, model, [=](const QString& file) { *events << "searching " + file; });
    QObject::connect(model, &QAbstractItemModel::rowsInserted, model, [=](const QModelIndex&, int first, int last) {
        QVERIFY2(first == last || first >= 10, "singles while the model has fewer than 10 rows");
        for (int row = first; row <= last; ++row) {
            const FifHit hit = model->index(row).data(Qt::UserRole).value<FifHit>();
            QCOMPARE(hit.file, model->index(first).data(Qt::UserRole).value<FifHit>().file);
            *hitFiles << hit.file;
            *events << model->index(row).data().toString() + QStringLiteral(" @%1/%2|").arg(hit.offset)
                               .arg(hit.rawOffset) + model->index(row).data(Qt::ToolTipRole).toString();
        }
    });
}

struct FolderRecorder : FifWorker {  // walks nothing: notes the folders that a request names
    using FifWorker::FifWorker;
    void searchFolder(const QDir& folder) override { folders << folder.path(); }
    QStringList folders;
};

} // namespace

class tst_FifSearch : public QObject
{
    Q_OBJECT

    QTemporaryDir tree;
    QString root, ref, big, slow;
    QStringList before;

private slots:
    void initTestCase()
    {
        root = QFileInfo(tree.path()).canonicalFilePath();
        ref = root + "/ref", big = root + "/big", slow = root + "/slow";
        const char* const samples[] = {"needle", "Needle here", "needles", "  a needle, a NEEDLE", "noodle",
                                       "x", "", "na\xC3\xAFve needle", "100%1 needle%2", "\tneedle\t"};
        const QStringList names{"a.txt", "B.TXT", "c.C", "d.dat", ".hidden.txt", "-rf.txt", "--help.txt", "-",
                                " leading blank.txt", "trailing blank .txt", "new\nline.txt", "a%2b.txt"};
        const QStringList folders{"", "sub/", "sub/deeper/", ".hid/", "other/"};
        quint32 seed = 7;
        auto next = [&seed](int n) { seed = seed * 1103515245u + 12345u; return int((seed >> 16) % n); };
        for (int i = 0; i < 40; ++i) {
            QByteArray bytes;
            for (int line = next(30); line > 0; --line)
                bytes += samples[next(10)] + QByteArray(next(3) ? "\n" : "\r\n");
            QVERIFY(FifTest::write(ref, folders[i % 5] + names[i % 12], bytes + (next(4) ? "" : "needle")));
        }
        QVERIFY(FifTest::write(ref, "many.txt", QByteArray("needle\n").repeated(300)));
        for (int at : {20, 21}) {  // a control character counts in the first 20 lines only
            const QString text = QStringLiteral("needle\n").repeated(25).insert(7 * at - 1, QChar(1));  // on line `at`
            QStringEncoder utf16(QStringConverter::Utf16BE, QStringConverter::Flag::WriteBom);
            QVERIFY(FifTest::write(ref, QStringLiteral("enc/u16-%1.txt").arg(at), utf16.encode(text)));
        }
        // Hostile: deep nesting, links and their loops, a FIFO, a socket, sparse files.
        QVERIFY(FifTest::write(ref, QString("n/").repeated(300) + "deep.txt", "x\nthe needle\n"));
        QVERIFY(FifTest::write(root, "outside/secret.txt", "needle\n"));
        const QByteArray native = QFile::encodeName(ref);  // names that are not UTF-8: a file, a folder
        QVERIFY(::mkdir(native + "/odd\xfe", 0700) == 0);
        for (const QByteArray& name : {native + "/bad\xff.txt", native + "/odd\xfe/x.txt"}) {
            const int fd = ::open(name.constData(), O_WRONLY | O_CREAT, 0600);
            QVERIFY(fd >= 0 && ::write(fd, "needle\n", 7) == 7 && ::close(fd) == 0);
        }
        for (const auto& [target, link] : {std::pair<QString, QString>(ref, "sub/link-up"), {"..", "sub/link-parent"},
                                           {ref + "/link-x", "link-y"}, {ref + "/link-y", "link-x"},
                                           {ref + "/link-self.txt", "link-self.txt"}, {root + "/outside", "link-out"},
                                           {root + "/outside/secret.txt", "link-secret.txt"}, {ref + "/a.txt", "link-a.txt"}})
            QVERIFY(QFile::link(target, ref + '/' + link));
        QCOMPARE(::mkfifo(QFile::encodeName(ref + "/pipe.txt").constData(), 0600), 0);
        sockaddr_un address = {AF_UNIX, {}};
        qstrncpy(address.sun_path, QFile::encodeName(ref + "/socket.txt").constData(), sizeof address.sun_path);
        const int listener = ::socket(AF_UNIX, SOCK_STREAM, 0);  // its file stays after close()
        QVERIFY(::bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0 && !::close(listener));
        QVERIFY(FifTest::write(ref, "sparse.txt", "needle\n") && QFile(ref + "/sparse.txt").resize(qint64(2) << 30));
        // Long searches: many hits, and a pattern that needs minutes for one line.
        for (int i = 0; i < 6; ++i)
            QVERIFY(FifTest::write(big, QStringLiteral("d%1/f.txt").arg(i), QByteArray("x\n").repeated(300)));
        QVERIFY(FifTest::write(slow, "line.txt", QByteArray(200000, 'a') + "cb\n"));
        for (const char* path : {"src/a.txt", "include/b.txt", "current directory/c.txt", "home/d.txt"})
            QVERIFY(FifTest::write(root, path, "needle\n"));  // for the folder names of a request
        qputenv("HOME", QFile::encodeName(root + "/home"));
        before = snapshot(ref);
    }

    void cleanupTestCase() { QCOMPARE(snapshot(ref), before); }  // nothing searched was written

    void reference_data()
    {
        using FifTest::request;
        QTest::addColumn<FifInput>("in");
        QTest::addColumn<int>("threads");
        QTest::newRow("literal, 1 thread") << request("needle", ref) << 1;
        QTest::newRow("literal, 3 threads") << request("needle", ref) << 3;
        QTest::newRow("literal, case, word") << request("Needle", ref, QRegExp::FixedString, true, true) << 2;
        QTest::newRow("wildcard, word") << request("ne?d*e", ref, QRegExp::Wildcard, false, true) << 3;
        QTest::newRow("regexp, case") << request("^\\s*n[a-z]+dle|%1", ref, QRegExp::RegExp2, true) << 2;
        QTest::newRow("every line, two folders") << request("*", ref + "/sub;" + ref + "/enc", QRegExp::Wildcard) << 3;
        FifInput in = request("needle", ref);
        in.filter = "*.TXT;*.c;-*";
        in.includeSubFolders = false;
        QTest::newRow("patterns, no subfolders") << in << 1;
        in.filter.clear();
        QTest::newRow("no patterns, no subfolders") << in << 3;
        in.includeSubFolders = true;
        in.filter = "!SUB;*.txt;!.h*;!-*;*.C;!N";
        QTest::newRow("exclusions") << in << 3;
        in.filter = "!n;!*.TXT;!sub;!.hid";
        QTest::newRow("exclusions only") << in << 2;
        in.where = ref + "/sub", in.filter = "!sub;!deeper";
        QTest::newRow("excluded folder named") << in << 2;
    }

    // What the GUI thread learns, in its order, is what a plain reading of
    // the tree gives, whatever the number of threads.
    void reference()
    {
        QFETCH(FifInput, in);
        FifManager manager;
        FifJob* job = manager.getJob(0);
        QFETCH(int, threads);
        job->setThreadCount(threads);
        QCOMPARE(job->getThreadCount(), threads);
        FifHitsModel* model = job->getHitsModel();
        FifTest::watch(model);
        QStringList events;
        QSet<QString> hitFiles;
        record(job, &events, &hitFiles);
        QVERIFY(FifTest::run(job, in));
        const QStringList want = expected(in);
        QCOMPARE(events, want);
        const int files = want.filter(QRegularExpression("^searching /")).size();
        QVERIFY(job->getReadFileCount() == files && job->getFileHitCount() == hitFiles.size()
                && job->getLineHitCount() == want.size() - files);
        QCOMPARE(model->headerData(0, Qt::Horizontal).toString(),
                 want.size() > files ? in.toString() : QStringLiteral("No Search Results"));
        // The tree does its part: no link read, no name that is not UTF-8; the
        // deep file and the text test's 20 lines through the worker; folders
        // left out by name not entered, unless named by the request.
        QVERIFY(events.filter(QRegularExpression("link|secret|\\x{FFFD}")).isEmpty());
        if (in.what == "needle" && in.filter == "*")
            QVERIFY(events.filter("deep.txt (2)").size() == 1 && events.contains("searching " + ref + "/enc/u16-21.txt")
                    && !events.contains("searching " + ref + "/enc/u16-20.txt") && want.size() - files > 300);
        if (in.filter.contains('!'))
            QVERIFY(files > 3 && events.filter(QRegularExpression(in.where == ref ? "/sub/|/n/|/\\.hid" : "/deeper/")).isEmpty());
    }

    // Tiny bounds keep the scanning threads waiting at every turn, for room
    // and for the head; what they report stays in walk order.
    void poolOrder()
    {
        struct Recorder : FifScanPool::Receiver {
            QStringList events;
            int hitFiles = 0;
            void fileStarted(const QString& path) override { events << "searching " + path; }
            void hitFound(const FifHit& h) override { events << hitLine(h.file, h.line, h.text, h.offset, h.rawOffset); }
            void fileEnded(bool hasHit) override { hitFiles += hasHit; }
        } recorder;
        const FifInput in = FifTest::request("needle", ref);
        QStringList files;
        walk(ref, in, &files);
        {
            FifScanPool pool(nullptr, in.getRegExp(), 4, recorder, FifScanPool::Limits{1, 2, 64});
            for (const QString& file : qAsConst(files))
                QVERIFY(pool.add(file));
            pool.finish();
        }
        const QStringList want = expected(in);
        QCOMPARE(recorder.events, want);
        QSet<QString> hitFiles;
        for (const QString& line : want.filter(QRegularExpression("^/")))
            hitFiles << line.section(" (", 0, 0);
        QCOMPARE(recorder.hitFiles, hitFiles.size());
    }

    // Stopped anywhere, a search on several threads has delivered a prefix
    // of what the whole search does, with the counters of that prefix. The
    // search ends in a file where it would take minutes, so the stop cuts.
    void stopPrefix_data()
    {
        QTest::addColumn<int>("rows");
        for (int rows : {0, 1, 9, 10, 150, INT_MAX})
            QTest::addRow("after %d rows", rows) << rows;
    }

    void stopPrefix()
    {
        QFETCH(int, rows);
        const QString pattern = "needle|(a|aa)*b", stuck = "searching " + slow + "/line.txt";
        FifManager manager;
        FifJob* job = manager.getJob(0);
        job->setThreadCount(3);
        FifTest::watch(job->getHitsModel());
        QStringList events;
        QSet<QString> hitFiles;
        record(job, &events, &hitFiles);
        const auto stopper = [&] { if (job->getLineHitCount() >= rows || events.last() == stuck) job->stop(); };
        connect(job, &FifJob::searching, this, stopper);
        connect(job->getHitsModel(), &QAbstractItemModel::rowsInserted, this, stopper);
        QVERIFY(FifTest::run(job, FifTest::request(pattern, ref + ';' + slow, QRegExp::RegExp2)));
        const QStringList all = expected(FifTest::request(pattern, ref, QRegExp::RegExp2)) << stuck;
        QVERIFY2(events == all.mid(0, events.size()), qPrintable(events.join('\n')));
        const int files = events.filter(QRegularExpression("^searching /")).size();
        QVERIFY(job->getReadFileCount() == files && job->getFileHitCount() == hitFiles.size()
                && job->getLineHitCount() == events.size() - files && job->getLineHitCount() >= qMin(rows, 300));
    }

    // A job's life: stopped before its start and during a file (while the
    // view is cleared), refused a second start, restarted, destroyed.
    void jobLifetime()
    {
        auto manager = std::make_unique<FifManager>();
        const FifInput all = FifTest::request("x", big), stuck = FifTest::request("(a|aa)*b", slow, QRegExp::RegExp2);
        FifJob* job = manager->getJob(0);
        job->setThreadCount(3);
        manager->getJob(1)->setThreadCount(2);
        FifHitsModel* model = job->getHitsModel();
        FifTest::watch(model);
        job->stop();  // asked for before the start: the run ends at its first poll, the stop is cleared
        QVERIFY(FifTest::run(job, all) && !job->shouldStop() && job->getReadFileCount() + job->getLineHitCount() == 0);
        // In this thread each hit reaches the model at once. After 8 rows, the view
        // is cleared while a batch waits, and a stop comes with the first file.
        for (int i = 0; i < 8; ++i)
            job->appendHit(FifHit("earlier", i, "earlier", 0, 0, job));
        int inserted = 0;
        bool cleared = false;
        connect(model, &QAbstractItemModel::rowsInserted, this,
                [&](const QModelIndex&, int first, int last) { inserted = last - first + 1; });
        connect(model, &QAbstractItemModel::dataChanged, this, [&](const QModelIndex& index) {
            if (!cleared && inserted > 1 && index.row() == model->rowCount() - 1)
                cleared = model->removeRows(0, model->rowCount());
        });
        auto stopper = connect(job, &FifJob::searching, job, &FifJob::stop);
        FifWorker(job).searchFolders();
        disconnect(stopper);
        // The waiting batch went before the next single; the stop ended the
        // scan within 100 lines, entered nothing more, and went with the worker.
        const QList<FifHit> hits = FifTest::hits(model);
        for (int i = 0; i < hits.size(); ++i)
            QCOMPARE(hits[i].line, hits[0].line + i);
        QVERIFY(cleared && hits.size() > 2 && hits[0].line > 10 && hits.last().line <= 100);
        QVERIFY(!job->shouldStop() && job->getReadFileCount() == 1);
        // A start while the thread runs is refused and changes nothing.
        QSignalSpy starts(job, &FifJob::aboutToStart);
        FifTest::EndWatcher end(job);
        QVERIFY(job->start(stuck) && !job->start(all));
        QVERIFY(starts.count() == 1 && job->getInput().what == stuck.what);
        job->stop();
        QVERIFY(end.wait() && !job->shouldStop());
        // Started again, the job searches to the end, its counters from zero.
        QVERIFY(FifTest::run(job, all) && job->getReadFileCount() == 6 && job->getFileHitCount() == 6);
        QCOMPARE(job->getLineHitCount(), 6 * 300);
        // A manager destroyed stops its running jobs and waits for their
        // threads (a QThread destroyed while it runs would abort the test,
        // and the stuck one never ends unless stopped).
        const FifHit kept = FifTest::hits(job->getHitsModel()).value(0);
        const QList<QPointer<FifJob>> jobs{job, manager->getJob(1)};
        QVERIFY(jobs[0]->start(FifTest::request("*", big, QRegExp::Wildcard)) && jobs[1]->start(stuck));
        QThread::msleep(20);  // hits queue up for this thread
        QVERIFY(kept.isValid() && jobs[1]->isRunning());
        manager.reset();
        QVERIFY(!jobs[0] && !jobs[1]);
        QVERIFY(!kept.isValid() && kept.toString().isEmpty() && kept.getCanonicalFilePath().isEmpty());
        QTest::qWait(20);  // what was queued for the jobs went with them
    }

    void registry()
    {
        MainWindow first, second;
        FifManager* manager = FifManager::getInstance(&first);
        FifManager* other = FifManager::getInstance(&second);
        delete new FifManager(&first);  // one made directly is not in the map and leaves it alone
        QVERIFY(FifManager::getInstance(&first) == manager && FifManager::getInstance(&second) == other
                && other != manager && manager->getMainWindow() == &first);
        // Slots grow one at a time; a job gone from its slot is replaced.
        FifJob* zero = manager->getJob(3);
        QVERIFY(!manager->getJob(-1) && manager->getJob(0) == zero && manager->getJobCount() == 1);
        zero->setThreadCount(-1);  // 0 or less: one per core, also when the settings name no number
        QCOMPARE(zero->getThreadCount(), qMax(1, QThread::idealThreadCount()));
        Settings store;
        store.setValue("Find-In-Files/ThreadCount", "three");
        QCOMPARE(FifSettings().getThreadCount(&store) + FifSettings().getThreadCount(nullptr), 0);
        store.setValue(FifSettings().getThreadCountKeyPath(), 3);
        QCOMPARE(FifSettings().getThreadCount(&store), 3);
        FifJob* one = manager->getJob(1);
        auto* mine = new FifJob(manager);
        QVERIFY(!manager->replaceJob(0, mine) && manager->replaceJob(1, mine) == one && manager->getJob(1) == mine);
        FifJob* appended = manager->replaceJob(7, mine);
        QVERIFY(appended && manager->getJobCount() == 3 && manager->getJob(2) == appended);
        delete mine;
        QVERIFY(manager->getJob(1) && manager->getJob(1)->getManager() == manager && manager->getJobCount() == 3);
        // The hit list goes by its name through queued calls; invalid hits are dropped.
        FifTest::watch(zero->getHitsModel());
        const FifHitList list{FifHit("a", 1, "one", 0, 0, zero), FifHit(), FifHit("b", 2, "two", 0, 0, zero)};
        QVERIFY(QMetaObject::invokeMethod(zero, "appendHits", Qt::QueuedConnection,
                                          QGenericArgument("Gui::Orba::FifHitList", &list)));
        const FifHit single("c", 0, "three", 0, 0, zero);
        zero->appendHit(FifHit("d", -1, "none", 0, 0, zero));
        QTRY_COMPARE(zero->getLineHitCount(), 2);
        zero->appendHit(single);
        QCOMPARE(FifTest::hits(zero->getHitsModel()).value(2).getMainWindow(), &first);
        // Rows that views insert hold placeholders to be written, at most up to the end.
        FifHitsModel* model = zero->getHitsModel();
        QVERIFY(model->insertRows(3, 1) && !model->insertRows(5, 1) && model->index(3).data().toString().isEmpty());
        QVERIFY(model->setData(model->index(3), QVariant::fromValue(single), Qt::EditRole)
                && !model->setData(model->index(2), QVariant::fromValue(single), Qt::DisplayRole));
        QVERIFY(model->index(3).data(Qt::StatusTipRole).toString() == "three" && !model->index(4).isValid());
        // A window takes its manager along; one at the same address gets a new one.
        alignas(MainWindow) char storage[sizeof(MainWindow)];
        auto* window = new (storage) MainWindow;
        QPointer<FifJob> gone = FifManager::getInstance(window)->getJob(0);
        window->~MainWindow();
        QVERIFY(!gone && FifManager::getInstance(window = new (storage) MainWindow)->getJobCount() == 0);
        window->~MainWindow();
    }

    void folders_data()
    {
        QTest::addColumn<QString>("where");
        QTest::addColumn<QStringList>("folders");
        QTest::newRow("parts") << "src;;include" << QStringList{"src", "include"};
        QTest::newRow("blank kept in a part") << "src; include" << QStringList{"src"};
        QTest::newRow("twice") << "src;src" << QStringList{"src", "src"};
        QTest::newRow("a file, nothing") << "src/a.txt;;" << QStringList{};
        QTest::newRow("current") << "Current Directory" << QStringList{root};
        QTest::newRow("names whole, exact") << "current directory;Current Directory " << QStringList{"current directory"};
        QTest::newRow("home, root") << "Home Directory;nowhere;Root Directory" << QStringList{root + "/home", "/"};
    }

    // Relative folders are taken from the current directory, which a hit
    // keeps for its canonical path.
    void folders()
    {
        QVERIFY(QDir::setCurrent(root));
        FifManager manager;
        QFETCH(QString, where);
        FifJob* job = manager.getJob(0);
        FifTest::watch(job->getHitsModel());
        job->stop();  // the job holds the request and reads nothing
        QVERIFY(FifTest::run(job, FifTest::request("needle", where)) && job->getReadFileCount() == 0);
        FolderRecorder recorder(job);
        recorder.searchFolders();
        QTEST(recorder.folders, "folders");
        QVERIFY(FifTest::run(job, FifTest::request("needle", "src;" + root + "/include")));
        const QList<FifHit> hits = FifTest::hits(job->getHitsModel());
        QVERIFY(QDir::setCurrent(root + "/home") && hits.size() == 2 && hits[1].file == root + "/include/b.txt");
        QVERIFY(hits[0].file == "src/a.txt" && hits[0].getCanonicalFilePath() == root + "/src/a.txt");
    }

    // Files deleted, grown and rewritten shorter while they are searched: the
    // search ends, and every hit is a true line of some version of its file.
    void changingFiles()
    {
        const QString dir = root + "/changing";
        QByteArray body;
        for (int i = 0; i < 40; ++i)
            body += "needle " + QByteArray::number(100000 + i) + "\n";  // 14 bytes a line
        for (int i = 0; i < 100; ++i)
            QVERIFY(FifTest::write(dir, QStringLiteral("f%1.txt").arg(i), body));
        std::atomic<bool> done{false};
        std::unique_ptr<QThread> mutator(QThread::create([&] {
            for (int round = 0; !done; ++round, QThread::usleep(200)) {
                for (int i = round % 4; i < 100; i += 4) {
                    QFile file(dir + QStringLiteral("/f%1.txt").arg(i));
                    const bool grow = (i + round) % 3 == 1;
                    if ((i + round) % 3 == 0)
                        file.remove();
                    else if (file.open(grow ? QIODevice::Append : QIODevice::WriteOnly))
                        file.write(grow ? QByteArray("needle 999999\n") : body.left(14 * 20));
                }
            }
        }));
        mutator->start();
        auto stopMutator = qScopeGuard([&] { done = true; mutator->wait(); });
        FifManager manager;
        FifJob* job = manager.getJob(0);
        FifTest::watch(job->getHitsModel());
        QVERIFY(FifTest::run(job, FifTest::request("needle", dir)));
        for (const FifHit& hit : FifTest::hits(job->getHitsModel()))
            QVERIFY2(QRegularExpression("^needle \\d{6}$").match(hit.text).hasMatch() && hit.rawOffset == hit.offset
                     && hit.offset == (hit.line - 1) * 14, qPrintable(hit.text));
        QVERIFY(job->getFileHitCount() <= job->getReadFileCount() && job->getReadFileCount() <= 100);
    }
};

FIF_HOST_TEST_MAIN(tst_FifSearch)
#include "tst_fifsearch.moc"
