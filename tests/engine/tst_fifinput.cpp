#include "FifInput.h"

#include <QDir>
#include <QtTest>

using namespace Gui::Orba;

class tst_FifInput : public QObject
{
    Q_OBJECT

private slots:
    void defaults();
    void filterArgument_data();
    void filterArgument();
    void matching_data();
    void matching();
    void validity_data();
    void validity();
    void description_data();
    void description();
};

void tst_FifInput::defaults()
{
    const FifInput input;
    QVERIFY(input.what.isEmpty());
    QCOMPARE(input.where, QDir::toNativeSeparators(QDir::currentPath()));
    QCOMPARE(input.filter, QStringLiteral("*"));
    QCOMPARE(input.matchCase, int(Qt::CaseInsensitive));
    QCOMPARE(input.matchType, int(QRegExp::FixedString));
    QVERIFY(input.includeSubFolders);
    QVERIFY(!input.matchWord);
    QVERIFY(!input.isValid());
    QVERIFY(input.toString().isEmpty());
}

void tst_FifInput::filterArgument_data()
{
    QTest::addColumn<QString>("argument");
    QTest::addColumn<QString>("filter");
    QTest::newRow("null") << QString() << "*";
    QTest::newRow("empty") << QString("") << "*";
    QTest::newRow("given") << "*.cpp;*.h" << "*.cpp;*.h";
    QTest::newRow("blank kept") << " " << " ";
}

void tst_FifInput::filterArgument()
{
    QFETCH(QString, argument);
    QFETCH(QString, filter);
    QCOMPARE(FifInput(argument).filter, filter);
}

void tst_FifInput::matching_data()
{
    QTest::addColumn<QString>("what");
    QTest::addColumn<int>("matchType");
    QTest::addColumn<bool>("matchWord");
    QTest::addColumn<int>("matchCase");
    QTest::addColumn<QString>("line");
    QTest::addColumn<int>("position");

    const int fixed = QRegExp::FixedString;
    const int wild = QRegExp::Wildcard;
    const int rx2 = QRegExp::RegExp2;
    const int ci = Qt::CaseInsensitive;
    const int cs = Qt::CaseSensitive;
    QTest::newRow("wildcard unanchored") << "a?c*" << wild << false << ci << "xxabcdef" << 2;
    QTest::newRow("wildcard brackets literal") << "[ab]" << wild << false << ci << "a [ab]" << 2;
    QTest::newRow("wildcard brackets no class") << "[ab]" << wild << false << ci << "ab" << -1;
    QTest::newRow("literal dot literal") << "a.b" << fixed << false << ci << "axb a.b" << 4;
    QTest::newRow("literal case-insensitive") << "Foo" << fixed << false << ci << "xfoo" << 1;
    QTest::newRow("literal case-sensitive") << "Foo" << fixed << false << cs << "xfoo" << -1;
    QTest::newRow("word needs boundary") << "foo" << fixed << true << ci << "foobar foo" << 7;
    QTest::newRow("word case-sensitive") << "foo" << fixed << true << cs << "FOO foo" << 4;
    QTest::newRow("wildcard word case") << "f?o" << wild << true << cs << "FOO fxo" << 4;
    QTest::newRow("regexp alternation") << "foo|bar" << rx2 << true << ci << "xbar bar" << 5;
    QTest::newRow("regexp greedy class") << "[0-9]+" << rx2 << false << ci << "ab12" << 2;
    QTest::newRow("blanks literal") << "  " << fixed << false << ci << "a  b" << 1;
    QTest::newRow("empty-match wildcard") << "*" << wild << false << ci << "" << 0;
    // Word matching applies to the three syntaxes of the dialog only.
    QTest::newRow("other syntax, no word") << "a+" << int(QRegExp::RegExp) << true << ci << "baa" << 1;
}

void tst_FifInput::matching()
{
    QFETCH(QString, what);
    QFETCH(int, matchType);
    QFETCH(bool, matchWord);
    QFETCH(int, matchCase);
    QFETCH(QString, line);
    QFETCH(int, position);

    FifInput input;
    input.what = what;
    input.matchType = matchType;
    input.matchWord = matchWord;
    input.matchCase = matchCase;
    QRegExp rx = input.getRegExp();
    QCOMPARE(rx.indexIn(line, 0, QRegExp::CaretAtZero), position);
}

void tst_FifInput::validity_data()
{
    QTest::addColumn<QString>("what");
    QTest::addColumn<int>("matchType");
    QTest::addColumn<bool>("matchWord");
    QTest::addColumn<bool>("valid");
    const int fixed = QRegExp::FixedString;
    const int wild = QRegExp::Wildcard;
    const int rx2 = QRegExp::RegExp2;
    QTest::newRow("empty literal") << "" << fixed << false << false;
    QTest::newRow("empty regexp") << "" << rx2 << false << false;
    QTest::newRow("literal paren") << "(" << fixed << false << true;
    QTest::newRow("literal paren word") << "(" << fixed << true << true;
    QTest::newRow("wildcard paren") << "(" << wild << false << true;
    QTest::newRow("regexp paren") << "(" << rx2 << false << false;
    QTest::newRow("regexp paren word") << "(" << rx2 << true << false;
    QTest::newRow("regexp fine") << "a(b)c" << rx2 << false << true;
    QTest::newRow("blank literal") << " " << fixed << false << true;
}

void tst_FifInput::validity()
{
    QFETCH(QString, what);
    QFETCH(int, matchType);
    QFETCH(bool, matchWord);
    QFETCH(bool, valid);
    FifInput input;
    input.what = what;
    input.matchType = matchType;
    input.matchWord = matchWord;
    QCOMPARE(input.isValid(), valid);
}

void tst_FifInput::description_data()
{
    QTest::addColumn<QString>("what");
    QTest::addColumn<int>("matchType");
    QTest::addColumn<int>("matchCase");
    QTest::addColumn<bool>("matchWord");
    QTest::addColumn<bool>("subFolders");
    QTest::addColumn<QString>("where");
    QTest::addColumn<QString>("filter");
    QTest::addColumn<QString>("text");

    QTest::newRow("literal all")
        << "abc" << int(QRegExp::FixedString) << int(Qt::CaseSensitive) << true << true
        << "src" << "*.cpp"
        << "Find \"abc\", case sensitive, match word, include subfolders, in folders \"src\", "
           "in file type \"*.cpp\"";
    QTest::newRow("regexp plain")
        << "a|b" << int(QRegExp::RegExp2) << int(Qt::CaseInsensitive) << false << false
        << "/x" << "*" << "Find regular expression \"a|b\", in folders \"/x\", in file type \"*\"";
    QTest::newRow("wildcard no where no filter")
        << "a*" << int(QRegExp::Wildcard) << int(Qt::CaseInsensitive) << false << true << ""
        << "" << "Find wildcard \"a*\", include subfolders";
    QTest::newRow("other syntax reads as literal")
        << "q" << int(QRegExp::RegExp) << int(Qt::CaseInsensitive) << false << false << ""
        << "" << "Find \"q\"";
    QTest::newRow("percent signs stay")
        << "%1%2" << int(QRegExp::FixedString) << int(Qt::CaseInsensitive) << false << false
        << "%1" << "" << "Find \"%1%2\", in folders \"%1\"";
    QTest::newRow("empty what")
        << "" << int(QRegExp::FixedString) << int(Qt::CaseSensitive) << true << true << "src"
        << "*" << "";
}

void tst_FifInput::description()
{
    QFETCH(QString, what);
    QFETCH(int, matchType);
    QFETCH(int, matchCase);
    QFETCH(bool, matchWord);
    QFETCH(bool, subFolders);
    QFETCH(QString, where);
    QFETCH(QString, filter);
    QFETCH(QString, text);
    FifInput input;
    input.what = what;
    input.matchType = matchType;
    input.matchCase = matchCase;
    input.matchWord = matchWord;
    input.includeSubFolders = subFolders;
    input.where = where;
    input.filter = filter;
    QCOMPARE(input.toString(), text);
}

QTEST_GUILESS_MAIN(tst_FifInput)
#include "tst_fifinput.moc"
