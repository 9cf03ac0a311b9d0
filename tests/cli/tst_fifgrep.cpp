// Compares fif with GNU grep on a tree that nobody here wrote: the system's
// C and Qt headers. The sets of (file, line, text) must be equal; the only
// differences allowed are those the design explains, each handled below by
// name.

#include "FifWorker.h"
#include "TestTree.h"

#include <QProcess>
#include <QRegularExpression>
#include <QSet>
#include <QStringDecoder>
#include <QtTest>

using namespace Gui::Orba;

namespace {

struct Hit
{
    QString file;
    int line;
    QString text;
};

QString keyOf(const Hit& hit)
{
    return hit.file + QChar(0x1F) + QString::number(hit.line) + QChar(0x1F) + hit.text;
}

// Both sides become text alike: the bytes decoded as UTF-8 (a bad byte is
// one replacement character), without a final "\r" (grep prints the "\r" of
// a "\r\n" line end as part of the line; fif does not).
QString normalised(const QByteArray& bytes)
{
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless
                                                     | QStringDecoder::Flag::ConvertInitialBom);
    QString text = decoder.decode(bytes);
    if (text.endsWith(QLatin1Char('\r')))
        text.chop(1);
    return text;
}

QByteArray runProgram(const QString& program, const QStringList& arguments, int* exitCode)
{
    QProcess process;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    // Bytes, not characters, for grep: a line that is not UTF-8 still
    // matches, and -i folds ASCII letters only, like the patterns used here.
    environment.insert("LC_ALL", "C");
    process.setProcessEnvironment(environment);
    process.start(program, arguments);
    if (!process.waitForFinished(120000)) {
        process.kill();
        process.waitForFinished();
        *exitCode = -1;
        return QByteArray();
    }
    *exitCode = process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -2;
    return process.readAllStandardOutput();
}

} // namespace

class tst_FifGrep : public QObject
{
    Q_OBJECT

private:
    QString program;
    QStringList folders;
    QTemporaryDir extra;

private slots:
    void initTestCase()
    {
        program = qEnvironmentVariable("FIF_EXECUTABLE");
        QVERIFY2(QFileInfo(program).isExecutable(), "FIF_EXECUTABLE names no program");
        if (QStandardPaths::findExecutable("grep").isEmpty())
            QSKIP("GNU grep is not installed");
        // Qt's and the C library's headers (a part of them, to keep the
        // test quick); the curses folder holds symbolic links, which both
        // tools pass over.
        for (const char* folder :
             {"/usr/include/x86_64-linux-gnu/qt6/QtCore", "/usr/include/x86_64-linux-gnu/bits",
              "/usr/include/x86_64-linux-gnu/sys", "/usr/include/ncursesw"}) {
            if (QFileInfo(folder).isDir())
                folders.append(folder);
        }
        if (folders.isEmpty())
            QSKIP("no system headers to compare on");
        // A small tree of our own makes sure that the explained differences
        // do come up: a file with a control character in its first lines,
        // and a link to a text file.
        QVERIFY(extra.isValid());
        QVERIFY(TestTree::write(extra.path(), "control.h", "\x01 not text\nQString s;\n"));
        QVERIFY(TestTree::write(extra.path(), "text.h", "QString t;\n"));
        QVERIFY(QFile::link(extra.path() + "/text.h", extra.path() + "/link.h"));
        folders.append(extra.path());
    }

    void sameHitsAsGrep_data()
    {
        QTest::addColumn<QStringList>("fifOptions");
        QTest::addColumn<QStringList>("grepOptions");
        QTest::addColumn<QString>("pattern");
        const QStringList cs{"--match-case"};
        QTest::newRow("literal") << cs << QStringList{"-F"} << "QString";
        QTest::newRow("literal, case ignored") << QStringList{} << QStringList{"-F", "-i"}
                                               << "nullptr";
        QTest::newRow("literal specials") << cs << QStringList{"-F"} << "operator()(";
        QTest::newRow("literal blanks, case ignored")
            << QStringList{} << QStringList{"-F", "-i"} << "#  define q";
        QTest::newRow("word") << (cs + QStringList{"--word"}) << QStringList{"-F", "-w"}
                              << "int";
        QTest::newRow("regexp anchored") << (cs + QStringList{"--regexp"})
                                         << QStringList{"-E"} << "^#include <Qt";
        QTest::newRow("regexp classes") << (cs + QStringList{"--regexp"})
                                        << QStringList{"-E"} << "Q_[A-Z]+_EXPORT";
        QTest::newRow("regexp interval, case ignored")
            << QStringList{"--regexp"} << QStringList{"-E", "-i"} << "copyright \\(c\\) [0-9]{4}";
        QTest::newRow("regexp end") << (cs + QStringList{"--regexp"}) << QStringList{"-E"}
                                    << "\\)$";
        QTest::newRow("wildcard") << (cs + QStringList{"--wildcard"}) << QStringList{"-E"}
                                  << "Q_DECL_*EXPORT";
    }

    void sameHitsAsGrep()
    {
        QFETCH(QStringList, fifOptions);
        QFETCH(QStringList, grepOptions);
        QFETCH(QString, pattern);

        int fifExit = 0;
        const QByteArray fifOut =
            runProgram(program, fifOptions + QStringList{"--", pattern} + folders, &fifExit);
        QVERIFY2(fifExit == 0, qPrintable(QString::number(fifExit)));
        // -a: every file is text to grep, so that it shows all it would
        // match; which files are text is fif's own rule (below).
        QString grepPattern = pattern;
        if (fifOptions.contains("--wildcard"))
            grepPattern.replace("*", ".*");
        int grepExit = 0;
        const QByteArray grepOut = runProgram(
            "grep", QStringList{"-r", "-n", "-a", "-Z"} + grepOptions + QStringList{"-e", grepPattern}
                + folders,
            &grepExit);
        QCOMPARE(grepExit, 0);

        QHash<QString, Hit> fifHits;
        const QRegularExpression fifLine("^(.*?) \\((\\d+)\\): (.*)$",
                                         QRegularExpression::DotMatchesEverythingOption);
        for (const QByteArray& line : fifOut.split('\n')) {
            if (line.isEmpty())
                continue;
            const QRegularExpressionMatch m = fifLine.match(QString::fromUtf8(line));
            QVERIFY2(m.hasMatch(), line.constData());
            const Hit hit{m.captured(1), m.captured(2).toInt(), normalised(m.captured(3).toUtf8())};
            fifHits.insert(keyOf(hit), hit);
        }
        QHash<QString, Hit> grepHits;
        for (const QByteArray& line : grepOut.split('\n')) {
            if (line.isEmpty())
                continue;
            const qsizetype zero = line.indexOf('\0');
            const qsizetype colon = line.indexOf(':', zero + 1);
            QVERIFY(zero > 0 && colon > zero);
            const Hit hit{QString::fromUtf8(line.left(zero)), line.mid(zero + 1, colon - zero - 1).toInt(),
                          normalised(line.mid(colon + 1))};
            grepHits.insert(keyOf(hit), hit);
        }
        QVERIFY(!fifHits.isEmpty());

        // Files that fail fif's text test (a control character in the first
        // 20 lines) are not searched; grep -a reads them all.
        QSet<QString> notText;
        for (auto it = grepHits.begin(); it != grepHits.end();) {
            const QString& file = it->file;
            if (!notText.contains(file) && !FifWorker::isTextFile(QFileInfo(file)))
                notText.insert(file);
            if (notText.contains(file) && !fifHits.contains(it.key())) {
                it = grepHits.erase(it);
                continue;
            }
            ++it;
        }
        if (!notText.isEmpty())
            qInfo() << "not text to fif, so not searched:" << notText.values();
        if (pattern == "QString") {
            QVERIFY(notText.contains(extra.path() + "/control.h"));
            QVERIFY(fifHits.contains(keyOf({extra.path() + "/text.h", 1, "QString t;"})));
            QVERIFY(!fifHits.contains(keyOf({extra.path() + "/link.h", 1, "QString t;"})));
        }

        // Links are passed over by both: grep -r follows none inside the
        // tree, fif lists none.
        for (const Hit& hit : qAsConst(fifHits))
            QVERIFY2(!QFileInfo(hit.file).isSymLink(), qPrintable(hit.file));
        for (const Hit& hit : qAsConst(grepHits))
            QVERIFY2(!QFileInfo(hit.file).isSymLink(), qPrintable(hit.file));

        const QSet<QString> fifKeys(fifHits.keyBegin(), fifHits.keyEnd());
        const QSet<QString> grepKeys(grepHits.keyBegin(), grepHits.keyEnd());
        QStringList onlyFif = (fifKeys - grepKeys).values();
        QStringList onlyGrep = (grepKeys - fifKeys).values();
        onlyFif.sort();
        onlyGrep.sort();
        QCOMPARE(onlyFif.mid(0, 5), QStringList());
        QCOMPARE(onlyGrep.mid(0, 5), QStringList());
        QCOMPARE(fifHits.size(), grepHits.size());
    }
};

QTEST_GUILESS_MAIN(tst_FifGrep)
#include "tst_fifgrep.moc"
