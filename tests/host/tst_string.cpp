#include "String.h"
#include "StringBase.h"

#include <QtTest>

#include <cstring>

using namespace Gui::Orba;

class tst_String : public QObject
{
    Q_OBJECT

private slots:
    void convertsAsUtf8_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("empty") << QString() << QByteArray();
        QTest::newRow("ascii") << QString("find-in-files-results") << QByteArray("find-in-files-results");
        QTest::newRow("umlaut") << QString::fromUtf8("Grüße") << QByteArray("Gr\xc3\xbc\xc3\x9f" "e");
        QTest::newRow("astral") << QString::fromUtf8("\xf0\x9f\x94\x8d") << QByteArray("\xf0\x9f\x94\x8d");
    }

    void convertsAsUtf8()
    {
        QFETCH(QString, text);
        QFETCH(QByteArray, bytes);
        const Port::StringBase<char> narrow = String::convert(text);
        QCOMPARE(narrow.size(), std::size_t(bytes.size()));
        QCOMPARE(QByteArray(narrow.c_str(), int(narrow.size())), bytes);
        QCOMPARE(narrow.empty(), bytes.isEmpty());
        QCOMPARE(String::convert(narrow), text);
    }

    void nullIsEmpty()
    {
        const Port::StringBase<char> none(static_cast<const char*>(nullptr));
        QVERIFY(none.empty());
        QCOMPARE(std::strcmp(none.c_str(), ""), 0);
        QVERIFY(Port::StringBase<char>() == none);
        QVERIFY(Port::StringBase<char>("topic") != none);
    }
};

QTEST_GUILESS_MAIN(tst_String)
#include "tst_string.moc"
