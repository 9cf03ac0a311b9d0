// fif run as a program: its hits against grep's on real trees, its options,
// exit codes and messages, and what it does when its output is closed.

#include "FifReference.h"
#include "FifTest.h"
#include <QProcess>
#include <QRegularExpression>

struct Run { int code = -1; QString out, err; };

static Run run(const QStringList& command, const QString& folder = {})
{
    QProcess process;
    process.setWorkingDirectory(folder);
    if (command.first() == "grep") // bytes, not characters: -i folds ASCII letters only
        process.setEnvironment(QProcess::systemEnvironment() << "LC_ALL=C");
    process.start(command.first(), command.mid(1));
    if (!process.waitForFinished(120000))
        return process.kill(), process.waitForFinished(), Run();
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -2,
            process.readAllStandardOutput(), process.readAllStandardError()};
}

class tst_Fif : public QObject
{
    Q_OBJECT
    const QString fif = qEnvironmentVariable("FIF_EXECUTABLE");
    QTemporaryDir tree;

private slots:
    void initTestCase() {
        QVERIFY2(QFileInfo(fif).isExecutable(), "FIF_EXECUTABLE names no program");
        for (const auto& [path, bytes] : QList<std::pair<QString, QByteArray>>{
                 {"src/a.cpp", "int needle;\nNEEDLE\nneedles\n"}, {"src/b.h", "// needle\n"},
                 {"src/sub/c.cpp", "x needle y\n"}, {"src/notes.txt", "needle\n"},
                 {"-dir/e.txt", "a -x- b\n"}, {"bin/data.bin", QByteArray("needle\0", 7)},
                 {"control.h", "\x01 not text\nQString s;\n"}, {"text.h", "QString t;\r\n"}})
            QVERIFY(FifTest::write(tree.path(), path, bytes));
        QVERIFY(QFile::link(tree.filePath("text.h"), tree.filePath("link.h")));
    }

    // The same lines as grep's on system headers and our tree, but for files
    // that fail fif's text test, which grep -a reads; links are passed over.
    void sameHitsAsGrep_data() {
        QTest::addColumn<QString>("fifOptions");
        QTest::addColumn<QString>("grepOptions");
        QTest::addColumn<QString>("pattern");
        QTest::newRow("literal") << "--match-case" << "-F" << "QString";
        QTest::newRow("case ignored") << "" << "-Fi" << "operator()(";
        QTest::newRow("word") << "--match-case --word" << "-Fw" << "int";
        QTest::newRow("regexp") << "--match-case --regexp" << "-E" << "^#include <Q|Q_[A-Z]+_EXPORT|\\)$";
        QTest::newRow("regexp, case ignored") << "--regexp" << "-Ei" << "copyright.*[0-9]{4}";
        QTest::newRow("wildcard") << "--match-case --wildcard" << "-E" << "Q_DECL_*EXPORT";
    }
    void sameHitsAsGrep() {
        QFETCH(QString, fifOptions);
        QFETCH(QString, grepOptions);
        QFETCH(QString, pattern);
        QStringList folders{tree.path()};
        for (const char* folder : {"/usr/include/x86_64-linux-gnu/qt6/QtCore",
                                   "/usr/include/x86_64-linux-gnu/bits", "/usr/include/ncursesw"})
            if (QFileInfo(folder).isDir())
                folders << folder;
        const Run fifRun = run(QStringList{fif} + fifOptions.split(' ', Qt::SkipEmptyParts)
                               + QStringList{"--", pattern} + folders);
        const Run grepRun = run(QStringList{"grep", "-rnaZ", grepOptions, "-e",
                                            QString(pattern).replace("*", ".*")} + folders);
        QVERIFY(fifRun.code == 0 && grepRun.code == 0);
        QStringList fifLines = fifRun.out.split('\n', Qt::SkipEmptyParts), grepLines, notText;
        QString file;
        for (const QString& line : grepRun.out.split('\n', Qt::SkipEmptyParts)) {
            const qsizetype zero = line.indexOf(QChar(0)), colon = line.indexOf(':', zero + 1);
            if (line.left(zero) != file) { // grep lists the lines of a file together
                QFile opened(file = line.left(zero));
                if (!opened.open(QIODevice::ReadOnly) || !FifReference::isText(opened.readAll()))
                    notText << file;
            }
            if (!notText.contains(file)) // as fif prints it, without grep's "\r" of a "\r\n"
                grepLines << QString("%1 (%2): %3").arg(file, line.mid(zero + 1, colon - zero - 1),
                                                        line.mid(colon + 1).remove(QRegularExpression("\r$")));
        }
        QVERIFY(pattern != "QString" || notText.contains(tree.filePath("control.h")));
        QVERIFY(!fifLines.isEmpty());
        fifLines.sort();
        grepLines.sort();
        QCOMPARE(fifLines, grepLines);
    }

    // Hits as "file (line): text" by the folders as named and the counts on
    // standard error; else an exit code and a message.
    void runs_data() {
        QTest::addColumn<QStringList>("arguments");
        QTest::addColumn<QStringList>("lines");
        QTest::addColumn<int>("code");
        QTest::addColumn<QString>("err"); // empty: the counts of `lines`
        const auto row = [](const char* name, const QStringList& arguments,
                            const QStringList& lines, int code = 1, const QString& err = {}) {
            QTest::newRow(name) << arguments << lines << (lines.isEmpty() ? code : 0) << err;
        };
        const QString c = "x needle y", more = "\nTry 'fif --help' for more information.\n";
        row("match case", {"--match-case", "NEEDLE", "src"}, {"src/a.cpp (2): NEEDLE"});
        row("word", {"--word", "--filter", "*.cpp", "needle", "src"},
            {"src/a.cpp (1): int needle;", "src/a.cpp (2): NEEDLE", "src/sub/c.cpp (1): " + c});
        row("literal", {"e.*s", "src"}, {});
        row("no subfolders", {"--no-subfolders", "--match-case", "--filter", "*.cpp", "needle", "src"},
            {"src/a.cpp (1): int needle;", "src/a.cpp (3): needles"});
        row("filters", {"--filter=*.H;*.txt", "needle", "src"},
            {"src/b.h (1): // needle", "src/notes.txt (1): needle"});
        row("blank before a filter", {"--filter", "*.cpp; *.h", "// needle", "src"}, {});
        row("dashes after --", {"--", "-x-", "-dir"}, {"-dir/e.txt (1): a -x- b"});
        row("folders, not text", {"--match-case", "needle", "bin", "src/sub"}, {"src/sub/c.cpp (1): " + c});
        row("current folder", {"--match-case", c}, {"./src/sub/c.cpp (1): " + c});
        row("none", {"nothing", "src"}, {}, 1, "Found 0 line(s) in 0 file(s) out of 4 file(s)\n");
        row("empty", {"", "src"}, {}, 2, "Empty Expression: Please enter the search expression "
                                         "in the \"Find what:\" field.\n");
        row("bad regexp", {"--regexp", "a(", "src"}, {}, 2,
            "Bad Expression: " + QRegExp("a(").errorString() + ": \"a(\"\n");
        row("no pattern", {}, {}, 2, "fif: Missing PATTERN." + more);
        row("two syntaxes", {"--wildcard", "--regexp", "x"}, {}, 2,
            "fif: --wildcard and --regexp exclude each other." + more);
        row("unknown option", {"--frob", "x"}, {}, 2, "fif: Unknown option 'frob'." + more);
    }
    void runs() {
        QFETCH(QStringList, arguments);
        QFETCH(QStringList, lines);
        QFETCH(int, code);
        QFETCH(QString, err);
        const Run r = run(QStringList{fif} + arguments, tree.path());
        QStringList out = r.out.split('\n', Qt::SkipEmptyParts), files;
        out.sort();
        QCOMPARE(out, lines);
        QCOMPARE(r.code, code);
        for (const QString& line : lines)
            files << line.left(line.indexOf(" ("));
        files.removeDuplicates();
        const QString counts = QString("Found %1 line(s) in %2 file(s) out of ")
                                   .arg(lines.size()).arg(files.size());
        if (err.isEmpty())
            QVERIFY2(r.err.startsWith(counts) && r.err.endsWith(" file(s)\n"), qPrintable(r.err));
        else
            QCOMPARE(r.err, err);
    }

    void helpAndVersion() {
        const Run help = run({fif, "--help"}), version = run({fif, "--version"});
        QVERIFY(help.code == 0 && help.out.contains("--no-subfolders") && help.out.contains("--word"));
        QVERIFY(version.code == 0
                && QRegularExpression("^fif \\d+\\.\\d+\\.\\d+\n$").match(version.out).hasMatch());
    }

    // A reader that leaves stops the search: fif ends normally, having found
    // fewer lines than there are. Started without standard output, it writes
    // into no descriptor that took its place.
    void closedOutput() {
        QTemporaryDir big;
        for (int f = 0; f < 100; ++f)
            QVERIFY(FifTest::write(big.path(), QString("f%1.txt").arg(f),
                                   QByteArray("a line with a needle in it\n").repeated(1000)));
        const Run piped = run({"bash", "-c", "\"$0\" needle \"$1\" 2>\"$1/err\" | head -n 1;"
                                             "echo ${PIPESTATUS[0]}; cat \"$1/err\"", fif, big.path()});
        const QStringList lines = piped.out.split('\n');
        QVERIFY2(lines.size() == 4 && lines[0].endsWith("): a line with a needle in it")
                     && lines[1] == "0", qPrintable(piped.out));
        const auto found = QRegularExpression("^Found (\\d+) line\\(s\\) in ").match(lines[2]);
        QVERIFY2(found.hasMatch() && found.captured(1).toInt() < 100 * 1000, qPrintable(lines[2]));
        const Run closed = run({"bash", "-c", "\"$0\" needle \"$1\" >&-", fif, big.path()});
        QVERIFY(closed.code == 2 && closed.err == "fif: standard output is closed\n");
    }
};

QTEST_GUILESS_MAIN(tst_Fif)
#include "tst_fif.moc"
