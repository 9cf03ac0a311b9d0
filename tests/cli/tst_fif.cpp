#include "FifHitsModel.h"
#include "FifInput.h"
#include "FifJob.h"
#include "FifManager.h"
#include "TestTree.h"

#include <QProcess>
#include <QRegularExpression>
#include <QtTest>

using namespace Gui::Orba;

namespace {

struct Result
{
    int exitCode = -1;
    QByteArray out;
    QByteArray err;
};

} // namespace

class tst_Fif : public QObject
{
    Q_OBJECT

private:
    QString program;
    QTemporaryDir tree;
    QString root;

    Result fif(const QStringList& arguments, const QString& workingDirectory = QString())
    {
        QProcess process;
        process.setProgram(program);
        process.setArguments(arguments);
        process.setWorkingDirectory(workingDirectory.isEmpty() ? root : workingDirectory);
        process.start();
        Result result;
        if (!process.waitForFinished(60000)) {
            process.kill();
            process.waitForFinished();
            return result;
        }
        result.out = process.readAllStandardOutput();
        result.err = process.readAllStandardError();
        result.exitCode = process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -2;
        return result;
    }

    // The lines that the engine, run in this process, gives for `request`.
    QByteArray engineLines(const FifInput& request)
    {
        FifManager manager;
        FifJob* job = manager.getJob(0);
        QByteArray lines;
        // Relative folders are taken from the current directory, as fif
        // takes them from its own.
        const QString current = QDir::currentPath();
        QDir::setCurrent(root);
        [&] { FIF_RUN_JOB(job, request, 60000); }();
        QDir::setCurrent(current);
        FifHitsModel* model = job->getHitsModel();
        for (int row = 0; row < model->rowCount(); ++row)
            lines += model->index(row, 0).data().toString().toUtf8() + '\n';
        return lines;
    }

private slots:
    void initTestCase()
    {
        program = qEnvironmentVariable("FIF_EXECUTABLE");
        QVERIFY2(QFileInfo(program).isExecutable(), "FIF_EXECUTABLE names no program");
        QVERIFY(tree.isValid());
        root = tree.path();
        QVERIFY(TestTree::write(root, "src/a.cpp", "int needle;\nNEEDLE\nneedles\n"));
        QVERIFY(TestTree::write(root, "src/b.h", "// needle\n"));
        QVERIFY(TestTree::write(root, "src/sub/c.cpp", "x needle y\n"));
        QVERIFY(TestTree::write(root, "src/notes.txt", "needle\n"));
        QVERIFY(TestTree::write(root, "docs/d.txt", "caf\xC3\xA9 needle\n"));
        QVERIFY(TestTree::write(root, "-dir/e.txt", "a -x- b\n"));
        QVERIFY(TestTree::write(root, "bin/data.bin", QByteArray("needle\0", 7)));
    }

    // Hits come in model order, as the results view would list them, and
    // the counts follow on standard error.
    void printsTheModelRows()
    {
        const Result r = fif({"needle", "src", "docs"});
        QCOMPARE(r.exitCode, 0);
        FifInput request;
        request.what = "needle";
        request.where = "src;docs";
        QCOMPARE(r.out, engineLines(request));
        QCOMPARE(r.out.count('\n'), 7);
        QVERIFY(r.out.contains("src/a.cpp (1): int needle;\n"));
        QVERIFY(r.out.contains("docs/d.txt (1): caf\xC3\xA9 needle\n"));
        QCOMPARE(r.err, QByteArray("Found 7 line(s) in 5 file(s) out of 5 file(s)\n"));
    }

    void defaultFolderIsTheCurrentOne()
    {
        const Result r = fif({"--match-case", "x needle"}, root + "/src");
        QCOMPARE(r.exitCode, 0);
        QCOMPARE(r.out, QByteArray("./sub/c.cpp (1): x needle y\n"));
        QCOMPARE(r.err, QByteArray("Found 1 line(s) in 1 file(s) out of 4 file(s)\n"));
    }

    void options_data()
    {
        QTest::addColumn<QStringList>("arguments");
        QTest::addColumn<QStringList>("lines");
        QTest::newRow("match case") << QStringList{"--match-case", "NEEDLE", "src"}
                                    << QStringList{"src/a.cpp (2): NEEDLE"};
        QTest::newRow("word") << QStringList{"--word", "--filter", "*.cpp", "needle", "src"}
                              << QStringList{"src/a.cpp (1): int needle;",
                                             "src/a.cpp (2): NEEDLE",
                                             "src/sub/c.cpp (1): x needle y"};
        QTest::newRow("wildcard") << QStringList{"--wildcard", "x*y", "src"}
                                  << QStringList{"src/sub/c.cpp (1): x needle y"};
        QTest::newRow("regexp") << QStringList{"--regexp", "^need.*s$", "src"}
                                << QStringList{"src/a.cpp (3): needles"};
        QTest::newRow("literal dot and star") << QStringList{"e.*s", "src"} << QStringList{};
        QTest::newRow("no subfolders")
            << QStringList{"--no-subfolders", "--match-case", "--filter", "*.cpp", "needle",
                           "src"}
            << QStringList{"src/a.cpp (1): int needle;", "src/a.cpp (3): needles"};
        QTest::newRow("two filters") << QStringList{"--filter=*.H;*.txt", "// needle", "src"}
                                     << QStringList{"src/b.h (1): // needle"};
        QTest::newRow("blank before filter")
            << QStringList{"--filter", "*.cpp; *.h", "// needle", "src"} << QStringList{};
        QTest::newRow("dashes after --")
            << QStringList{"--", "-x-", "-dir"} << QStringList{"-dir/e.txt (1): a -x- b"};
        QTest::newRow("binary skipped") << QStringList{"needle", "bin"} << QStringList{};
    }

    void options()
    {
        QFETCH(QStringList, arguments);
        QFETCH(QStringList, lines);
        const Result r = fif(arguments);
        QStringList out = QString::fromUtf8(r.out).split('\n', Qt::SkipEmptyParts);
        out.sort();
        QCOMPARE(out, lines);
        QCOMPARE(r.exitCode, lines.isEmpty() ? 1 : 0);
        QVERIFY(r.err.startsWith("Found "));
    }

    void exitCodes_data()
    {
        QTest::addColumn<QStringList>("arguments");
        QTest::addColumn<int>("exitCode");
        QTest::addColumn<QString>("err");
        FifInput request;
        request.what = "(";
        request.matchType = QRegExp::RegExp2;
        const QString nothing = "Found 0 line(s) in 0 file(s) out of 4 file(s)\n";
        QTest::newRow("nothing found") << QStringList{"no such text", "src"} << 1 << nothing;
        QTest::newRow("empty") << QStringList{"", "src"} << 2
                               << "Empty Expression: Please enter the search expression in "
                                  "the \"Find what:\" field.\n";
        QTest::newRow("bad regexp") << QStringList{"--regexp", "(", "src"} << 2
                                    << "Bad Expression: " + request.getRegExp().errorString()
                                           + ": \"(\"\n";
        QTest::newRow("same text, literal") << QStringList{"(", "src"} << 1 << nothing;
    }

    void exitCodes()
    {
        QFETCH(QStringList, arguments);
        QFETCH(int, exitCode);
        QFETCH(QString, err);
        const Result r = fif(arguments);
        QCOMPARE(r.exitCode, exitCode);
        QVERIFY(r.out.isEmpty());
        QCOMPARE(QString::fromUtf8(r.err), err);
    }

    void badArguments_data()
    {
        QTest::addColumn<QStringList>("arguments");
        QTest::newRow("no pattern") << QStringList{};
        QTest::newRow("unknown option") << QStringList{"--frobnicate", "x"};
        QTest::newRow("dash pattern without --") << QStringList{"-x-", "src"};
        QTest::newRow("two syntaxes") << QStringList{"--wildcard", "--regexp", "x"};
        QTest::newRow("filter without value") << QStringList{"x", "--filter"};
    }

    void badArguments()
    {
        QFETCH(QStringList, arguments);
        const Result r = fif(arguments);
        QCOMPARE(r.exitCode, 2);
        QVERIFY(r.out.isEmpty());
        QVERIFY(r.err.startsWith("fif: "));
    }

    void helpAndVersion()
    {
        Result r = fif({"--help"});
        QCOMPARE(r.exitCode, 0);
        for (const char* option : {"--filter", "--match-case", "--word", "--wildcard",
                                   "--regexp", "--no-subfolders", "--version"})
            QVERIFY2(r.out.contains(option), option);
        r = fif({"--version"});
        QCOMPARE(r.exitCode, 0);
        QVERIFY(QRegularExpression("^fif \\d+\\.\\d+\\.\\d+\n$")
                    .match(QString::fromUtf8(r.out))
                    .hasMatch());
    }

    // A reader that leaves stops the search: fif ends normally, without an
    // error message, having found fewer lines than the tree holds.
    void closedPipe()
    {
        QTemporaryDir big;
        QByteArray bytes;
        for (int i = 0; i < 1000; ++i)
            bytes += "a line with a needle in it\n";
        for (int f = 0; f < 100; ++f)
            QVERIFY(TestTree::write(big.path(), QString("f%1.txt").arg(f), bytes));
        if (QStandardPaths::findExecutable("bash").isEmpty())
            QSKIP("bash is needed for a real pipeline");
        // fif's output goes to head, which leaves after the first line.
        QProcess shell;
        shell.start("bash", {"-c", "\"$0\" needle \"$1\" 2>\"$2\" | head -n 1; "
                                   "echo \"${PIPESTATUS[0]}\" >\"$3\"",
                             program, big.path(), big.path() + "/err", big.path() + "/code"});
        QVERIFY(shell.waitForFinished(60000));
        const QByteArray out = shell.readAllStandardOutput();
        QVERIFY(out.startsWith(big.path().toUtf8() + "/f"));
        QVERIFY(out.endsWith("needle in it\n"));
        QCOMPARE(out.count('\n'), 1);
        QFile code(big.path() + "/code");
        QVERIFY(code.open(QIODevice::ReadOnly));
        QCOMPARE(code.readAll(), QByteArray("0\n"));
        QFile errors(big.path() + "/err");
        QVERIFY(errors.open(QIODevice::ReadOnly));
        const QString err = QString::fromUtf8(errors.readAll());
        const QRegularExpressionMatch match =
            QRegularExpression("^Found (\\d+) line\\(s\\) in \\d+ file\\(s\\) out of \\d+ "
                               "file\\(s\\)\n$")
                .match(err);
        QVERIFY2(match.hasMatch(), qPrintable(err));
        QVERIFY(match.captured(1).toInt() < 100 * 1000);
    }

    // Started with standard output closed, fif writes into no descriptor
    // that happens to take its number, and says so.
    void closedOutputAtStart()
    {
        if (QStandardPaths::findExecutable("bash").isEmpty())
            QSKIP("bash is needed to close a descriptor");
        QProcess shell;
        shell.start("bash", {"-c", "\"$0\" needle \"$1\" >&-", program, root + "/src"});
        QVERIFY(shell.waitForFinished(60000));
        QCOMPARE(shell.exitCode(), 2);
        QCOMPARE(shell.readAllStandardError(), QByteArray("fif: standard output is closed\n"));
    }
};

QTEST_GUILESS_MAIN(tst_Fif)
#include "tst_fif.moc"
