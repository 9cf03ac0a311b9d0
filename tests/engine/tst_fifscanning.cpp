// Scanning a file's bytes (line scanner, line counter, prefilter, text test, file device), checked against
// a plain reading of the same bytes: FifReference, QStringDecoder, QRegExp on whole lines.

#include "FifAsciiMatcher.h"
#include "FifFileDevice.h"
#include "FifLineCounter.h"
#include "FifLineScanner.h"
#include "FifReference.h"
#include "FifTest.h"
#include "FifTextTest.h"
#include "FifWorker.h"

#include <QtTest>

using namespace Gui::Orba;
using Hits = QList<FifReference::Match>;

namespace {

constexpr qint64 noLimit = FifLineScanner::defaultMaxLineBytes, bigBlock = FifLineScanner::defaultBlockSize;
constexpr auto cs = Qt::CaseSensitive, ci = Qt::CaseInsensitive;
constexpr auto fixed = QRegExp::FixedString, rx2 = QRegExp::RegExp2;

struct Scan
{
    Hits hits;
    bool hasHit = false;
    int polls = 0;
    qsizetype hitsAtStop = -1;  // hits when a poll first said stop
};

// Scans `bytes`, or `device` holding them; the stop poll says true from its `stopAt`th call on (0: never).
Scan scan(const QByteArray& bytes, const QRegExp& rx, qint64 block = bigBlock, bool prefilter = true,
          int stopAt = 0, qint64 maxLine = noLimit, QIODevice* device = nullptr)
{
    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    Scan s;
    FifLineScanner scanner(rx, maxLine, block);
    scanner.setPrefilterEnabled(prefilter);
    s.hasHit = scanner.scan(
        device ? *device : buffer,
        [&](const FifLineScanner::Match& m) {
            QRegExp whole(rx);  // the first match as QRegExp finds it in the whole line
            QVERIFY(whole.indexIn(m.text, 0, QRegExp::CaretAtZero) == m.column && whole.matchedLength() == m.length);
            s.hits.append({m.line, m.offset, m.rawOffset, m.text});
        },
        [&] {
            if (++s.polls >= stopAt && stopAt > 0 && s.hitsAtStop < 0)
                s.hitsAtStop = s.hits.size();
            return s.polls >= stopAt && stopAt > 0;
        });
    return s;
}

bool isWide(const QByteArray& b)  // starts with a UTF-16 or UTF-32 byte-order mark
{
    return b.startsWith("\xFF\xFE") || b.startsWith("\xFE\xFF") || b.startsWith(QByteArray("\0\0\xFE\xFF", 4));
}

// Line breaks of every kind, broken UTF-8, byte-order marks anywhere, characters QRegExp folds to ASCII
// letters; half the files in UTF-16 or UTF-32, some with an odd last byte or a lone surrogate.
QByteArray randomFile(QRandomGenerator& random, int maxPieces = 80)
{
    static const QList<QByteArray> pieces = {
        "a", "k", "S", "st", "int", "Kit", " ", "\n", "\n", "\n", "\r\n", "\r", "\t", QByteArray(1, '\0'),
        "\xE2\x84\xAA", "\xC5\xBF", "\xC3\xA9", "\xF0\x9F\x98\x80", "\xEF\xBB\xBF", "\xEF\xBF\xBE", "\xE2\x84",
        "\xF0\x9F", "\xC3", "\xFF", "\x80", "\xC0\x80", "\xED\xA0\x80", QByteArray(40, 'y')};
    QByteArray bytes;
    for (int i = random.bounded(maxPieces); i > 0; --i)
        bytes += pieces.at(random.bounded(int(pieces.size())));
    const int kind = random.bounded(8);
    if (kind < 4)
        return kind ? bytes : "\xEF\xBB\xBF" + bytes;
    const QStringConverter::Encoding wide[] = {QStringConverter::Utf16LE, QStringConverter::Utf16BE,
                                               QStringConverter::Utf32LE, QStringConverter::Utf32BE};
    QByteArray encoded = QStringEncoder(wide[kind - 4], QStringEncoder::Flag::WriteBom).encode(QString::fromUtf8(bytes));
    if (kind == 4 && random.bounded(2))
        encoded.append("\x00\xD8" "a\0\n\0", 6);
    encoded.chop(random.bounded(2));
    return encoded;
}

} // namespace

class tst_FifScanning : public QObject
{
    Q_OBJECT

    QTemporaryDir dir;
    QByteArray lent;  // one head buffer for every file device, as the worker lends it

private slots:
    // Every hit with its line number, offsets and text as the plain reading has them, whatever the size
    // of the reads, prefilter on or off. A stop ends the scan: its hits are the first of the full ones,
    // none comes after a poll said stop, and the scan polls no more. Polls come every 100 lines and
    // before each further read, not more often: a first read's finished lines 1 to 99 get through.
    void scanning()
    {
        const QList<QRegExp> patterns = {
            QRegExp("a", cs, fixed), QRegExp("k", ci, fixed), QRegExp("st", ci, fixed), QRegExp("kit", ci, fixed),
            QRegExp("\r", cs, fixed), QRegExp(QString(QChar(0xFEFF)), cs, fixed), QRegExp("^", cs, rx2),
            QRegExp("y+$", cs, rx2), QRegExp("\\bk\\w*", ci, rx2), QRegExp("s.*t", ci, rx2),
            QRegExp("in+t", ci, rx2), QRegExp("[^\\x0001-\\x007f]", cs, rx2)};
        QRandomGenerator random(4711);
        for (int round = 0; round < 150; ++round) {
            const QByteArray bytes = randomFile(random).repeated(round % 5 ? 1 + round % 5 : 25);
            const QList<FifReference::Line> lines = FifReference::lines(bytes);
            for (const QRegExp& rx : patterns) {
                const Hits full = FifReference::matches(bytes, rx);
                const auto first = std::count_if(full.begin(), full.end(),  // hits in finished lines 1 to 99
                                                 [&](auto& hit) { return hit.line < 100 && lines[hit.line - 1].terminator; });
                // Unless lines over 1024 characters are matched (and polled) position by position:
                const bool sliced = rx.patternSyntax() != fixed;
                for (qint64 block : {qint64(1), qint64(3), qint64(64), bigBlock}) {
                    for (bool prefilter : {true, false}) {
                        for (int stopAt = 0; stopAt <= 3; ++stopAt) {
                            const Scan s = scan(bytes, rx, block, prefilter, stopAt);
                            QCOMPARE(s.hits, full.mid(0, s.hitsAtStop < 0 ? full.size() : s.hitsAtStop));
                            QVERIFY(s.hasHit == !s.hits.isEmpty() && (s.hitsAtStop < 0 || s.polls == stopAt));
                            QVERIFY(sliced || stopAt || s.polls <= bytes.size() / block + 1 + 3 * (lines.size() / 100));
                            QVERIFY(sliced || stopAt != 1 || block != bigBlock || s.hits.size() == first);
                        }
                    }
                }
            }
        }
    }

    // Of a line over the limit only its first bytes are kept, never cut inside a character (at most
    // 3 bytes short in UTF-8; half as many characters as bytes in UTF-16 and UTF-32, a surrogate pair
    // whole); every line keeps its true number and offsets.
    void overlongLines()
    {
        QRandomGenerator random(1234);
        const QRegExp everyLine(".*");  // never prefiltered
        QStringDecoder utf8(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless | QStringDecoder::Flag::ConvertInitialBom);
        for (int round = 0; round < 50; ++round) {
            const QByteArray bytes = randomFile(random, 30);
            const QList<FifReference::Line> lines = FifReference::lines(bytes);
            const Hits whole = FifReference::matches(bytes, everyLine);
            // The stored lines of a UTF-8 file, "\r" of the terminator included.
            const QList<QByteArray> raw = (bytes.startsWith("\xEF\xBB\xBF") ? bytes.mid(3) : bytes).split('\n');
            for (qint64 limit = 1; limit <= 14; ++limit) {
                for (qint64 block = 1; block <= 9; ++block) {
                    const Scan all = scan(bytes, everyLine, block, true, 0, limit);
                    QCOMPARE(all.hits.size(), whole.size());
                    Hits want;
                    for (int i = 0; i < whole.size(); ++i) {
                        const FifReference::Match& got = all.hits.at(i);
                        QCOMPARE((FifReference::Match{got.line, got.offset, got.rawOffset, whole[i].text}), whole[i]);
                        const QString withCR = lines[i].text + (lines[i].terminator == 2 ? "\r" : "");
                        QStringList kept{lines[i].text};
                        if (isWide(bytes) && withCR.size() > qMax<qint64>(limit / 2, 1)) {
                            kept[0] = withCR.left(qMax<qint64>(limit / 2, 1));
                            kept[0].chop(kept[0].back().isHighSurrogate() ? 1 : 0);
                        } else if (!isWide(bytes) && raw[i].size() > limit) {
                            kept.clear();
                            for (qint64 k = qMax<qint64>(0, limit - 3); k <= limit; ++k)
                                kept << utf8.decode(raw[i].left(k));
                        }
                        QVERIFY2(kept.contains(got.text), qPrintable(QString::number(i)));
                        if (const int at = got.text.indexOf('a'); at >= 0)
                            want.append({got.line, got.offset + at, got.rawOffset + at, got.text});
                    }
                    for (bool prefilter : {true, false})
                        QCOMPARE(scan(bytes, QRegExp("a", cs, fixed), block, prefilter, 0, limit).hits, want);
                }
            }
        }
    }

    // Lines over sliceThreshold are matched one start position at a time: the first match is still
    // the one Qt finds in the whole line, and a stop is noticed before each position. A stop is also
    // noticed inside a huge line, at each read.
    void longLines()
    {
        QRandomGenerator random(12345);
        QStringList lines;  // 1000 to 5000 characters, a needle near the start, middle or end
        for (int i = 0; i < 40; ++i) {
            QString line;
            for (int c = 1000 + random.bounded(4000); c > 0; --c)
                line += QLatin1Char("aab xyzd11N"[random.bounded(11)]);
            if (i % 3 == 0)
                line.insert(random.bounded(int(line.size())), QStringLiteral(" needle "));
            lines.append(i % 5 ? line : line + "x needle x");
        }
        auto utf16 = [](const QString& text) { return "\xFF\xFE" + QByteArray(QStringEncoder(QStringConverter::Utf16LE).encode(text)); };
        const int wild = QRegExp::Wildcard;  // what, syntax, case, word: all kinds of patterns
        const QList<std::tuple<QString, int, bool, bool>> requests = {
            {"needle", rx2, false, false}, {"needle", fixed, false, true}, {"NEEDLE", rx2, true, false},
            {"x+$", rx2, false, false}, {"^a|needle", rx2, false, false}, {"(\\d)\\1", rx2, false, false},
            {"e(?=d)", rx2, false, false}, {"n(?!e)", rx2, false, false}, {"zz|yx|needle", rx2, false, false},
            {"\\Ba\\b", rx2, false, false}, {"a*b", rx2, false, false}, {"[^a-z ]{2}", rx2, false, false},
            {"n?ed*x", wild, false, false}, {"ne?dle", wild, false, true}, {"q*", rx2, false, false}};
        for (const auto& [what, type, matchCase, word] : requests) {
            const QRegExp rx = FifTest::request(what, QString(), type, matchCase, word).getRegExp();
            for (const QByteArray& bytes : {lines.join('\n').toUtf8(), utf16(lines.join('\n'))}) {
                const Hits want = FifReference::matches(bytes, rx);
                QVERIFY(rx.isValid());
                for (bool prefilter : {true, false})
                    QCOMPARE(scan(bytes, rx, bigBlock, prefilter).hits, want);
                const Scan s = scan(bytes, rx, bigBlock, true, 11);
                QCOMPARE(s.hits, want.mid(0, s.hitsAtStop < 0 ? want.size() : s.hitsAtStop));
                QVERIFY(s.hitsAtStop < 0 || s.polls == 11);
            }
        }
        // A scanner stopped while it matched a long line scans the next file whole.
        QByteArray bytes = lines.join('\n').toUtf8();
        const Hits want = FifReference::matches(bytes, QRegExp("needle", ci, rx2));
        FifLineScanner reused(QRegExp("needle", ci, rx2));
        for (int stopAt : {11, 0}) {
            QBuffer buffer(&bytes);
            Hits got;
            int polls = 0;
            QVERIFY(buffer.open(QIODevice::ReadOnly));
            reused.scan(buffer, [&](const auto& m) { got.append({m.line, m.offset, m.rawOffset, m.text}); },
                        [&] { return stopAt && ++polls >= stopAt; });
            QVERIFY(stopAt ? got.size() < want.size() : got == want);
        }
        const QString huge(1 << 20, 'x');
        for (const QByteArray& bytes : {huge.toUtf8(), utf16(huge)}) {
            const Scan s = scan(bytes, QRegExp("x", cs, fixed), 4096, true, 3);
            QVERIFY(s.hits.isEmpty() && s.polls == 3);
        }
    }

    // Lines, characters and "\r\n" terminators as decoding each line gives: every sequence of one
    // and two bytes, of three and four over the bytes that bound UTF-8's ranges, random lines.
    void lineCounter()
    {
        QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless | QStringDecoder::Flag::ConvertInitialBom);
        FifFileDecoder utf8;  // the scan's own
        const QByteArray edges("\x00\x41\x7F\x80\x8F\x90\x9F\xA0\xB7\xBB\xBE\xBF\xC0\xC2\xDF\xE0\xED\xEF\xF0\xF4\xF5\xFF", 22);
        QList<QByteArray> sequences;
        for (int a = 0; a < 256; ++a) {
            for (int b = 0; b < 256; ++b)
                sequences << QByteArray(1, char(a)) + char(b);
            for (int i = 0; a >= 0xC0 && i < edges.size() * edges.size(); ++i) {
                sequences << char(a) + edges.mid(i / edges.size(), 1) + edges.at(i % edges.size());
                for (char d : edges)
                    sequences << sequences.constLast().left(3) + d;
            }
        }
        for (const QByteArray& b : sequences) {  // with bytes before and after that must not count
            const QByteArray padded = "\xC2\xA0" + b + "\x80\x80\x80";
            if (FifLineCounter::utf16Length(padded.constData() + 2, b.size(), utf8) != QString(decoder.decode(b)).size())
                QFAIL(b.toHex(' ').constData());
        }
        QRandomGenerator random(99);
        for (int round = 0; round < 2000; ++round) {
            QByteArray bytes = randomFile(random);
            if (isWide(bytes))  // long runs of short lines instead
                bytes = QByteArray("ab\r\n").repeated(round);
            FifLineCounter::Counts want;
            for (const QByteArray& line : bytes.split('\n')) {
                ++want.lines;
                want.crlfLines += line.endsWith('\r') ? 1 : 0;
                want.chars += QString(decoder.decode(line.endsWith('\r') ? line.chopped(1) : line)).size();
            }
            bytes = "\r" + bytes + '\n';  // the "\r" before the range is not part of it
            const auto got = FifLineCounter::count(bytes.constData() + 1, bytes.constData() + bytes.size(), utf8);
            QCOMPARE(std::tuple(got.lines, got.chars, got.crlfLines), std::tuple(want.lines, want.chars, want.crlfLines));
        }
    }

    void textTest_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<int>("text");  // -1: as the plain reading has it
        const QByteArray lines19 = QByteArray("line\n").repeated(19), nul(1, '\0');
        QTest::newRow("zero in line 20") << lines19 + "x" + nul << 0;
        QTest::newRow("zero in line 21") << lines19 + "\nx" + nul << 1;
        QTest::newRow("lone CR ends no line") << QByteArray("a\r").repeated(25) + nul << 0;
        QTest::newRow("C2 before newline") << QByteArray("a\xC2\n\x80") << 1;
        QTest::newRow("broken, then C1") << QByteArray("\xE0\xC2\x80") << 0;
        QTest::newRow("UTF-16 zero in line 21") << "\xFF\xFE" + QByteArray("x\0\n\0", 4).repeated(20) + nul + nul << 1;
        QTest::newRow("UTF-32LE zero") << QByteArray("\xFF\xFE\0\0\0\0\0\0", 8) << 0;
        QTest::newRow("UTF-32BE mark cut") << QByteArray("\0\0\xFE", 3) << 0;
        QTest::newRow("long first line") << QByteArray(100000, 'x') + "\x01" << 0;
        QTest::newRow("C1 across the head") << QByteArray(65535, 'x') + "\xC2\x81" << 0;
        for (char16_t u = 1; u < 0x100; ++u)  // the C0 and C1 controls but white space (and U+0085) alone
            QTest::addRow("U+%04X", unsigned(u)) << QString(QChar(u)).toUtf8() << -1;
        QRandomGenerator random(4711);
        const QList<QByteArray> pieces = {"\r", "\r\n", "\t", "\x0B", "\x0C", "\x1C", nul, "\x01", "\x1B", "\x7F",
                                          "\xC2", "\x80", "\x85", "\x9F", "\xA0", "\xE0", "\xE2\x84", "\xFF", "\xC3\xA9"};
        for (int round = 0; round < 1000; ++round) {
            QByteArray bytes;  // mostly plain, so that files reach line 20
            for (int i = random.bounded(60); i > 0; --i)
                bytes += random.bounded(4) ? QByteArray(random.bounded(3) ? "word " : "x\n")
                                           : pieces.at(random.bounded(int(pieces.size())));
            QTest::addRow("random %d", round) << bytes << -1;
        }
        for (int round = 0; round < 100; ++round)  // in every encoding, some beyond the first read
            QTest::addRow("random file %d", round) << randomFile(random).repeated(round % 10 ? 1 : 500) << -1;
    }

    // The text test fed in pieces of any size (and on past its verdict), the worker's test of a real
    // file and the plain reading agree; files of a UTF-16 or UTF-32 mark are left to a QTextStream.
    // The file device gives the file's head and bytes, across the end of the head and every read.
    void textTest()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(int, text);
        const bool expected = text < 0 ? FifReference::isText(bytes) : text;
        QCOMPARE(FifReference::isText(bytes), expected);
        const QString path = dir.filePath("t");
        QVERIFY(FifTest::write(dir.path(), "t", bytes));
        QCOMPARE(FifWorker::isTextFile(QFileInfo(path)), expected);
        for (int piece : {1, 2, 3, 16, 17, 4096, 1 << 20}) {
            FifTextTest test;
            for (qsizetype at = 0; at < bytes.size(); at += piece)
                test.feed(bytes.constData() + at, qMin<qsizetype>(piece, bytes.size() - at));
            const FifTextTest::Verdict verdict = test.finish();
            QCOMPARE(verdict == FifTextTest::OtherEncoding, isWide(bytes));
            QVERIFY(verdict == FifTextTest::OtherEncoding || (verdict == FifTextTest::Text) == expected);
        }
        for (qint64 block : {qint64(7), bigBlock}) {
            FifFileDevice device(path, &lent);
            QVERIFY(!device.open(QIODevice::WriteOnly) && device.open(QIODevice::ReadOnly) && !device.open(QIODevice::ReadOnly));
            QCOMPARE(device.head(), bytes.left(FifFileDevice::headSize));
            const QRegExp rx("x", ci, fixed);
            QCOMPARE(scan(bytes, rx, block, true, 0, noLimit, &device).hits, FifReference::matches(bytes, rx));
        }
        // A folder opens but cannot be read, a missing file not at all.
        QVERIFY(!FifFileDevice(dir.path(), &lent).open(QIODevice::ReadOnly) && lent.isEmpty()
                && !FifFileDevice(dir.filePath("missing")).open(QIODevice::ReadOnly));
    }

    void requiredLiteral_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<int>("type");
        QTest::addColumn<QString>("needle");
        const QList<QStringList> rows = {
            {"foo", "foo"}, {"ab.*cdef", "cdef"}, {"foo.*bar", "foo"}, {"ab+c", "ab"}, {"xyza*bc", "xyz"},
            {"x?yz", "yz"}, {"a{2}bcd", "bcd"}, {"ab{0,3}", "a"}, {"(abc)d", "abc"}, {"(abcd)?ef", "ef"},
            {"(?:abc)de", "abc"}, {"(?=abcd)ef", "ef"}, {"(?!abcd)ef", "ef"}, {"foo\\.bar", "foo.bar"},
            {"\\b(QString)\\b", "QString"}, {"[abc]def", "def"}, {"[\\]x]yz", "yz"}, {"\\d+abc\\s", "abc"},
            {"^abc$", "abc"}, {"abcédef", "abc"}, {"abc|def", ""}, {"x(abc|def)y", ""}, {"[|]abc", ""},
            {"\\x41bc", ""}, {"(a)\\1bc", ""}, {"[]a]bc", ""}, {"[[:alpha:]]bc", ""}, {"ab+?c", ""},
            {"*abc", ""}, {"ab.cd{2", ""}, {"ab{1,x}cd", ""}, {"(ab", ""}, {"", ""}, {"a.b", "a.b", "literal"},
            {"naïve", "", "literal"}, {"foo*barbaz?x", "barbaz", "wildcard"}, {"*", "", "wildcard"}, {"a[b*", "a[b", "wildcard"}};
        for (const QStringList& row : rows) {
            const int type = row.value(2) == "literal" ? fixed : row.value(2) == "wildcard" ? QRegExp::Wildcard : rx2;
            QTest::addRow("%s %s", qPrintable(row.value(2)), qPrintable(row[0])) << row[0] << type << row[1];
        }
    }

    // The ASCII text every match must contain, which lines lacking it are passed over for; none when
    // the expression is not understood.
    void requiredLiteral()
    {
        QFETCH(QString, pattern);
        QFETCH(int, type);
        QFETCH(QString, needle);
        const FifPrefilter prefilter(FifTest::request(pattern, QString(), type, true).getRegExp());
        QCOMPARE(QString::fromLatin1(prefilter.getNeedle()), needle);
        if (type == rx2)
            QCOMPARE(FifPrefilter::requiredLiteral(pattern), needle);
    }

    void asciiMatcher_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<bool>("matchCase");
        QTest::addColumn<bool>("taken");  // translated for PCRE2
        const QList<std::tuple<const char*, bool, bool>> rows = {
            {"Q_[A-Z]+_EXPORT", true, true}, {"[0-9]+\\.[0-9]+\\.[0-9]+", true, true}, {"colou?r", false, true},
            {"^a|b$|\\bk\\w*\\B", false, true}, {"(a|b(?:c|))*d{2}e{1,3}f{,2}g{2,}", false, true},
            {"x(?=ab)(?!abc)[^\\s\\d]", true, true}, {"\\x41\\0102\\t\\.[\\x61-\\x63\\]]", false, true},
            {"[K-k]s{0}.", false, true}, {"[^\\x212a]é", true, true}, {"()|", false, true},
            {"(a)\\1", true, false}, {"\\q", true, false}, {"[]a]", true, false}, {"[[:alpha:]]", true, false},
            {"a(?!\\b)", true, false}, {"(?=^)a", true, false}, {"(?=a)*", true, false}, {"\\x", true, false},
            {"é", false, false}, {"[\\x212a]", false, false}, {"\\0377", false, false}, {"a{1001}", true, false}};
        for (const auto& [pattern, matchCase, taken] : rows)
            QTest::addRow("%s %s", pattern, matchCase ? "case" : "no case") << QString::fromUtf8(pattern) << matchCase << taken;
    }

    // PCRE2's verdict on random lines of ASCII characters is QRegExp's; other lines it leaves to QRegExp.
    void asciiMatcher()
    {
        QFETCH(QString, pattern);
        QFETCH(bool, matchCase);
        QFETCH(bool, taken);
        const QRegExp rx(pattern, matchCase ? cs : ci, rx2);
        const FifAsciiMatcher matcher(rx);
        QCOMPARE(matcher.isActive(), taken);
        QRandomGenerator random(77);
        const QString pieces = "aAbBcdDeEfgkKQrRsSuxX_059.-\\t\r ]()";
        for (int round = 0; round < 3000; ++round) {
            QString line;
            for (int i = random.bounded(12); i > 0; --i)
                line += pieces.at(random.bounded(int(pieces.size())));
            if (round % 10 == 0)
                line.insert(random.bounded(int(line.size()) + 1), QChar(round % 20 ? 0x212A : 0xE9));
            const QByteArray bytes = line.toUtf8();
            const auto verdict = matcher.match(bytes.constData(), bytes.size());
            const bool plain = line.toLatin1() == bytes && taken;
            QVERIFY2(plain ? verdict == (rx.indexIn(line) >= 0 ? FifAsciiMatcher::Match : FifAsciiMatcher::NoMatch)
                           : verdict == FifAsciiMatcher::Unknown, qPrintable(line));
        }
    }

    // Without case QRegExp equates no character beyond ASCII with an ASCII one but U+212A KELVIN SIGN
    // ("k") and U+017F LONG S ("s"): the only ones the prefilter looks for besides its needle.
    void caseFoldingOfQRegExp()
    {
        QString all;
        for (char16_t u = 0x80; u != 0; ++u)
            all.append(QChar(u));
        for (char c = 0x20; c < 0x7F; ++c) {
            for (auto syntax : {fixed, rx2}) {
                QRegExp rx(syntax == rx2 ? QRegExp::escape(QString(QChar(c))) : QString(QChar(c)), ci, syntax);
                QString found;
                for (int at = rx.indexIn(all); at >= 0; at = rx.indexIn(all, at + 1))
                    found.append(all.at(at));
                const char32_t lower = QChar::toLower(char32_t(c));
                QCOMPARE(found, lower == 'k' ? QString(QChar(0x212A)) : lower == 's' ? QString(QChar(0x17F)) : "");
            }
        }
    }
};

QTEST_GUILESS_MAIN(tst_FifScanning)
#include "tst_fifscanning.moc"
