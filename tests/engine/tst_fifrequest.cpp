// The rules of a search request: what its expression matches, when it is
// valid, how it describes itself, and what it takes from the stored last search.

#include "FifTest.h"

#include <QtTest>

using namespace Gui::Orba;

class tst_FifRequest : public QObject
{
    Q_OBJECT

    QTemporaryDir dir;

private slots:
    // Each row's name says how it matches: "literal", "wildcard", "regexp"
    // or "other syntax", then "case" and "word" when they are on.
    void matching_data()
    {
        QTest::addColumn<QString>("what");
        QTest::addColumn<QString>("line");
        QTest::addColumn<int>("position");  // -2: the request is not valid
        QTest::newRow("literal") << "Foo" << "xfoo" << 1;
        QTest::newRow("literal, case") << "Foo" << "xfoo Foo" << 5;
        QTest::newRow("literal, word") << "foo" << "foobar FOO" << 7;
        QTest::newRow("literal, case, word") << "foo" << "FOO foo" << 4;
        QTest::newRow("literal, word, parenthesis") << "(" << "a ( b" << -1;
        QTest::newRow("literal, nothing") << "" << "a" << -2;
        QTest::newRow("wildcard, unanchored") << "a?c*" << "xxABcdef" << 2;
        QTest::newRow("wildcard, case") << "a?c" << "ABC abc" << 4;
        QTest::newRow("wildcard, brackets are text") << "[a(]" << "a [a(]" << 2;
        QTest::newRow("wildcard, word") << "f?o" << "xfoo Fxo" << 5;
        QTest::newRow("wildcard, case, word") << "f*o" << "FOO fo" << 4;
        QTest::newRow("regexp, case") << "A|b" << "aB b" << 3;
        QTest::newRow("regexp, word") << "foo|bar" << "xbar BAR" << 5;
        QTest::newRow("regexp, case, word") << "fo+" << "FOO foox foo" << 9;
        QTest::newRow("regexp, unbalanced") << "(" << "(" << -2;
        QTest::newRow("other syntax, word does not apply") << "a+" << "baa" << 1;
    }

    void matching()
    {
        const QStringList how = QString(QTest::currentDataTag()).split(", ");
        const int type = QStringList{"other syntax", "wildcard", "literal", "regexp"}.indexOf(how[0]);  // QRegExp's order
        QFETCH(QString, what);
        const FifInput in = FifTest::request(what, QString(), type, how.contains("case"), how.contains("word"));
        QFETCH(int, position);
        QCOMPARE(in.isValid(), position != -2);
        QFETCH(QString, line);
        if (position != -2)
            QCOMPARE(in.getRegExp().indexIn(line, 0, QRegExp::CaretAtZero), position);
    }

    void description_data()
    {
        QTest::addColumn<FifInput>("in");
        QTest::addColumn<QString>("text");
        FifInput in = FifTest::request("abc", "src", QRegExp::FixedString, true, true);
        in.filter = "*.cpp";
        QTest::newRow("literal, all") << in << "Find \"abc\", case sensitive, match word, include "
                                               "subfolders, in folders \"src\", in file type \"*.cpp\"";
        in = FifTest::request("a|%1", "%2", QRegExp::RegExp2);
        in.includeSubFolders = false;
        QTest::newRow("regexp, %") << in << "Find regular expression \"a|%1\", in folders \"%2\", in file type \"*\"";
        in = FifTest::request("a*", "", QRegExp::Wildcard);
        in.filter.clear();
        QTest::newRow("wildcard, no folder or pattern") << in << "Find wildcard \"a*\", include subfolders";
        in.matchType = QRegExp::RegExp;
        QTest::newRow("other syntax reads as literal") << in << "Find \"a*\", include subfolders";
        in.what.clear();
        QTest::newRow("nothing to find") << in << "";
    }

    void description()
    {
        QFETCH(FifInput, in);
        QTEST(in.toString(), "text");
    }

    void setContents_data()
    {
        QTest::addColumn<QVariantMap>("stored");
        QTest::addColumn<QString>("result");  // what|where|filter|case|type|word|subfolders
        const QString kept = "k|/w|*|0|0|0|1";
        QTest::newRow("nothing stored") << QVariantMap() << kept;
        QTest::newRow("everything")
            << QVariantMap{{"FindBar/Find what", QStringList{"foo", "bar"}}, {"FindBar/MatchCase", true},
                           {"Find-In-Files/WhereKey", QStringList{"/s", "/old"}}, {"FindBar/MatchWord", true},
                           {"Find-In-Files/CurrentFilterKey", "*.h"}, {"FindBar/MatchType", 2},
                           {"Find-In-Files/IncludeSubFolderKey", false}} << "foo|/s|*.h|1|2|1|0";
        QTest::newRow("empty entries, a string for a list")
            << QVariantMap{{"FindBar/Find what", QStringList{"", "x"}}, {"Find-In-Files/WhereKey", "/a, b"},
                           {"Find-In-Files/CurrentFilterKey", ""}} << "k|/a, b|*|0|0|0|1";
        // The store keeps a regular expression as 0, the request as RegExp2 (3).
        for (const auto& [stored, read] : {std::pair(0, 3), std::pair(1, 1), std::pair(2, 2), std::pair(7, 0)})
            QTest::addRow("MatchType %d", stored) << QVariantMap{{"FindBar/MatchType", stored}}
                                                  << QStringLiteral("k|/w|*|0|%1|0|1").arg(read);
        QTest::newRow("flags as text")
            << QVariantMap{{"FindBar/MatchCase", "true"}, {"FindBar/MatchType", "2"}, {"FindBar/MatchWord", "true"},
                           {"Find-In-Files/IncludeSubFolderKey", "false"}} << "k|/w|*|1|2|1|0";
        QTest::newRow("wrong kinds are passed over")
            << QVariantMap{{"FindBar/MatchCase", QStringList{"a", "b"}}, {"FindBar/MatchType", "regexp"},
                           {"FindBar/MatchWord", QStringList()}, {"Find-In-Files/IncludeSubFolderKey", QStringList{"x"}},
                           {"FindBar/Find what", 12}, {"Find-In-Files/CurrentFilterKey", 7}} << "k|/w|7|0|0|0|1";
    }

    // Read from an INI file that one store wrote and another opens.
    void setContents()
    {
        QFETCH(QVariantMap, stored);
        const QString fileName = dir.filePath(QString(QTest::currentDataTag()) + ".ini");
        {
            Settings writer(fileName);
            for (auto it = stored.cbegin(); it != stored.cend(); ++it)
                writer.setValue(it.key(), it.value());
        }
        Settings store(FifTest::freshCopy(fileName));
        FifInput in = FifTest::request("k", "/w", QRegExp::RegExp);
        auto result = [&in] {
            return QStringLiteral("%1|%2|%3|%4|%5|%6|%7").arg(in.what, in.where, in.filter).arg(in.matchCase)
                .arg(in.matchType).arg(in.matchWord).arg(in.includeSubFolders);
        };
        in.setContents(&store);
        QTEST(result(), "result");
        in.setContents(nullptr);  // without a store nothing changes
        QTEST(result(), "result");
    }
};

QTEST_GUILESS_MAIN(tst_FifRequest)
#include "tst_fifrequest.moc"
