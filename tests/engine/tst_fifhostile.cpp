// Hostile input: odd trees, odd files, odd names and odd patterns. The engine
// must end every search, read only what a request names, never write, and
// keep its results exact.

#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"
#include "TestTree.h"

#include <QtTest>

using namespace Gui::Orba;

namespace {

QList<FifHit> hitsOf(FifJob* job)
{
    QList<FifHit> hits;
    FifHitsModel* model = job->getHitsModel();
    for (int row = 0; row < model->rowCount(); ++row)
        hits.append(model->data(model->index(row, 0), Qt::UserRole).value<FifHit>());
    return hits;
}

FifInput requestFor(const QString& where, const QString& what,
                    int matchType = QRegExp::FixedString)
{
    FifInput request;
    request.where = where;
    request.what = what;
    request.matchType = matchType;
    return request;
}

} // namespace

class tst_FifHostile : public QObject
{
    Q_OBJECT

private slots:
    void byteOrderMarksInsideText_data();
    void byteOrderMarksInsideText();

private:
    FifManager manager;
};

void tst_FifHostile::byteOrderMarksInsideText_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<int>("line");
    QTest::addColumn<int>("offset");
    QTest::addColumn<int>("rawOffset");
    QTest::addColumn<QString>("text");
    const QString zwnbsp(QChar(0xFEFF));
    // The file's own mark is skipped; a second one is a character of line 1.
    QTest::newRow("utf-8, mark twice") << QByteArray("\xEF\xBB\xBF\xEF\xBB\xBFneedle\n")
                                       << 1 << 1 << 1 << zwnbsp + "needle";
    // Files joined together keep the marks of the later ones at line starts.
    QTest::newRow("utf-8, mark at a line start")
        << QByteArray("\xEF\xBB\xBF" "first\r\n\xEF\xBB\xBFneedle\n") << 2 << 7 << 8
        << zwnbsp + "needle";
    QTest::newRow("utf-16le, mark twice")
        << QByteArray("\xFF\xFE\xFF\xFEn\0e\0e\0d\0l\0e\0", 16) << 1 << 1 << 1
        << zwnbsp + "needle";
    QTest::newRow("utf-16be, mark at a line start")
        << QByteArray("\xFE\xFF\0a\0\n\xFE\xFF\0n\0e\0e\0d\0l\0e", 20) << 2 << 3 << 3
        << zwnbsp + "needle";
}

void tst_FifHostile::byteOrderMarksInsideText()
{
    QFETCH(QByteArray, bytes);
    QTemporaryDir dir;
    QVERIFY(TestTree::write(dir.path(), "marks.txt", bytes));
    FifJob* job = manager.getJob(0);
    FIF_RUN_JOB(job, requestFor(dir.path(), "needle"), 30000);
    const QList<FifHit> hits = hitsOf(job);
    QCOMPARE(hits.size(), 1);
    QTEST(hits.at(0).line, "line");
    QTEST(hits.at(0).offset, "offset");
    QTEST(hits.at(0).rawOffset, "rawOffset");
    QTEST(hits.at(0).text, "text");
}

QTEST_MAIN(tst_FifHostile)
#include "tst_fifhostile.moc"
