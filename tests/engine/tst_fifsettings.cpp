#include "FifInput.h"
#include "FifSettings.h"
#include "IniFiles.h"
#include "Settings.h"

#include <QtTest>

#include <memory>

using namespace Gui::Orba;

typedef QMap<QString, QVariant> Stored;

class tst_FifSettings : public QObject
{
    Q_OBJECT

private:
    QTemporaryDir dir;
    int files = 0;

    // A real INI store holding `values`, read back from disk by a new store.
    std::unique_ptr<Settings> storeWith(const Stored& values)
    {
        const QString fileName = dir.filePath(QString("store%1.ini").arg(++files));
        {
            Settings writer(fileName);
            for (auto it = values.cbegin(); it != values.cend(); ++it)
                writer.setValue(it.key(), it.value());
        }
        return std::make_unique<Settings>(IniFiles::freshCopy(fileName));
    }

private slots:
    void initTestCase() { QVERIFY(dir.isValid()); }

    void keyPaths()
    {
        const FifSettings keys;
        QCOMPARE(keys.getFindWhatKeyPath(), QString("FindBar/Find what"));
        QCOMPARE(keys.getMatchCaseKeyPath(), QString("FindBar/MatchCase"));
        QCOMPARE(keys.getMatchWordKeyPath(), QString("FindBar/MatchWord"));
        QCOMPARE(keys.getMatchTypeKeyPath(), QString("FindBar/MatchType"));
        QCOMPARE(keys.getWhereKeyPath(), QString("Find-In-Files/WhereKey"));
        QCOMPARE(keys.getFilterKeyPath(), QString("Find-In-Files/CurrentFilterKey"));
        QCOMPARE(keys.getIncludeSubFolderKeyPath(), QString("Find-In-Files/IncludeSubFolderKey"));
    }

    void emptyGroupGivesNoPath()
    {
        FifSettings keys;
        keys.findBarGroup.clear();
        QVERIFY(keys.getFindWhatKeyPath().isEmpty());
        QVERIFY(keys.getMatchTypeKeyPath().isEmpty());
        QCOMPARE(keys.getWhereKeyPath(), QString("Find-In-Files/WhereKey"));
        keys.findInFilesGroup.clear();
        QVERIFY(keys.getWhereKeyPath().isEmpty());
    }

    void readers_data()
    {
        QTest::addColumn<Stored>("stored");
        QTest::addColumn<QString>("what");
        QTest::addColumn<QString>("where");
        QTest::addColumn<QString>("filter");

        QTest::newRow("nothing stored") << Stored() << "" << "" << "";
        QTest::newRow("most recent first")
            << Stored{{"FindBar/Find what", QStringList{"foo", "bar"}},
                      {"Find-In-Files/WhereKey", QStringList{"/src;/doc", "/old"}},
                      {"Find-In-Files/CurrentFilterKey", "*.cpp;*.h"}}
            << "foo" << "/src;/doc" << "*.cpp;*.h";
        QTest::newRow("empty lists")
            << Stored{{"FindBar/Find what", QStringList()},
                      {"Find-In-Files/WhereKey", QStringList()}}
            << "" << "" << "";
        QTest::newRow("single strings")
            << Stored{{"FindBar/Find what", "text, with comma"},
                      {"Find-In-Files/WhereKey", "/one"}}
            << "text, with comma" << "/one" << "";
        QTest::newRow("first entry empty")
            << Stored{{"FindBar/Find what", QStringList{"", "second"}}} << "" << "" << "";
        QTest::newRow("wrong types")
            << Stored{{"FindBar/Find what", 5},
                      {"Find-In-Files/WhereKey", true},
                      {"Find-In-Files/CurrentFilterKey", 7}}
            << "" << "" << "7";
        QTest::newRow("other groups only")
            << Stored{{"Other/Find what", QStringList{"x"}}, {"FindBar/WhereKey", "/x"}}
            << "" << "" << "";
    }

    void readers()
    {
        QFETCH(Stored, stored);
        QFETCH(QString, what);
        QFETCH(QString, where);
        QFETCH(QString, filter);
        const auto store = storeWith(stored);
        const FifSettings keys;
        QCOMPARE(keys.getWhatString(store.get()), what);
        QCOMPARE(keys.getWhereString(store.get()), where);
        QCOMPARE(keys.getFilterString(store.get()), filter);
    }

    void withoutStore()
    {
        const FifSettings keys;
        QVERIFY(keys.getWhatString(nullptr).isEmpty());
        QVERIFY(keys.getWhereString(nullptr).isEmpty());
        QVERIFY(keys.getFilterString(nullptr).isEmpty());
        FifInput request;
        request.what = "kept";
        request.matchType = QRegExp::Wildcard;
        request.setContents(nullptr);
        QCOMPARE(request.what, QString("kept"));
        QCOMPARE(request.matchType, int(QRegExp::Wildcard));
    }

    void setContents_data()
    {
        QTest::addColumn<Stored>("stored");
        QTest::addColumn<bool>("caseSensitiveBefore");
        QTest::addColumn<int>("typeBefore");
        QTest::addColumn<QString>("what");
        QTest::addColumn<bool>("whereIsDefault"); // else "/stored"
        QTest::addColumn<QString>("filter");
        QTest::addColumn<int>("matchCase");
        QTest::addColumn<int>("matchType");
        QTest::addColumn<bool>("matchWord");
        QTest::addColumn<bool>("includeSubFolders");

        const int fixed = QRegExp::FixedString;
        const int wildcard = QRegExp::Wildcard;
        const int regexp2 = QRegExp::RegExp2;
        const int insensitive = Qt::CaseInsensitive;
        const int sensitive = Qt::CaseSensitive;

        QTest::newRow("empty store keeps the request")
            << Stored() << false << fixed << "" << true << "*" << insensitive << fixed << false << true;
        QTest::newRow("everything")
            << Stored{{"FindBar/Find what", QStringList{"foo", "bar"}},
                      {"Find-In-Files/WhereKey", QStringList{"/stored", "/older"}},
                      {"Find-In-Files/CurrentFilterKey", "*.txt"},
                      {"FindBar/MatchCase", true}, {"FindBar/MatchWord", true},
                      {"FindBar/MatchType", 1}, {"Find-In-Files/IncludeSubFolderKey", false}}
            << false << fixed << "foo" << false << "*.txt" << sensitive << wildcard << true << false;
        QTest::newRow("empty folder list keeps the default")
            << Stored{{"Find-In-Files/WhereKey", QStringList()}}
            << false << fixed << "" << true << "*" << insensitive << fixed << false << true;
        QTest::newRow("empty filter keeps the default")
            << Stored{{"Find-In-Files/CurrentFilterKey", ""}}
            << false << fixed << "" << true << "*" << insensitive << fixed << false << true;
        QTest::newRow("MatchType 0 is a regular expression")
            << Stored{{"FindBar/MatchType", 0}}
            << false << wildcard << "" << true << "*" << insensitive << regexp2 << false << true;
        QTest::newRow("MatchType 1 is a wildcard")
            << Stored{{"FindBar/MatchType", 1}}
            << false << regexp2 << "" << true << "*" << insensitive << wildcard << false << true;
        QTest::newRow("MatchType 2 is literal text")
            << Stored{{"FindBar/MatchType", 2}}
            << false << wildcard << "" << true << "*" << insensitive << fixed << false << true;
        QTest::newRow("MatchType 7 is ignored")
            << Stored{{"FindBar/MatchType", 7}}
            << false << wildcard << "" << true << "*" << insensitive << wildcard << false << true;
        QTest::newRow("MatchType -1 is ignored")
            << Stored{{"FindBar/MatchType", -1}}
            << false << regexp2 << "" << true << "*" << insensitive << regexp2 << false << true;
        QTest::newRow("MatchCase true")
            << Stored{{"FindBar/MatchCase", true}}
            << false << fixed << "" << true << "*" << sensitive << fixed << false << true;
        QTest::newRow("MatchCase false overwrites")
            << Stored{{"FindBar/MatchCase", false}}
            << true << fixed << "" << true << "*" << insensitive << fixed << false << true;
        QTest::newRow("missing MatchCase keeps it")
            << Stored{{"FindBar/MatchWord", false}}
            << true << fixed << "" << true << "*" << sensitive << fixed << false << true;
        QTest::newRow("subfolders off")
            << Stored{{"Find-In-Files/IncludeSubFolderKey", false}}
            << false << fixed << "" << true << "*" << insensitive << fixed << false << false;
        QTest::newRow("flags written as text")
            << Stored{{"FindBar/MatchCase", "true"}, {"FindBar/MatchType", "1"},
                      {"Find-In-Files/IncludeSubFolderKey", "false"}}
            << false << fixed << "" << true << "*" << sensitive << wildcard << false << false;
        QTest::newRow("values of the wrong kind are passed over")
            << Stored{{"FindBar/MatchCase", QStringList{"a", "b"}},
                      {"FindBar/MatchType", "regexp"},
                      {"FindBar/MatchWord", QStringList()},
                      {"Find-In-Files/IncludeSubFolderKey", QStringList{"x", "y"}},
                      {"FindBar/Find what", 12}}
            << true << wildcard << "" << true << "*" << sensitive << wildcard << false << true;
    }

    void setContents()
    {
        QFETCH(Stored, stored);
        QFETCH(bool, caseSensitiveBefore);
        QFETCH(int, typeBefore);
        QFETCH(QString, what);
        QFETCH(bool, whereIsDefault);
        QFETCH(QString, filter);
        QFETCH(int, matchCase);
        QFETCH(int, matchType);
        QFETCH(bool, matchWord);
        QFETCH(bool, includeSubFolders);

        const auto store = storeWith(stored);
        FifInput request;
        const QString defaultWhere = request.where;
        request.matchCase = caseSensitiveBefore ? Qt::CaseSensitive : Qt::CaseInsensitive;
        request.matchType = typeBefore;
        request.setContents(store.get());

        QCOMPARE(request.what, what);
        QCOMPARE(request.where, whereIsDefault ? defaultWhere : QString("/stored"));
        QCOMPARE(request.filter, filter);
        QCOMPARE(request.matchCase, matchCase);
        QCOMPARE(request.matchType, matchType);
        QCOMPARE(request.matchWord, matchWord);
        QCOMPARE(request.includeSubFolders, includeSubFolders);
    }

    void setContentsKeepsTheFilterArgument()
    {
        const auto store = storeWith(Stored{{"FindBar/Find what", QStringList{"x"}}});
        FifInput request("*.h");
        request.setContents(store.get());
        QCOMPARE(request.filter, QString("*.h"));
        QCOMPARE(request.what, QString("x"));
    }

};

QTEST_GUILESS_MAIN(tst_FifSettings)
#include "tst_fifsettings.moc"
