#include "FifLineScanner.h"

#include <QBuffer>
#include <QRandomGenerator>
#include <QStringEncoder>
#include <QtTest>

using namespace Gui::Orba;

namespace {

struct Result
{
    int line;
    int offset;
    int rawOffset;
    QString text;
    bool operator==(const Result& other) const
    {
        return line == other.line && offset == other.offset && rawOffset == other.rawOffset
               && text == other.text;
    }
};

char* toString(const Result& r)
{
    return QTest::toString(QStringLiteral("line %1 offset %2 raw %3 text \"%4\"")
                               .arg(r.line)
                               .arg(r.offset)
                               .arg(r.rawOffset)
                               .arg(r.text.left(60)));
}

QList<Result> scan(const QByteArray& bytes, const QRegExp& rx,
                   qint64 maxLineBytes = FifLineScanner::defaultMaxLineBytes,
                   qint64 blockSize = FifLineScanner::defaultBlockSize,
                   const FifLineScanner::StopPoll& stop = {}, bool* hasHit = nullptr)
{
    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    QList<Result> results;
    FifLineScanner scanner(rx, maxLineBytes, blockSize);
    const bool hit = scanner.scan(
        buffer,
        [&](const FifLineScanner::Match& m) {
            results.append({m.line, m.offset, m.rawOffset, m.text});
        },
        stop);
    if (hasHit)
        *hasHit = hit;
    return results;
}

QRegExp literal(const QString& what, Qt::CaseSensitivity cs = Qt::CaseSensitive)
{
    return QRegExp(what, cs, QRegExp::FixedString);
}

// What the scanner must report, worked out line by line from the whole
// decoded text: each physical line is one line; of a line longer than the
// limit only its first part is kept (cut so that no character is split),
// while offsets count every character.
QList<Result> expected(const QList<QString>& contents, const QList<int>& terminators,
                       const QList<QString>& kept, const QString& needle)
{
    QList<Result> results;
    qint64 offset = 0;
    qint64 raw = 0;
    for (int i = 0; i < contents.size(); ++i) {
        const int position = needle.isNull() ? 0 : int(kept.at(i).indexOf(needle));
        if (position >= 0)
            results.append({i + 1, int(offset + position), int(raw + position), kept.at(i)});
        offset += contents.at(i).size() + (terminators.at(i) ? 1 : 0);
        raw += contents.at(i).size() + terminators.at(i);
    }
    return results;
}

// A line's bytes decoded as a whole; a U+FEFF is a character like any other.
QString decodeLine(const QByteArray& bytes)
{
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless
                                                     | QStringDecoder::Flag::ConvertInitialBom);
    return decoder.decode(bytes);
}
} // namespace

class tst_FifLineScanner : public QObject
{
    Q_OBJECT

private slots:
    void lines_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QString>("what");
        QTest::addColumn<QList<int>>("lines");
        QTest::addColumn<QList<int>>("offsets");
        QTest::addColumn<QList<int>>("rawOffsets");
        QTest::addColumn<QStringList>("texts");

        // Line 3 starts after "ab" and "cde", each followed by "\r\n".
        QTest::newRow("crlf") << QByteArray("ab\r\ncde\r\nxyz\r\n") << "xyz" << QList<int>{3}
                              << QList<int>{2 + 3 + 2} << QList<int>{2 + 3 + 4}
                              << QStringList{"xyz"};
        QTest::newRow("mixed ends") << QByteArray("a\nb\r\nc\n") << "c" << QList<int>{3}
                                    << QList<int>{4} << QList<int>{5} << QStringList{"c"};
        QTest::newRow("last line without newline")
            << QByteArray("one\ntwo") << "two" << QList<int>{2} << QList<int>{4}
            << QList<int>{4} << QStringList{"two"};
        QTest::newRow("last line ends in lone CR")
            << QByteArray("one\ntwo\r") << "two" << QList<int>{2} << QList<int>{4}
            << QList<int>{4} << QStringList{"two\r"};
        QTest::newRow("lone CR is no line end")
            << QByteArray("ab\rcd\nef") << "cd" << QList<int>{1} << QList<int>{3}
            << QList<int>{3} << QStringList{"ab\rcd"};
        QTest::newRow("first match only")
            << QByteArray("xx needle needle\nneedle\n") << "needle" << QList<int>{1, 2}
            << QList<int>{3, 17} << QList<int>{3, 17} << QStringList{"xx needle needle", "needle"};
        QTest::newRow("empty file") << QByteArray() << "a" << QList<int>{} << QList<int>{}
                                    << QList<int>{} << QStringList{};
        QTest::newRow("zero byte is text")
            << QByteArray("a\0b needle\nneedle", 17) << "needle" << QList<int>{1, 2}
            << QList<int>{4, 11} << QList<int>{4, 11}
            << QStringList{QString::fromUtf8("a\0b needle", 10), "needle"};
        QTest::newRow("utf-8 counts characters")
            << QByteArray("na\xC3\xAFve caf\xC3\xA9\nna\xC3\xAFve") << QString::fromUtf8("naïve")
            << QList<int>{1, 2} << QList<int>{0, 11} << QList<int>{0, 11}
            << QStringList{QString::fromUtf8("naïve café"), QString::fromUtf8("naïve")};
        QTest::newRow("utf-8 byte-order mark not counted")
            << QByteArray("\xEF\xBB\xBFone\ntwo\n") << "two" << QList<int>{2} << QList<int>{4}
            << QList<int>{4} << QStringList{"two"};
        QTest::newRow("U+FEFF inside the file is text")
            << QByteArray("a\n\xEF\xBB\xBF" "b") << "b" << QList<int>{2} << QList<int>{3}
            << QList<int>{3} << QStringList{QString(QChar(0xFEFF)) + "b"};
        QTest::newRow("latin-1 byte decodes as replacement")
            << QByteArray("caf\xE9 x\nx") << "x" << QList<int>{1, 2} << QList<int>{5, 7}
            << QList<int>{5, 7} << QStringList{QString("caf") + QChar(0xFFFD) + " x", "x"};
    }

    void lines()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(QString, what);
        QFETCH(QList<int>, lines);
        QFETCH(QList<int>, offsets);
        QFETCH(QList<int>, rawOffsets);
        QFETCH(QStringList, texts);
        QList<Result> want;
        for (int i = 0; i < lines.size(); ++i)
            want.append({lines[i], offsets[i], rawOffsets[i], texts[i]});
        bool hasHit = false;
        QCOMPARE(scan(bytes, literal(what), FifLineScanner::defaultMaxLineBytes,
                      FifLineScanner::defaultBlockSize, {}, &hasHit),
                 want);
        QCOMPARE(hasHit, !want.isEmpty());
        // Small reads give the same lines.
        QCOMPARE(scan(bytes, literal(what), FifLineScanner::defaultMaxLineBytes, 1), want);
    }

    // Over-long lines, cut at every place the limit and the reads allow:
    // the kept part never splits a character, the "\r" of a terminator is
    // recognised wherever it falls, and later lines keep true numbers and
    // offsets.
    void overlongLinesUtf8_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("ascii crlf") << QByteArray("abcdefgh\r\nab\r\nabcdefghijk\r\na\n");
        QTest::newRow("multibyte")
            << QByteArray("\xE2\x82\xAC" "a\xC3\xA9\xF0\x9F\x98\x80" "a\r\n\xF0\x9F\x98\x80"
                          "abc\xE2\x82\xAC\xE2\x82\xAC\r\na\n");
        QTest::newRow("cr at the end") << QByteArray("aaaaaaa\r\naaaaaaaa\r\naaaa\r");
        QTest::newRow("invalid bytes")
            << QByteArray("a\xFF\x80\x80\x80\x80" "a\xE2\x82" "a\xC3\r\n\x80" "a\n");
        // Random mixes of the pieces above, with a fixed seed.
        const QList<QByteArray> pieces{"a", "b", "\r", "\n", "\r\n", QByteArray(1, '\0'),
                                       "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80",
                                       "\xFF", "\x80", "\xE2\x82", "\xF0\x9F", "\xEF\xBB\xBF",
                                       "\xC3", "\xE0\x80\x80", "\xED\xA0\x80"};
        QRandomGenerator random(4711);
        for (int n = 0; n < 60; ++n) {
            QByteArray bytes("b"); // a byte-order mark here would not be text
            const int count = random.bounded(1, 30);
            for (int i = 0; i < count; ++i)
                bytes += pieces[random.bounded(int(pieces.size()))];
            QTest::addRow("random %d", n) << bytes;
        }
    }

    void overlongLinesUtf8()
    {
        QFETCH(QByteArray, bytes);
        // The reference: split the raw bytes into lines, decode each whole.
        QList<QString> contents;
        QList<int> terminators;
        QList<QByteArray> rawLines;
        for (qsizetype start = 0; start < bytes.size();) {
            qsizetype newline = bytes.indexOf('\n', start);
            QByteArray rawLine = bytes.mid(start, newline < 0 ? -1 : newline - start);
            int terminator = newline < 0 ? 0 : 1;
            if (terminator && rawLine.endsWith('\r')) {
                rawLine.chop(1);
                terminator = 2;
            }
            rawLines.append(rawLine);
            contents.append(decodeLine(rawLine));
            terminators.append(terminator);
            start = newline < 0 ? bytes.size() : newline + 1;
        }
        const QList<Result> whole = expected(contents, terminators, contents, QString());
        for (qint64 limit = 1; limit <= 14; ++limit) {
            for (qint64 block = 1; block <= 9; ++block) {
                // Every line, with the text kept of it, at position 0.
                const QList<Result> all = scan(bytes, QRegExp(".*"), limit, block);
                QCOMPARE(all.size(), contents.size());
                QList<QString> kept;
                for (int i = 0; i < contents.size(); ++i) {
                    const QByteArray withCR = rawLines[i] + (terminators[i] == 2 ? "\r" : "");
                    QCOMPARE(all[i].line, whole[i].line);
                    QCOMPARE(all[i].offset, whole[i].offset);
                    QCOMPARE(all[i].rawOffset, whole[i].rawOffset);
                    // Kept whole when it fits; else its first bytes, cut
                    // at most a sequence short of the limit, never inside
                    // a character.
                    if (withCR.size() <= limit) {
                        QCOMPARE(all[i].text, contents[i]);
                    } else {
                        QVERIFY(contents[i].startsWith(all[i].text));
                        bool fromPrefix = false;
                        for (qint64 k = qMax<qint64>(0, limit - 3); k <= limit; ++k)
                            fromPrefix = fromPrefix || all[i].text == decodeLine(withCR.left(k));
                        QVERIFY2(fromPrefix, qPrintable(QString::number(i)));
                    }
                    kept.append(all[i].text);
                }
                QCOMPARE(scan(bytes, literal("a"), limit, block),
                         expected(contents, terminators, kept, "a"));
            }
        }
    }

    void utf16AndUtf32_data()
    {
        QTest::addColumn<int>("encoding");
        QTest::addColumn<QByteArray>("bom");
        QTest::newRow("utf-16 le") << int(QStringConverter::Utf16LE) << QByteArray("\xFF\xFE");
        QTest::newRow("utf-16 be") << int(QStringConverter::Utf16BE) << QByteArray("\xFE\xFF");
        QTest::newRow("utf-32 le")
            << int(QStringConverter::Utf32LE) << QByteArray("\xFF\xFE\0\0", 4);
        QTest::newRow("utf-32 be")
            << int(QStringConverter::Utf32BE) << QByteArray("\0\0\xFE\xFF", 4);
    }

    // Read as text in its own encoding; the byte-order mark is not counted,
    // a U+FEFF after it is text, and over-long lines behave as in UTF-8.
    void utf16AndUtf32()
    {
        QFETCH(int, encoding);
        QFETCH(QByteArray, bom);
        const QString emoji = QString::fromUtf8("\xF0\x9F\x98\x80");
        const QStringList lines{QString(QChar(0xFEFF)) + "ab",
                                "a" + emoji + "a" + emoji + "bb",
                                "",
                                emoji + emoji + "a",
                                "aaaa\r"};
        const QList<int> terminators{2, 1, 2, 2, 0};
        QString text;
        for (int i = 0; i < lines.size(); ++i)
            text += lines[i] + (terminators[i] == 2 ? "\r\n" : terminators[i] ? "\n" : "");
        QStringEncoder encoder{QStringConverter::Encoding(encoding)};
        const QByteArray bytes = bom + QByteArray(encoder.encode(text));

        for (qint64 limitChars = 1; limitChars <= 8; ++limitChars) {
            QList<QString> kept;
            for (int i = 0; i < lines.size(); ++i) {
                const QString withCR = lines[i] + (terminators[i] == 2 ? "\r" : "");
                QString part = lines[i];
                if (withCR.size() > limitChars) {
                    part = withCR.left(limitChars);
                    if (part.back().isHighSurrogate())
                        part.chop(1);
                }
                kept.append(part);
            }
            const QList<Result> want = expected(lines, terminators, kept, "a");
            for (qint64 block : {1, 2, 3, 5, 7, 4096}) {
                QCOMPARE(scan(bytes, literal("a"), 2 * limitChars, block), want);
            }
        }
    }

    void utf16OddLastByte()
    {
        const QList<Result> results = scan(QByteArray("\xFF\xFE" "a\0\n\0b\0x", 9), literal("b"));
        QCOMPARE(results.size(), 1);
        QCOMPARE(results[0].line, 2);
        QCOMPARE(results[0].offset, 2);
        QCOMPARE(results[0].text, QString("b") + QChar(QChar::ReplacementCharacter));
    }

    // The stop poll comes every 100 lines: at the first poll that finds a
    // stop, lines 1 to 99 have been matched, and nothing after.
    void stopEvery100Lines()
    {
        QByteArray bytes;
        for (int i = 0; i < 1000; ++i)
            bytes += "x\n";
        int polls = 0;
        bool hasHit = false;
        const QList<Result> results =
            scan(bytes, literal("x"), FifLineScanner::defaultMaxLineBytes,
                 FifLineScanner::defaultBlockSize, [&] { return ++polls >= 2; }, &hasHit);
        QVERIFY(hasHit);
        QCOMPARE(results.size(), 199);
        QCOMPARE(results.last().line, 199);
    }

    // Within one line that spans many reads the scan polls at every read.
    void stopInsideHugeLine()
    {
        const QByteArray bytes(1024 * 1024, 'x');
        int polls = 0;
        const QList<Result> results =
            scan(bytes, literal("x"), FifLineScanner::defaultMaxLineBytes, 4096,
                 [&] { return ++polls == 3; });
        QVERIFY(results.isEmpty());
        QCOMPARE(polls, 3);
    }

    // A stop that comes while a long line is matched, one start position at
    // a time, ends the scan there: no later line is matched, with the
    // prefilter (required text "b") or without it (an alternation).
    void stopWhileMatchingLongLine_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<int>("syntax");
        QTest::newRow("prefiltered") << "b" << int(QRegExp::RegExp2);
        QTest::newRow("every line") << "b|c" << int(QRegExp::RegExp2);
    }

    void stopWhileMatchingLongLine()
    {
        QFETCH(QString, pattern);
        QFETCH(int, syntax);
        const QByteArray bytes = QByteArray(4000, 'a') + "b\nb\nb\n";
        int polls = 0;
        const QList<Result> results =
            scan(bytes, QRegExp(pattern, Qt::CaseSensitive, QRegExp::PatternSyntax(syntax)),
                 FifLineScanner::defaultMaxLineBytes, FifLineScanner::defaultBlockSize,
                 [&] { return ++polls > 10; });
        QVERIFY(polls > 10);
        QVERIFY2(results.isEmpty(), results.isEmpty() ? "" : toString(results.first()));
    }

    // Lines that cannot match are passed over undecoded: every hit, line
    // number, offset and text stays what matching every line gives, also
    // with over-long lines, lines split between reads, CRLF, byte-order
    // marks, broken UTF-8 and the characters QRegExp folds to ASCII.
    void prefilterChangesNothing()
    {
        const QList<QByteArray> pieces = {
            "int", "k", "S", "x", " ", "\n", "\n", "\n", "\r\n", "\r", "\t",
            "\xE2\x84\xAA", "\xC5\xBF", "\xC3\xA9", "\xF0\x9F\x98\x80", "\xEF\xBB\xBF",
            "\xE2\x84", "\xFF", "\x80", "\xEF\xBF\xBE", QByteArray("\0", 1),
            QByteArray(40, 'y'), "Kit", "sInT"};
        struct Request
        {
            QString what;
            QRegExp::PatternSyntax syntax;
        };
        const QList<Request> requests = {
            {"int", QRegExp::FixedString}, {"kit", QRegExp::FixedString},
            {"s", QRegExp::FixedString},   {"x y", QRegExp::FixedString},
            {"k.*t", QRegExp::RegExp2},    {"\\bint\\b", QRegExp::RegExp2},
            {"^x", QRegExp::RegExp2}};
        QRandomGenerator random(31337);
        int withPrefilter = 0;
        for (int round = 0; round < 400; ++round) {
            QByteArray bytes = round % 5 == 0 ? QByteArray("\xEF\xBB\xBF") : QByteArray();
            const int count = int(random.bounded(0, 120));
            for (int i = 0; i < count; ++i)
                bytes += pieces.at(int(random.bounded(pieces.size())));
            const qint64 maxLine = QList<qint64>{3, 8, 50, FifLineScanner::defaultMaxLineBytes}
                                       .at(int(random.bounded(4)));
            const qint64 block = QList<qint64>{1, 7, 64, FifLineScanner::defaultBlockSize}
                                     .at(int(random.bounded(4)));
            for (const Request& request : requests) {
                for (Qt::CaseSensitivity cs : {Qt::CaseSensitive, Qt::CaseInsensitive}) {
                    const QRegExp rx(request.what, cs, request.syntax);
                    QList<Result> results[2];
                    bool hits[2] = {false, false};
                    for (int plain = 0; plain < 2; ++plain) {
                        QBuffer buffer;
                        buffer.setData(bytes);
                        buffer.open(QIODevice::ReadOnly);
                        FifLineScanner scanner(rx, maxLine, block);
                        if (plain)
                            scanner.setPrefilterEnabled(false);
                        else
                            withPrefilter += scanner.isPrefilterEnabled() ? 1 : 0;
                        hits[plain] = scanner.scan(
                            buffer,
                            [&](const FifLineScanner::Match& m) {
                                results[plain].append({m.line, m.offset, m.rawOffset, m.text});
                            },
                            {});
                    }
                    QCOMPARE(results[0], results[1]);
                    QCOMPARE(hits[0], hits[1]);
                }
            }
        }
        QVERIFY(withPrefilter > 1000);
    }
};

QTEST_GUILESS_MAIN(tst_FifLineScanner)
#include "tst_fiflinescanner.moc"
