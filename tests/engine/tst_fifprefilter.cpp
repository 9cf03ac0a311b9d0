#include "FifInput.h"
#include "FifPrefilter.h"

#include <QRandomGenerator>
#include <QtTest>

using namespace Gui::Orba;

namespace {

// The lines of `bytes` as the scan cuts them: at "\n", with the "\r" of
// "\r\n" left out, decoded as UTF-8.
QList<QByteArray> rawLines(const QByteArray& bytes)
{
    QList<QByteArray> lines = bytes.split('\n');
    if (bytes.endsWith('\n') || bytes.isEmpty())
        lines.removeLast();
    return lines;
}

QString lineText(QByteArray line)
{
    if (line.endsWith('\r'))
        line.chop(1);
    return QString::fromUtf8(line);
}

// Numbers (from 0) of the lines that the expression matches.
QList<int> plainMatches(const QByteArray& bytes, QRegExp rx)
{
    QList<int> numbers;
    const QList<QByteArray> lines = rawLines(bytes);
    for (int i = 0; i < lines.size(); ++i) {
        if (rx.indexIn(lineText(lines.at(i)), 0, QRegExp::CaretAtZero) >= 0)
            numbers.append(i);
    }
    return numbers;
}

// The same, matching only the lines that the prefilter leads to.
QList<int> filteredMatches(const QByteArray& bytes, QRegExp rx, int* looked = nullptr)
{
    const FifPrefilter prefilter(rx);
    QList<int> numbers;
    const char* begin = bytes.constData();
    const char* end = begin + bytes.size();
    const char* from = begin;
    FifPrefilter::Cursor cursor;
    int lineNumber = 0;
    const char* counted = begin;
    if (looked)
        *looked = 0;
    while (from < end) {
        const char* candidate = prefilter.find(from, end, cursor);
        if (candidate == end)
            break;
        const char* lineStart = candidate;
        while (lineStart > from && lineStart[-1] != '\n')
            --lineStart;
        const char* lineEnd = static_cast<const char*>(memchr(candidate, '\n', end - candidate));
        if (!lineEnd)
            lineEnd = end;
        lineNumber += int(std::count(counted, lineStart, '\n'));
        counted = lineStart;
        if (looked)
            ++*looked;
        if (rx.indexIn(lineText(QByteArray(lineStart, lineEnd - lineStart)), 0,
                       QRegExp::CaretAtZero)
            >= 0)
            numbers.append(lineNumber);
        from = lineEnd + 1;
    }
    return numbers;
}

QRegExp expression(const QString& what, int type, Qt::CaseSensitivity cs, bool word = false)
{
    FifInput input;
    input.what = what;
    input.matchType = type;
    input.matchCase = cs;
    input.matchWord = word;
    return input.getRegExp();
}

} // namespace

class tst_FifPrefilter : public QObject
{
    Q_OBJECT

private slots:
    void requiredLiteral_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<QString>("literal");
        QTest::newRow("plain") << "foo" << "foo";
        QTest::newRow("longest run") << "ab.*cdef" << "cdef";
        QTest::newRow("first of equals") << "foo.*bar" << "foo";
        QTest::newRow("plus keeps one") << "ab+c" << "ab";
        QTest::newRow("star drops") << "xyza*bc" << "xyz";
        QTest::newRow("question drops") << "x?yz" << "yz";
        QTest::newRow("least one") << "a{2}bcd" << "bcd";
        QTest::newRow("least zero") << "ab{0,3}" << "a";
        QTest::newRow("group") << "(abc)d" << "abc";
        QTest::newRow("optional group") << "(abcd)?ef" << "ef";
        QTest::newRow("non-capturing") << "(?:abc)de" << "abc";
        QTest::newRow("look-ahead") << "(?=abcd)ef" << "ef";
        QTest::newRow("negative look-ahead") << "(?!abcd)ef" << "ef";
        QTest::newRow("escaped dot") << "foo\\.bar" << "foo.bar";
        QTest::newRow("word bounded") << "\\b(QString)\\b" << "QString";
        QTest::newRow("class") << "[abc]def" << "def";
        QTest::newRow("class with bracket") << "[\\]x]yz" << "yz";
        QTest::newRow("classes of letters") << "\\d+abc\\s" << "abc";
        QTest::newRow("anchors") << "^abc$" << "abc";
        QTest::newRow("alternatives") << "abc|def" << "";
        QTest::newRow("alternatives in group") << "x(abc|def)y" << "";
        QTest::newRow("hex escape") << "\\x41bc" << "";
        QTest::newRow("back reference") << "(a)\\1bc" << "";
        QTest::newRow("bracket first") << "[]a]bc" << "";
        QTest::newRow("posix class") << "[[:alpha:]]bc" << "";
        QTest::newRow("double quantifier") << "ab+?c" << "";
        QTest::newRow("dangling quantifier") << "*abc" << "";
        QTest::newRow("non-ascii breaks") << "abcédef" << "abc";
        QTest::newRow("empty") << "" << "";
    }

    void requiredLiteral()
    {
        QFETCH(QString, pattern);
        QFETCH(QString, literal);
        QCOMPARE(FifPrefilter::requiredLiteral(pattern), literal);
    }

    void needleOfRequest_data()
    {
        QTest::addColumn<QString>("what");
        QTest::addColumn<int>("type");
        QTest::addColumn<bool>("word");
        QTest::addColumn<bool>("active");
        QTest::addColumn<QByteArray>("needle");
        QTest::newRow("literal") << "QString" << int(QRegExp::FixedString) << false << true
                                 << QByteArray("QString");
        QTest::newRow("literal word") << "a.b" << int(QRegExp::FixedString) << true << true
                                      << QByteArray("a.b");
        QTest::newRow("wildcard") << "foo*barbaz?x" << int(QRegExp::Wildcard) << false << true
                                  << QByteArray("barbaz");
        QTest::newRow("wildcard star") << "*" << int(QRegExp::Wildcard) << false << false
                                       << QByteArray();
        QTest::newRow("wildcard bracket") << "a[b*" << int(QRegExp::Wildcard) << false << true
                                          << QByteArray("a[b");
        QTest::newRow("regexp") << "fo+bar" << int(QRegExp::RegExp2) << false << true
                                << QByteArray("bar");
        QTest::newRow("non-ascii") << "naïve" << int(QRegExp::FixedString) << false << false
                                   << QByteArray();
        QTest::newRow("alternatives") << "a|b" << int(QRegExp::RegExp2) << false << false
                                      << QByteArray();
        QTest::newRow("invalid") << "(ab" << int(QRegExp::RegExp2) << false << false
                                 << QByteArray();
    }

    void needleOfRequest()
    {
        QFETCH(QString, what);
        QFETCH(int, type);
        QFETCH(bool, word);
        QFETCH(bool, active);
        QFETCH(QByteArray, needle);
        const FifPrefilter prefilter(expression(what, type, Qt::CaseSensitive, word));
        QCOMPARE(prefilter.isActive(), active);
        QCOMPARE(prefilter.getNeedle(), needle);
    }

    // Every non-ASCII character that QRegExp takes for an ASCII one without
    // case must be known to the prefilter: today only U+212A and U+017F.
    void caseFoldingOfQRegExp_data()
    {
        QTest::addColumn<int>("type");
        QTest::newRow("fixed") << int(QRegExp::FixedString);
        QTest::newRow("regexp") << int(QRegExp::RegExp2);
    }

    void caseFoldingOfQRegExp()
    {
        QFETCH(int, type);
        QString all;
        for (int u = 0x80; u < 0x10000; ++u)
            all.append(QChar(char16_t(u)));
        for (int c = 0x20; c < 0x7F; ++c) {
            QString pattern = QString(QChar(char16_t(c)));
            if (type == QRegExp::RegExp2)
                pattern = QRegExp::escape(pattern);
            QRegExp rx(pattern, Qt::CaseInsensitive, QRegExp::PatternSyntax(type));
            QString found;
            for (int at = rx.indexIn(all); at >= 0; at = rx.indexIn(all, at + 1))
                found.append(all.at(at));
            QString expected;
            if (c == 'k' || c == 'K')
                expected = QString(QChar(0x212A));
            else if (c == 's' || c == 'S')
                expected = QString(QChar(0x017F));
            QCOMPARE(found, expected);
        }
    }

    void tricky_data()
    {
        QTest::addColumn<QString>("what");
        QTest::addColumn<int>("type");
        QTest::addColumn<bool>("caseSensitive");
        QTest::addColumn<bool>("word");
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QList<int>>("lines");
        const int fixed = int(QRegExp::FixedString);
        QTest::newRow("kelvin") << "kilo" << fixed << false << false
                                << QByteArray("xx\n\xE2\x84\xAAilo\nKILO\nkil\n")
                                << QList<int>{1, 2};
        QTest::newRow("kelvin with case") << "kilo" << fixed << true << false
                                          << QByteArray("\xE2\x84\xAAilo\nkilo\n")
                                          << QList<int>{1};
        QTest::newRow("long s") << "strasse" << fixed << false << false
                                << QByteArray("\xC5\xBFtra\xC5\xBF\xC5\xBF" "e\nSTRASSE\nstra\n")
                                << QList<int>{0, 1};
        // QRegExp's own engine equates the Kelvin sign with "k" here but
        // not the long s with "s"; the prefilter keeps whatever it decides.
        QTest::newRow("specials in regexp")
            << "ma*sk" << int(QRegExp::RegExp2) << false << false
            << QByteArray("MAAS\xE2\x84\xAA\nmask\nma\xC5\xBFk\nmak\n") << QList<int>{0, 1};
        QTest::newRow("mixed case") << "QString" << fixed << false << false
                                    << QByteArray("qSTRING\nq string\nQStrin\nxQsTrInGx")
                                    << QList<int>{0, 3};
        QTest::newRow("crlf") << "end" << fixed << true << true
                              << QByteArray("the end\r\nendless\r\nend\r\r\n\r\nend")
                              << QList<int>{0, 2, 4};
        QTest::newRow("crlf pieces") << "a\r" << fixed << true << false
                                     << QByteArray("a\r\nba\rc\n") << QList<int>{1};
        QTest::newRow("bom per line") << "abc" << fixed << true << false
                                      << QByteArray("\xEF\xBB\xBF" "abc\n\xEF\xBB\xBF\nab\xEF\xBB\xBF" "c\n")
                                      << QList<int>{0};
        QTest::newRow("invalid utf-8") << "ab" << fixed << false << false
                                       << QByteArray("\xE2\x84" "ab\n\xC0\xC1\n\xFF" "AB\xF0\n")
                                       << QList<int>{0, 2};
        QTest::newRow("wildcard") << "k*t" << int(QRegExp::Wildcard) << false << false
                                  << QByteArray("kit\n\xE2\x84\xAA t\nxt\n") << QList<int>{0, 1};
        QTest::newRow("word") << "int" << fixed << true << true
                              << QByteArray("print\nint x\n(int)\n") << QList<int>{1, 2};
        QTest::newRow("last line without newline") << "zz" << fixed << true << false
                                                   << QByteArray("a\nzz") << QList<int>{1};
    }

    void tricky()
    {
        QFETCH(QString, what);
        QFETCH(int, type);
        QFETCH(bool, caseSensitive);
        QFETCH(bool, word);
        QFETCH(QByteArray, bytes);
        QFETCH(QList<int>, lines);
        const QRegExp rx = expression(what, type,
                                      caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive,
                                      word);
        QVERIFY(FifPrefilter(rx).isActive());
        QCOMPARE(plainMatches(bytes, rx), lines);
        QCOMPARE(filteredMatches(bytes, rx), lines);
    }

    // Random text over an alphabet rich in the troublesome bytes, matched
    // through the prefilter and plainly, must give the same lines.
    void randomEquivalence()
    {
        const QList<QByteArray> pieces = {
            "k",  "K",  "s",  "S",   "i",   "n",   "t",   "in",  "int", "kit", "sk",
            " ",  "_",  "\r", "\n",  "\n",  "\n",  "\t",  "\xE2\x84\xAA", "\xC5\xBF",
            "\xC5", "\xE2\x84", "\xEF\xBB\xBF", "\xC3\xA9", "\xF0\x9F\x98\x80", "\xFF",
            "\x80", "\xC0\x80", "\0", "NT", "Int", "a.b", "*"};
        struct Request
        {
            QString what;
            int type;
        };
        const QList<Request> requests = {
            {"int", QRegExp::FixedString}, {"k", QRegExp::FixedString},
            {"sk", QRegExp::FixedString},  {"kit", QRegExp::FixedString},
            {"in t", QRegExp::FixedString}, {"a.b", QRegExp::FixedString},
            {"i*t", QRegExp::Wildcard},    {"s?k", QRegExp::Wildcard},
            {"in+t", QRegExp::RegExp2},    {"(?:sk)+i", QRegExp::RegExp2},
            {"^int", QRegExp::RegExp2},    {"\\bk\\w*", QRegExp::RegExp2}};
        QRandomGenerator random(20261206);
        int compared = 0;
        int skipped = 0;
        for (int round = 0; round < 600; ++round) {
            QByteArray bytes;
            const int count = int(random.bounded(1, 80));
            for (int i = 0; i < count; ++i)
                bytes += pieces.at(int(random.bounded(pieces.size())));
            for (const Request& request : requests) {
                for (bool cs : {true, false}) {
                    for (bool word : {false, true}) {
                        const QRegExp rx = expression(
                            request.what, request.type,
                            cs ? Qt::CaseSensitive : Qt::CaseInsensitive, word);
                        QVERIFY2(FifPrefilter(rx).isActive(), qPrintable(request.what));
                        int looked = 0;
                        const QList<int> expected = plainMatches(bytes, rx);
                        QCOMPARE(filteredMatches(bytes, rx, &looked), expected);
                        ++compared;
                        skipped += int(rawLines(bytes).size()) - looked;
                    }
                }
            }
        }
        // The prefilter must also pass over lines, or it tests nothing.
        QVERIFY(compared > 0);
        QVERIFY(skipped > compared);
    }

    void inactiveFindsEverything()
    {
        const FifPrefilter prefilter(expression("*", QRegExp::Wildcard, Qt::CaseSensitive));
        QVERIFY(!prefilter.isActive());
        const QByteArray bytes("a\nb\n");
        FifPrefilter::Cursor cursor;
        QCOMPARE(prefilter.find(bytes.constData(), bytes.constData() + 4, cursor),
                 bytes.constData());
    }

    // The Kelvin sign and the long s are found at every place, also cut off
    // at the end of the range.
    void findsSpecialsAtEveryPlace()
    {
        const FifPrefilter prefilter(expression("sk", QRegExp::FixedString, Qt::CaseInsensitive));
        for (const QByteArray& special : {QByteArray("\xE2\x84\xAA"), QByteArray("\xC5\xBF")}) {
            for (int size = 0; size < 40; ++size) {
                for (int at = 0; at < size; ++at) {
                    QByteArray bytes(size, 'a');
                    bytes.replace(at, special.size(), special);
                    bytes.truncate(size);
                    const bool whole = at + special.size() <= size;
                    FifPrefilter::Cursor cursor;
                    const char* begin = bytes.constData();
                    QCOMPARE(prefilter.find(begin, begin + size, cursor) - begin,
                             whole ? at : size);
                }
            }
        }
    }

    // The vector loop and the byte loop meet at every length and alignment.
    void findsAtEveryPlace()
    {
        for (const QByteArray& needle : {QByteArray("q"), QByteArray("qz"), QByteArray("qrsz")}) {
            for (bool cs : {true, false}) {
                const FifPrefilter prefilter(expression(QString::fromLatin1(needle),
                                                        QRegExp::FixedString,
                                                        cs ? Qt::CaseSensitive
                                                           : Qt::CaseInsensitive));
                for (int size = 0; size < 70; ++size) {
                    for (int at = 0; at + needle.size() <= size; ++at) {
                        QByteArray bytes(size, 'a');
                        bytes.replace(at, needle.size(), cs ? needle : needle.toUpper());
                        FifPrefilter::Cursor cursor;
                        const char* begin = bytes.constData();
                        QCOMPARE(prefilter.find(begin, begin + size, cursor) - begin, at);
                    }
                    QByteArray none(size, 'q');
                    FifPrefilter::Cursor cursor;
                    if (needle.size() > 1) {
                        const char* begin = none.constData();
                        QCOMPARE(prefilter.find(begin, begin + size, cursor) - begin, size);
                    }
                }
            }
        }
    }
};

QTEST_MAIN(tst_FifPrefilter)
#include "tst_fifprefilter.moc"
