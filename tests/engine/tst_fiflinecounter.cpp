#include "FifLineCounter.h"

#include <QRandomGenerator>
#include <QStringDecoder>
#include <QtTest>

using namespace Gui::Orba;

namespace {

// The decoder the scan uses for UTF-8 lines.
QStringDecoder scanDecoder()
{
    return QStringDecoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless
                                                    | QStringDecoder::Flag::ConvertInitialBom);
}

FifLineCounter::Counts reference(const QByteArray& bytes)
{
    QStringDecoder decoder = scanDecoder();
    FifLineCounter::Counts counts;
    QList<QByteArray> lines = bytes.split('\n');
    lines.removeLast();  // after the last "\n"
    for (QByteArray line : lines) {
        ++counts.lines;
        if (line.endsWith('\r')) {
            line.chop(1);
            ++counts.crlfLines;
        }
        counts.chars += QString(decoder.decode(line)).size();
    }
    return counts;
}

} // namespace

class tst_FifLineCounter : public QObject
{
    Q_OBJECT

private slots:
    // Every sequence of one and two bytes, and of three and four bytes over
    // the bytes that decide UTF-8's boundaries, measures as the decoder does.
    void lengthOfShortSequences()
    {
        QStringDecoder decoder = scanDecoder();
        auto check = [&](const QByteArray& bytes) {
            const qint64 expected = QString(decoder.decode(bytes)).size();
            const qint64 actual =
                FifLineCounter::utf16Length(bytes.constData(), bytes.size(), decoder);
            if (actual != expected)
                QFAIL(qPrintable(QStringLiteral("%1: %2 instead of %3")
                                     .arg(QString::fromLatin1(bytes.toHex(' ')))
                                     .arg(actual)
                                     .arg(expected)));
        };
        for (int a = 0; a < 256; ++a) {
            check(QByteArray(1, char(a)));
            for (int b = 0; b < 256; ++b)
                check(QByteArray(1, char(a)) + char(b));
        }
        const QList<uchar> edges = {0x00, 0x41, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xB7,
                                    0xBB, 0xBE, 0xBF, 0xC0, 0xC2, 0xDF, 0xE0, 0xED, 0xEF,
                                    0xF0, 0xF4, 0xF5, 0xFF};
        for (int lead = 0xC0; lead < 0x100; ++lead) {
            for (uchar b : edges) {
                for (uchar c : edges) {
                    QByteArray three;
                    three.append(char(lead)).append(char(b)).append(char(c));
                    check(three);
                    for (uchar d : edges)
                        check(three + char(d));
                }
            }
        }
    }

    void countsOfLines_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("empty") << QByteArray();
        QTest::newRow("ascii") << QByteArray("int a;\nint b;\r\n\n\r\n");
        QTest::newRow("lone cr") << QByteArray("a\rb\n\r\r\n");
        QTest::newRow("bom per line") << QByteArray("\xEF\xBB\xBF" "a\n\xEF\xBB\xBF\n");
        QTest::newRow("non-characters") << QByteArray("\xEF\xBF\xBE\xEF\xB7\x90\xF4\x8F\xBF\xBF\n");
        QTest::newRow("broken at line end") << QByteArray("\xE2\x84\r\n\xF0\x9F\n\xC2\r\n");
        QTest::newRow("supplementary") << QByteArray("\xF0\x9F\x98\x80 x\n");
        QTest::newRow("many lines") << QByteArray("ab\r\n").repeated(5000)
                                           + QByteArray("\n").repeated(5000)
                                           + QByteArray("x\r\r\n\xC3\xA9\n").repeated(999);
        QTest::newRow("crlf across 16 bytes") << QByteArray(15, 'x') + "\r\n" + QByteArray(14, 'y')
                                                     + "\r\n";
    }

    void countsOfLines()
    {
        QFETCH(QByteArray, bytes);
        QStringDecoder decoder = scanDecoder();
        const auto counts = FifLineCounter::count(bytes.constData(),
                                                  bytes.constData() + bytes.size(), decoder);
        const auto expected = reference(bytes);
        QCOMPARE(counts.lines, expected.lines);
        QCOMPARE(counts.chars, expected.chars);
        QCOMPARE(counts.crlfLines, expected.crlfLines);
    }

    void randomLines()
    {
        const QList<QByteArray> pieces = {
            "a", "word ", "\n", "\n", "\r\n", "\r", "\xC3\xA9", "\xE2\x84\xAA",
            "\xF0\x9F\x98\x80", "\xEF\xBB\xBF", "\xEF\xBF\xBF", "\xED\xA0\x80", "\xC0\x80",
            "\xE2\x84", "\xF0\x9F", "\x80", "\xFF", "\xC2", QByteArray(20, 'z')};
        QRandomGenerator random(99);
        QStringDecoder decoder = scanDecoder();
        for (int round = 0; round < 3000; ++round) {
            QByteArray bytes;
            const int count = int(random.bounded(0, 50));
            for (int i = 0; i < count; ++i)
                bytes += pieces.at(int(random.bounded(pieces.size())));
            bytes += '\n';
            const auto counts = FifLineCounter::count(
                bytes.constData(), bytes.constData() + bytes.size(), decoder);
            const auto expected = reference(bytes);
            QCOMPARE(counts.lines, expected.lines);
            QCOMPARE(counts.chars, expected.chars);
            QCOMPARE(counts.crlfLines, expected.crlfLines);
        }
    }
};

QTEST_MAIN(tst_FifLineCounter)
#include "tst_fiflinecounter.moc"
