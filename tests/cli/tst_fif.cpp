// fif as a program: its hits against grep's, its options, exit codes, messages, closed output.

#include "FifReference.h"
#include "FifTest.h"
#include <QProcess>
#include <QRegularExpression>

struct Run { int code; QString out, err; };

static Run run(const QStringList& command)
{
    QProcess process;
    if (command.first() == "grep") // bytes, not characters: -i folds ASCII letters only
        process.setEnvironment(QProcess::systemEnvironment() << "LC_ALL=C");
    process.start(command.first(), command.mid(1));
    const bool ok = process.waitForFinished(120000) && process.exitStatus() == QProcess::NormalExit;
    return {ok ? process.exitCode() : -1, process.readAllStandardOutput(),
            process.readAllStandardError()};
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
                 {"-dir/e.txt", "a -x- b\n"}, {"control.h", "\x01 not text\nQString s;\n"},
                 {"text.h", "QString t;\r\n"}})
            QVERIFY(FifTest::write(tree.path(), path, bytes));
        QVERIFY(QFile::link("text.h", tree.filePath("link.h")) && QDir::setCurrent(tree.path()));
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
        QTest::newRow("regexp") << "--regexp" << "-Ei" << "^#include <Q|Q_[A-Z]+_EXPORT|\\)$";
        QTest::newRow("wildcard") << "--match-case --wildcard" << "-E" << "Q_DECL_*EXPORT";
    }
    void sameHitsAsGrep() {
        QFETCH(QString, fifOptions); QFETCH(QString, grepOptions); QFETCH(QString, pattern);
        const QStringList folders{tree.path(), "/usr/include/x86_64-linux-gnu/qt6/QtCore",
                                  "/usr/include/x86_64-linux-gnu/bits"};
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
            const QString number = line.mid(zero + 1, colon - zero - 1), text = line.mid(colon + 1);
            if (!notText.contains(file)) // without the "\r" of a "\r\n", as fif has it
                grepLines << file + " (" + number + "): " + text.chopped(text.endsWith('\r'));
        }
        QVERIFY(pattern != "QString" || notText.contains(tree.filePath("control.h")));
        fifLines.sort();
        grepLines.sort();
        QCOMPARE(fifLines, grepLines);
    }
    // Hits as "file (line): text" by the folders as named and their count on
    // standard error, exit code 0; none found, 1; else a message and 2.
    void runs_data() {
        QTest::addColumn<QString>("arguments"); // separated by "|"
        QTest::addColumn<QString>("out");
        QTest::addColumn<QString>("err"); // empty: the count of `out`
        const auto row = [](const char* name, const char* args, const char* out,
                            const QString& err = {}) { QTest::newRow(name) << args << out << err; };
        row("no subfolders", "--no-subfolders|--match-case|--filter|*.cpp|needle|src",
            "src/a.cpp (1): int needle;\nsrc/a.cpp (3): needles\n");
        row("filters, word", "--word|--filter=*.H;*.txt|needle|src",
            "src/b.h (1): // needle\nsrc/notes.txt (1): needle\n");
        row("dashes after --", "--|-x-|-dir", "-dir/e.txt (1): a -x- b\n");
        row("current folder", "--match-case|x needle", "./src/sub/c.cpp (1): x needle y\n");
        row("none", "nothing|src", "", "Found 0 line(s) in 0 file(s) out of 4 file(s)\n");
        row("empty", "|src", "",
            "Empty Expression: Please enter the search expression in the \"Find what:\" field.\n");
        row("bad regexp", "--regexp|a(|src", "",
            "Bad Expression: " + QRegExp("a(").errorString() + ": \"a(\"\n");
        row("no pattern", "--match-case", "",
            "fif: Missing PATTERN.\nTry 'fif --help' for more information.\n");
    }
    void runs() {
        QFETCH(QString, arguments); QFETCH(QString, out); QFETCH(QString, err);
        const Run r = run(QStringList{fif} + arguments.split('|'));
        QStringList lines = r.out.split('\n', Qt::SkipEmptyParts);
        lines.sort();
        QCOMPARE(lines.join('\n'), out.trimmed());
        QVERIFY2(err.isEmpty() ? r.err.startsWith(QString("Found %1 line(s) in ").arg(lines.size()))
                               : r.err == err, qPrintable(r.err));
        QCOMPARE(r.code, !out.isEmpty() ? 0 : err.isEmpty() || err.startsWith("Found") ? 1 : 2);
    }
    // As grep: a folder that cannot be searched is reported and makes the status 2, the others are still
    // searched; the colours are grep's own (its line for the same hit, with fif's separators); bad values
    // of options are refused.
    void likeGrep()
    {
        const Run r = run({fif, "--match-case", "needle", "src/sub", "nosuch", "src/b.h"});
        QCOMPARE(r.out, "src/sub/c.cpp (1): x needle y\n");
        QVERIFY2(r.err.startsWith("fif: nosuch: No such folder\nfif: src/b.h: " + QString(strerror(ENOTDIR))
                                  + "\nFound 1 line(s) in 1 file(s)") && r.code == 2, qPrintable(r.err));
        const QRegularExpression separator("(\\e\\[[0-9;]*m(?:\\e\\[K)?):(\\e\\[m(?:\\e\\[K)?)");
        for (const char* colors : {"", "ms=04;35:ln=33:se=34:ne:fn=1", "mt=7:fn=:se=36"}) {
            qputenv("GREP_COLORS", colors);
            QString want = run({"grep", "--color=always", "-Hn", "needle", "src/b.h"}).out;
            for (const char* replacement : {" (", "): "}) {
                const QRegularExpressionMatch m = separator.match(want);
                want.replace(m.capturedStart(), m.capturedLength(), m.captured(1) + replacement + m.captured(2));
            }
            QCOMPARE(run({fif, "--colour=always", "--filter=b.h", "needle", "src"}).out, want);
        }
        QCOMPARE(run({fif, "--color", "--filter=b.h", "needle", "src"}).out, "src/b.h (1): // needle\n");
        for (const char* bad : {"--color=sometimes", "-j0", "--threads=x"})
            QCOMPARE(run({fif, bad, "needle", "src"}).code, 2);
        QCOMPARE(run({fif, "-j", "3", "--color=never", "--filter=b.h", "needle", "src"}).out, "src/b.h (1): // needle\n");
    }
    // A reader that leaves stops the search: fif ends normally, having found
    // fewer lines than there are. Started without standard output, it writes
    // into no descriptor that took its place.
    void closedOutput() {
        QTemporaryDir big;
        for (int f = 0; f < 100; ++f)
            QVERIFY(FifTest::write(big.path(), QString("f%1.txt").arg(f),
                                   QByteArray("a line with a needle in it\n").repeated(1000)));
        const QString script = "\"$0\" needle \"$1\" 2>\"$1/err\" | head -n 1; "
                               "echo ${PIPESTATUS[0]}; cat \"$1/err\"";
        const QStringList lines = run({"bash", "-c", script, fif, big.path()}).out.split('\n');
        const int found = lines.value(2).section(' ', 1, 1).toInt(); // "Found <n> line(s) ..."
        QVERIFY2(lines.size() == 4 && lines[0].endsWith("): a line with a needle in it")
                     && lines[1] == "0" && found > 0 && found < 100 * 1000,
                 qPrintable(lines.join('\n')));
        const Run closed = run({"bash", "-c", "\"$0\" needle \"$1\" >&-", fif, big.path()});
        QVERIFY(closed.code == 2 && closed.err == "fif: standard output is closed\n");
    }
};

QTEST_GUILESS_MAIN(tst_Fif)
#include "tst_fif.moc"
