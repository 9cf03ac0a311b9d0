#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"

#include <QAbstractItemModelTester>
#include <QDir>
#include <QSignalSpy>
#include <QtTest>

using namespace Gui::Orba;

class tst_FifHitsModel : public QObject
{
    Q_OBJECT

private:
    FifManager manager;
    FifJob* job = nullptr;

    FifHitsModel* freshModel()
    {
        auto* model = new FifHitsModel(job);
        new QAbstractItemModelTester(model, QAbstractItemModelTester::FailureReportingMode::QtTest,
                                     model);
        return model;
    }

    FifHit hit(int line, const QString& text = QStringLiteral("line"))
    {
        return FifHit("src/a.txt", line, text, 0, 0, job);
    }

private slots:
    void init()
    {
        FifInput input;
        input.what = "abc";
        input.where = "src";
        job = manager.getJob(0);
        // The job's request names the search in the header.
        QVERIFY(job->start(input));
        QVERIFY(job->wait(5000));
    }

    void emptyModel()
    {
        FifHitsModel* model = freshModel();
        QCOMPARE(model->rowCount(), 0);
        QCOMPARE(model->headerData(0, Qt::Horizontal).toString(),
                 QStringLiteral("No Search Results"));
        QCOMPARE(model->headerData(0, Qt::Vertical).toString(), QStringLiteral("0"));
        QCOMPARE(model->headerData(4, Qt::Vertical).toString(), QStringLiteral("4"));
        QVERIFY(!model->headerData(0, Qt::Horizontal, Qt::ToolTipRole).isValid());
        delete model;
    }

    void roles()
    {
        FifHitsModel* model = freshModel();
        QVERIFY(model->insertRows(0, 1));
        const QModelIndex index = model->index(0, 0);
        QSignalSpy changed(model, &QAbstractItemModel::dataChanged);
        QVERIFY(model->setData(index, QVariant::fromValue(hit(7, "  x = 1;")), Qt::EditRole));
        QCOMPARE(changed.count(), 1);
        QCOMPARE(model->data(index, Qt::DisplayRole).toString(),
                 QDir::toNativeSeparators("src/a.txt") + " (7):   x = 1;");
        QCOMPARE(model->data(index, Qt::ToolTipRole).toString(), QStringLiteral("  x = 1;"));
        QCOMPARE(model->data(index, Qt::StatusTipRole).toString(), QStringLiteral("  x = 1;"));
        const QVariant user = model->data(index, Qt::UserRole);
        QCOMPARE(user.metaType(), QMetaType::fromType<FifHit>());
        QCOMPARE(user.value<FifHit>().line, 7);
        QVERIFY(!model->data(index, Qt::DecorationRole).isValid());
        QVERIFY(!model->data(QModelIndex(), Qt::DisplayRole).isValid());
        QCOMPARE(model->headerData(0, Qt::Horizontal).toString(),
                 job->getInput().toString());
        QVERIFY(model->headerData(0, Qt::Horizontal).toString().startsWith("Find \"abc\""));
        QVERIFY(!(model->flags(index) & Qt::ItemIsEditable));
        delete model;
    }

    void setDataRules()
    {
        FifHitsModel* model = freshModel();
        model->insertRows(0, 1);
        const QModelIndex index = model->index(0, 0);
        model->setData(index, QVariant::fromValue(hit(1, "kept")), Qt::EditRole);
        QVERIFY(!model->setData(index, QVariant::fromValue(hit(2)), Qt::DisplayRole));
        QVERIFY(!model->setData(QModelIndex(), QVariant::fromValue(hit(2)), Qt::EditRole));
        QCOMPARE(model->data(index, Qt::ToolTipRole).toString(), QStringLiteral("kept"));
        // A value of another type stores an invalid hit, shown as an empty line.
        QVERIFY(model->setData(index, QStringLiteral("text"), Qt::EditRole));
        QCOMPARE(model->data(index, Qt::DisplayRole).toString(), QString());
        delete model;
    }

    void insertAndRemove()
    {
        FifHitsModel* model = freshModel();
        QVERIFY(model->insertRows(0, 5));
        for (int row = 0; row < 5; ++row)
            model->setData(model->index(row, 0), QVariant::fromValue(hit(row)), Qt::EditRole);
        QSignalSpy inserted(model, &QAbstractItemModel::rowsInserted);
        QVERIFY(model->insertRows(5, 2));
        QCOMPARE(inserted.count(), 1);
        QCOMPARE(model->rowCount(), 7);
        QCOMPARE(model->data(model->index(6, 0), Qt::DisplayRole).toString(), QString());
        QVERIFY(!model->data(model->index(6, 0), Qt::UserRole).value<FifHit>().isValid());
        QCOMPARE(model->rowCount(model->index(0, 0)), 0);

        QVERIFY(model->removeRows(1, 2));
        QCOMPARE(model->rowCount(), 5);
        QCOMPARE(model->data(model->index(1, 0), Qt::UserRole).value<FifHit>().line, 3);

        // A span that reaches past the end removes what exists.
        QVERIFY(model->removeRows(3, 10));
        QCOMPARE(model->rowCount(), 3);

        QSignalSpy removed(model, &QAbstractItemModel::rowsRemoved);
        QVERIFY(model->removeRows(0, model->rowCount()));
        QCOMPARE(removed.count(), 1);
        QCOMPARE(model->rowCount(), 0);
        QCOMPARE(model->headerData(0, Qt::Horizontal).toString(),
                 QStringLiteral("No Search Results"));
        delete model;
    }

    void rowPastEndGivesNothing()
    {
        FifHitsModel* model = freshModel();
        model->insertRows(0, 1);
        const QModelIndex index = model->index(0, 0);
        model->removeRows(0, 1);
        QVERIFY(!model->data(index, Qt::DisplayRole).isValid());
        delete model;
    }
};

QTEST_GUILESS_MAIN(tst_FifHitsModel)
#include "tst_fifhitsmodel.moc"
