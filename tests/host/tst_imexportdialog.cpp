#include "ImExportDialog.h"
#include "IniFiles.h"
#include "ModalAnswer.h"

#include <QFileDialog>
#include <QLineEdit>
#include <QMessageBox>
#include <QStandardItemModel>
#include <QtTest>

#include <csignal>
#include <sys/resource.h>

using namespace Gui::Orba;

namespace {

QStandardItemModel* rows(const QStringList& lines, QObject* parent)
{
    auto* model = new QStandardItemModel(parent);
    for (const QString& line : lines)
        model->appendRow(new QStandardItem(line));
    return model;
}

// Lowers the largest file size this process may write, for the length of a
// scope: a real write failure halfway through, whoever runs the test.
class FileSizeLimit
{
public:
    explicit FileSizeLimit(rlim_t bytes)
    {
        std::signal(SIGXFSZ, SIG_IGN);
        getrlimit(RLIMIT_FSIZE, &saved);
        rlimit lowered = saved;
        lowered.rlim_cur = bytes;
        ok = setrlimit(RLIMIT_FSIZE, &lowered) == 0;
    }
    ~FileSizeLimit() { setrlimit(RLIMIT_FSIZE, &saved); }
    bool ok = false;

private:
    rlimit saved{};
};

} // namespace

class tst_ImExportDialog : public QObject
{
    Q_OBJECT

private slots:
    void writesEachRowAsAUtf8Line()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("hits.txt");
        auto* model = rows({"a.txt (1): alpha", QString::fromUtf8("dir/ü.txt (12): Grüße ✓"),
                            "b.txt (3): "},
                           this);
        QString saved;
        QVERIFY(ImExportDialog::exportDialog(*model, QString(), ImExportDialog::TextFormat,
                                             nullptr, fileName, &saved));
        QCOMPARE(saved, fileName);
        QCOMPARE(IniFiles::contents(fileName),
                 QByteArray("a.txt (1): alpha\n"
                            "dir/\xc3\xbc.txt (12): Gr\xc3\xbc\xc3\x9f" "e \xe2\x9c\x93\n"
                            "b.txt (3): \n"));
        delete model;
    }

    void replacesAnEarlierFile()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("hits.txt");
        QVERIFY(IniFiles::write(fileName, "old contents that are longer\n"));
        auto* model = rows({"new"}, this);
        QVERIFY(ImExportDialog::writeText(*model, fileName, nullptr));
        QCOMPARE(IniFiles::contents(fileName), QByteArray("new\n"));
        delete model;
        // No rows make an empty file.
        QStandardItemModel empty;
        QVERIFY(ImExportDialog::writeText(empty, fileName, nullptr));
        QCOMPARE(QFileInfo(fileName).size(), 0);
    }

    void chooserAsksForTheFile()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("chosen.txt");
        auto* model = rows({"x (1): y"}, this);
        QString title;
        QStringList filters;
        auto answered = ModalAnswer::next([&](QWidget* modal) {
            auto* chooser = qobject_cast<QFileDialog*>(modal);
            if (!chooser) {
                modal->close();
                return;
            }
            title = chooser->windowTitle();
            filters = chooser->nameFilters();
            QCOMPARE(chooser->objectName(), QString("ImExportFileDialog"));
            QCOMPARE(chooser->acceptMode(), QFileDialog::AcceptSave);
            chooser->selectFile(fileName);
            static_cast<QDialog*>(chooser)->accept(); // as the Save button does
        });
        QString saved;
        QVERIFY(ImExportDialog::exportDialog(*model, "Save Results", ImExportDialog::TextFormat,
                                             nullptr, QString(), &saved));
        QVERIFY(*answered);
        QCOMPARE(title, QString("Save Results"));
        QCOMPARE(filters, QStringList{"Text files (*.txt)"});
        QCOMPARE(QFileInfo(saved).absoluteFilePath(), QFileInfo(fileName).absoluteFilePath());
        QCOMPARE(IniFiles::contents(fileName), QByteArray("x (1): y\n"));
        delete model;
    }

    void cancelledChooserWritesNothing()
    {
        QTemporaryDir dir;
        auto* model = rows({"x (1): y"}, this);
        auto answered = ModalAnswer::next([](QWidget* modal) { modal->close(); });
        QString saved = "untouched";
        QVERIFY(!ImExportDialog::exportDialog(*model, QString(), ImExportDialog::TextFormat,
                                              nullptr, QString(), &saved));
        QVERIFY(*answered);
        QCOMPARE(saved, QString("untouched"));
        QVERIFY(QDir(dir.path()).isEmpty());
        delete model;
    }

    void unwritablePathIsReported()
    {
        QTemporaryDir dir;
        QVERIFY(IniFiles::write(dir.filePath("blocker"), "a file, not a folder"));
        const QString fileName = dir.filePath("blocker/hits.txt");
        auto* model = rows({"x (1): y"}, this);
        QString boxTitle;
        QString boxText;
        auto answered = ModalAnswer::next([&](QWidget* modal) {
            if (auto* box = qobject_cast<QMessageBox*>(modal)) {
                boxTitle = box->windowTitle();
                boxText = box->text();
                QCOMPARE(box->icon(), QMessageBox::Critical);
            }
            modal->close();
        });
        QString saved = "untouched";
        QVERIFY(!ImExportDialog::exportDialog(*model, QString(), ImExportDialog::TextFormat,
                                              nullptr, fileName, &saved));
        QVERIFY(*answered);
        QCOMPARE(boxTitle, QString("Export Failed"));
        QVERIFY2(boxText.contains(fileName), qPrintable(boxText));
        QCOMPARE(saved, QString("untouched"));
        QCOMPARE(IniFiles::contents(dir.filePath("blocker")), QByteArray("a file, not a folder"));
        delete model;
    }

    void failedWriteKeepsTheEarlierFile()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("hits.txt");
        const QByteArray earlier = "earlier results\n";
        QVERIFY(IniFiles::write(fileName, earlier));
        QStringList many;
        for (int i = 0; i < 2000; ++i)
            many << QString("src/file%1.cpp (%1): a line of text that was found").arg(i);
        auto* model = rows(many, this);

        QString boxTitle;
        auto answered = ModalAnswer::next([&](QWidget* modal) {
            boxTitle = modal->windowTitle();
            modal->close();
        });
        bool written = true;
        {
            FileSizeLimit limit(4096);
            QVERIFY(limit.ok);
            written = ImExportDialog::exportDialog(*model, QString(), ImExportDialog::TextFormat,
                                                   nullptr, fileName, nullptr);
        }
        QVERIFY(!written);
        QVERIFY(*answered);
        QCOMPARE(boxTitle, QString("Export Failed"));
        QCOMPARE(IniFiles::contents(fileName), earlier);
        // No half-written file is left beside it.
        QCOMPARE(QDir(dir.path()).entryList(QDir::Files | QDir::Hidden), QStringList{"hits.txt"});
        delete model;
    }

    void writeTextTellsWhy()
    {
        QTemporaryDir dir;
        QStandardItemModel model;
        QString error;
        QVERIFY(!ImExportDialog::writeText(model, dir.path(), &error)); // a folder
        QVERIFY(!error.isEmpty());
        QVERIFY(QFileInfo(dir.path()).isDir());
    }
};

QTEST_MAIN(tst_ImExportDialog)
#include "tst_imexportdialog.moc"
