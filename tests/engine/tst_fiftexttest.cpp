#include "FifTextTest.h"

#include <QFile>
#include <QRandomGenerator>
#include <QTemporaryDir>
#include <QTextStream>
#include <QtTest>

using namespace Gui::Orba;

namespace {

// The test as the worker states it: the first 20 lines read through a
// QTextStream, no control character other than white space.
bool isTextByStream(const QString& path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return false;
    QTextStream stream(&file);
    for (int lines = 0; lines < 20 && !stream.atEnd(); ++lines) {
        const QString line = stream.readLine();
        for (const QChar c : line) {
            if (c.category() == QChar::Other_Control && !c.isSpace())
                return false;
        }
    }
    return true;
}

FifTextTest::Verdict verdictInPieces(const QByteArray& bytes, int piece)
{
    FifTextTest test;
    for (qsizetype at = 0; at < bytes.size(); at += piece) {
        if (test.feed(bytes.constData() + at, qMin<qsizetype>(piece, bytes.size() - at))
            != FifTextTest::Undecided)
            break;
    }
    return test.finish();
}

} // namespace

class tst_FifTextTest : public QObject
{
    Q_OBJECT

private:
    QTemporaryDir dir;
    int fileNumber = 0;

    // The stream's verdict on `bytes` written to a real file.
    bool streamVerdict(const QByteArray& bytes)
    {
        const QString path = dir.filePath(QString::number(++fileNumber));
        QFile file(path);
        if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size())
            qFatal("cannot write %s", qPrintable(path));
        file.close();
        const bool text = isTextByStream(path);
        QFile::remove(path);
        return text;
    }

private slots:
    void verdicts_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<int>("verdict");
        const int text = FifTextTest::Text;
        const int binary = FifTextTest::Binary;
        const int other = FifTextTest::OtherEncoding;
        const QByteArray twenty = QByteArray("line\n").repeated(20);
        const QByteArray nineteen = QByteArray("line\n").repeated(19);
        QTest::newRow("empty") << QByteArray() << text;
        QTest::newRow("plain") << QByteArray("int main()\n{\n}\n") << text;
        QTest::newRow("white space") << QByteArray("\t\v\f\r\n x") << text;
        QTest::newRow("zero") << QByteArray("ab\0c", 4) << binary;
        QTest::newRow("escape") << QByteArray("\x1B[0m") << binary;
        QTest::newRow("unit separator") << QByteArray("a\x1F") << binary;
        QTest::newRow("delete") << QByteArray("a\x7F") << binary;
        QTest::newRow("zero in line 20") << nineteen + QByteArray("x\0", 2) << binary;
        QTest::newRow("zero in line 21") << twenty + QByteArray("x\0", 2) << text;
        QTest::newRow("cr does not end lines")
            << QByteArray("a\r").repeated(25) + QByteArray("\0", 1) << binary;
        QTest::newRow("crlf lines") << QByteArray("a\r\n").repeated(20) + QByteArray("\0", 1)
                                    << text;
        QTest::newRow("c1 control") << QByteArray("a\xC2\x80") << binary;
        QTest::newRow("last c1 control") << QByteArray("a\xC2\x9F") << binary;
        QTest::newRow("next line is space") << QByteArray("a\xC2\x85" "b") << text;
        QTest::newRow("no-break space") << QByteArray("a\xC2\xA0") << text;
        QTest::newRow("c2 at end") << QByteArray("a\xC2") << text;
        QTest::newRow("c2 before newline") << QByteArray("a\xC2\n\x80") << text;
        QTest::newRow("broken then c1") << QByteArray("\xE0\xC2\x80") << binary;
        QTest::newRow("overlong zero") << QByteArray("a\xC0\x80" "b") << text;
        QTest::newRow("invalid bytes") << QByteArray("\xFF\xFE\xFD", 3).mid(2) << text;
        QTest::newRow("utf-8 bom") << QByteArray("\xEF\xBB\xBF" "abc") << text;
        QTest::newRow("utf-8 bom then zero") << QByteArray("\xEF\xBB\xBF\0", 4) << binary;
        QTest::newRow("utf-16le bom") << QByteArray("\xFF\xFE" "a\0b\0", 6) << other;
        QTest::newRow("utf-16be bom") << QByteArray("\xFE\xFF\0a", 4) << other;
        QTest::newRow("utf-16 bom alone") << QByteArray("\xFF\xFE") << other;
        QTest::newRow("utf-32be bom") << QByteArray("\0\0\xFE\xFF\0\0\0a", 8) << other;
        QTest::newRow("utf-32be bom cut") << QByteArray("\0\0\xFE", 3) << binary;
        QTest::newRow("utf-32le bom") << QByteArray("\xFF\xFE\0\0a\0\0\0", 8) << other;
        QTest::newRow("long first line")
            << QByteArray(100000, 'x') + QByteArray("\x01") << binary;
        QTest::newRow("c1 across reads")
            << QByteArray(16383, 'x') + QByteArray("\xC2\x81") << binary;
    }

    void verdicts()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(int, verdict);
        for (int piece : {1, 2, 3, 5, 16, 17, 4096, 1 << 20})
            QCOMPARE(int(verdictInPieces(bytes, piece)), verdict);
        // Where the test decides, it agrees with the stream.
        if (verdict != FifTextTest::OtherEncoding)
            QCOMPARE(streamVerdict(bytes), verdict == FifTextTest::Text);
    }

    // Every code point's own rule, byte by byte: the C0 and C1 controls
    // but white space are the control characters.
    void everyCharacter()
    {
        for (char32_t u = 1; u < 0x3000; ++u) {
            if (u >= 0xD800 && u < 0xE000)
                continue;
            const QChar c(char16_t(u & 0xFFFF));
            const bool control = c.category() == QChar::Other_Control && !c.isSpace();
            const QByteArray bytes = QString(c).toUtf8();
            QCOMPARE(verdictInPieces(bytes, 1) == FifTextTest::Binary, control);
        }
    }

    // Random files over the troublesome bytes: the test and the stream agree.
    void randomAgreement()
    {
        const QList<QByteArray> pieces = {
            "a", "bc", "\n", "\n", "\n", "\r", "\r\n", "\t", QByteArray("\0", 1), "\x01",
            "\x1B", "\x7F", "\xC2", "\x80", "\x85", "\x9F", "\xA0", "\xE0", "\xE2\x84",
            "\xF0\x9F", "\xFF", "\xFE", "\xEF\xBB\xBF", "\xC3\xA9", "\x0B", "\x0C", "\x1C"};
        QRandomGenerator random(4711);
        int binaries = 0;
        int texts = 0;
        for (int round = 0; round < 1500; ++round) {
            QByteArray bytes;
            const int count = int(random.bounded(0, 60));
            for (int i = 0; i < count; ++i) {
                // Mostly harmless text, so that files reach line 20.
                if (random.bounded(4) == 0)
                    bytes += pieces.at(int(random.bounded(pieces.size())));
                else
                    bytes += random.bounded(3) == 0 ? "\n" : "word ";
            }
            const FifTextTest::Verdict verdict = verdictInPieces(bytes, 1 + round % 7);
            if (verdict == FifTextTest::OtherEncoding)
                continue;
            const bool text = streamVerdict(bytes);
            QCOMPARE(verdict == FifTextTest::Text, text);
            (text ? texts : binaries) += 1;
        }
        QVERIFY(texts > 100);
        QVERIFY(binaries > 100);
    }
};

QTEST_MAIN(tst_FifTextTest)
#include "tst_fiftexttest.moc"
