#include "IniFiles.h"
#include "Settings.h"

#include <QtTest>

#include <unistd.h>

using namespace Gui::Orba;

// What a value looks like once it has come back: its type and content.
#define COMPARE_TYPED(actual, expected)                                      \
    do {                                                                     \
        const QVariant compareActual = (actual);                             \
        const QVariant compareExpected = (expected);                         \
        QCOMPARE(compareActual.typeId(), compareExpected.typeId());          \
        QCOMPARE(compareActual, compareExpected);                            \
    } while (0)

class tst_Settings : public QObject
{
    Q_OBJECT

private slots:
    void valuesKeepTheirTypes_data()
    {
        QTest::addColumn<QString>("keyPath");
        QTest::addColumn<QVariant>("value");

        QTest::newRow("list with blank in key") << "FindBar/Find what"
                                                << QVariant(QStringList{"foo", "bar baz"});
        QTest::newRow("list of one") << "Find-In-Files/WhereKey"
                                     << QVariant(QStringList{"C:\\src;D:\\x"});
        QTest::newRow("empty list") << "Find-In-Files/WhereKey" << QVariant(QStringList());
        QTest::newRow("list of an empty string") << "g/blank" << QVariant(QStringList{""});
        QTest::newRow("list with commas") << "g/list" << QVariant(QStringList{"a, b", "c;d", "@x"});
        QTest::newRow("bool true") << "FindBar/MatchCase" << QVariant(true);
        QTest::newRow("int 0") << "FindBar/MatchType" << QVariant(0);
        QTest::newRow("string") << "Find-In-Files/CurrentFilterKey" << QVariant(QString("*.cpp;*.h"));
        QTest::newRow("string with comma") << "g/s" << QVariant(QString("a, b"));
        QTest::newRow("string that reads as bool") << "g/s" << QVariant(QString("true"));
        QTest::newRow("string that reads as int") << "g/s" << QVariant(QString("7"));
        QTest::newRow("empty string") << "g/s" << QVariant(QString(""));
        QTest::newRow("non-latin string") << "g/s" << QVariant(QString::fromUtf8("Grüße ✓"));
        QTest::newRow("bytes") << "Dialogs/x/Geometry" << QVariant(QByteArray("\x01\x02\xff", 3));
        QTest::newRow("double") << "g/d" << QVariant(2.5);
        QTest::newRow("key with blanks in both parts") << "My Group/My Key" << QVariant(3);
    }

    void valuesKeepTheirTypes()
    {
        QFETCH(QString, keyPath);
        QFETCH(QVariant, value);
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        {
            Settings settings(fileName);
            QVERIFY(settings.isPersistent());
            settings.setValue(keyPath, value);
            COMPARE_TYPED(settings.getValue(keyPath), value);
        }
        {
            Settings again(fileName);
            COMPARE_TYPED(again.getValue(keyPath), value);
        }
        // A copy has never been seen by this process, so it is parsed anew.
        Settings fresh(IniFiles::freshCopy(fileName));
        COMPARE_TYPED(fresh.getValue(keyPath), value);
    }

    void laterValueReplacesTypeOfEarlier()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        {
            Settings settings(fileName);
            settings.setValue("g/k", 12);
            settings.setValue("g/k", QString("12"));
            settings.setValue("g/list", QStringList{"a"});
            settings.setValue("g/list", QVariant());
        }
        Settings fresh(IniFiles::freshCopy(fileName));
        COMPARE_TYPED(fresh.getValue("g/k"), QVariant(QString("12")));
        QVERIFY(!fresh.getValue("g/list").isValid());
    }

    void spellingsOfOneKeyShareTheType()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        {
            Settings settings(fileName);
            settings.setValue("/g//k", true);
            settings.setValue("g/a%2Fb", QString("text")); // not the same key as g/a/b
            settings.setValue("g/a/b", 4);
        }
        Settings fresh(IniFiles::freshCopy(fileName));
        COMPARE_TYPED(fresh.getValue("g/k"), QVariant(true));
        COMPARE_TYPED(fresh.getValue("g/k/"), QVariant(true));
        COMPARE_TYPED(fresh.getValue("g/a%2Fb"), QVariant(QString("text")));
        COMPARE_TYPED(fresh.getValue("g/a/b"), QVariant(4));
    }

    void memoryStore()
    {
        Settings settings;
        QVERIFY(!settings.isPersistent());
        QVERIFY(settings.getFileName().isEmpty());
        QVERIFY(!settings.getValue("FindBar/MatchCase").isValid());
        settings.setValue("FindBar/MatchCase", true);
        settings.setValue("FindBar/Find what", QStringList());
        settings.sync();
        COMPARE_TYPED(settings.getValue("FindBar/MatchCase"), QVariant(true));
        COMPARE_TYPED(settings.getValue("/FindBar//MatchCase"), QVariant(true));
        COMPARE_TYPED(settings.getValue("FindBar/Find what", 1), QVariant(QStringList()));

        QCOMPARE(settings.getValue("FindBar/Missing", 5), QVariant(5));
        Settings other;
        QVERIFY(!other.getValue("FindBar/MatchCase").isValid());
    }

    void damagedFile_data()
    {
        static const char garbage[] = "\x00\x01\x02\xff\xfe\n[[[\n=\n\x7f";
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QString>("salvagedKey");
        QTest::addColumn<QVariant>("salvagedValue");

        QTest::newRow("unclosed section")
            << QByteArray("[ok]\nkeep=yes\n[FindBar\nx=1\n") << "ok/keep" << QVariant("yes");
        QTest::newRow("line without value")
            << QByteArray("[ok]\nkeep=yes\n[a]\nno value here\n") << "ok/keep" << QVariant("yes");
        QTest::newRow("binary garbage")
            << QByteArray(garbage, sizeof(garbage) - 1) << QString() << QVariant();
    }

    void damagedFile()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(QString, salvagedKey);
        QFETCH(QVariant, salvagedValue);
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        QVERIFY(IniFiles::write(fileName, bytes));
        {
            Settings settings(fileName);
            QVERIFY(settings.isPersistent());
            if (!salvagedKey.isEmpty())
                QCOMPARE(settings.getValue(salvagedKey), salvagedValue);
            settings.setValue("FindBar/Find what", QStringList{"session"});
            COMPARE_TYPED(settings.getValue("FindBar/Find what"), QVariant(QStringList{"session"}));
            settings.sync();
            QVERIFY(settings.isPersistent());
        }
        // The damaged file is kept as it was, beside the new one.
        QCOMPARE(IniFiles::contents(fileName + ".corrupt"), bytes);
        Settings fresh(IniFiles::freshCopy(fileName));
        COMPARE_TYPED(fresh.getValue("FindBar/Find what"), QVariant(QStringList{"session"}));
        if (!salvagedKey.isEmpty())
            QCOMPARE(fresh.getValue(salvagedKey), salvagedValue);
    }

    void unreadableFileIsLeftAlone()
    {
        QTemporaryDir dir;
        // A folder where the file should be cannot be read as one.
        const QString fileName = dir.filePath("settings.ini");
        QVERIFY(QDir().mkpath(fileName + "/inside"));
        Settings settings(fileName);
        QVERIFY(!settings.isPersistent());
        QCOMPARE(settings.getFileName(), fileName);
        settings.setValue("FindBar/MatchWord", true);
        settings.sync();
        COMPARE_TYPED(settings.getValue("FindBar/MatchWord"), QVariant(true));
        QVERIFY(QFileInfo(fileName + "/inside").isDir());
    }

    void fileWithoutReadPermission()
    {
        if (::geteuid() == 0)
            QSKIP("file permissions do not bind the superuser");
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        QVERIFY(IniFiles::write(fileName, "[FindBar]\nMatchWord=true\n"));
        QVERIFY(QFile::setPermissions(fileName, QFile::WriteOwner));
        {
            Settings settings(fileName);
            QVERIFY(!settings.isPersistent());
            settings.setValue("g/k", 1);
            QCOMPARE(settings.getValue("g/k"), QVariant(1));
        }
        QVERIFY(QFile::setPermissions(fileName, QFile::ReadOwner | QFile::WriteOwner));
        QCOMPARE(IniFiles::contents(fileName), QByteArray("[FindBar]\nMatchWord=true\n"));
    }

    void unwritableFolder()
    {
        QTemporaryDir dir;
        // A plain file in the way: the folder can never be made.
        QVERIFY(IniFiles::write(dir.filePath("blocker"), "x"));
        const QString fileName = dir.filePath("blocker/config/settings.ini");
        Settings settings(fileName);
        QVERIFY(!settings.isPersistent());
        settings.setValue("FindBar/Find what", QStringList{"kept for this run"});
        settings.sync();
        QVERIFY(!settings.isPersistent());
        COMPARE_TYPED(settings.getValue("FindBar/Find what"),
                     QVariant(QStringList{"kept for this run"}));
    }

    void folderLostDuringTheRun()
    {
        QTemporaryDir dir;
        const QString folder = dir.filePath("config");
        QVERIFY(QDir().mkpath(folder));
        Settings settings(folder + "/settings.ini");
        settings.setValue("g/first", 1);
        settings.sync();
        QVERIFY(settings.isPersistent());

        QVERIFY(QDir(folder).removeRecursively());
        QVERIFY(IniFiles::write(folder, "now a file"));
        settings.setValue("g/second", 2);
        settings.sync();
        QVERIFY(!settings.isPersistent());
        QCOMPARE(settings.getValue("g/first"), QVariant(1));
        QCOMPARE(settings.getValue("g/second"), QVariant(2));
    }

    void missingFolderIsCreated()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("a/b/settings.ini");
        {
            Settings settings(fileName);
            QVERIFY(settings.isPersistent());
            settings.setValue("g/k", QStringList{"x"});
        }
        QVERIFY(QFileInfo::exists(fileName));
        Settings fresh(IniFiles::freshCopy(fileName));
        COMPARE_TYPED(fresh.getValue("g/k"), QVariant(QStringList{"x"}));
    }
};

QTEST_GUILESS_MAIN(tst_Settings)
#include "tst_settings.moc"
