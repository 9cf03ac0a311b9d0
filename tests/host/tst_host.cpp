// The host layer through real files, widgets and modal dialogs.

#include "ActionHandler.h"
#include "Dialog.h"
#include "FifTest.h"
#include "HelpManager.h"
#include "ImExportDialog.h"
#include "ImageManager.h"
#include "MainWindow.h"
#include <QtWidgets>
#include <csignal>
#include <sys/resource.h>

using namespace Gui::Orba;

static QByteArray contents(const QString& fileName)
{
    QFile file(fileName);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("(unreadable)");
}

static bool shown(QWidget* widget)
{
    widget->show();
    QApplication::setActiveWindow(widget);
    return QTest::qWaitForWindowActive(widget);
}

struct Recorder : ActionHandler {
    bool doAction() override { return triggered << qobject_cast<QAction*>(sender()), true; }
    void updateAction(QAction* action) override { updated << action, delete victim; }
    QList<QAction*> triggered, updated;
    QPointer<QAction> victim; // deleted by the first update
};

class tst_Host : public QObject
{
    Q_OBJECT
private slots:
    // On a new file, a damaged one (kept aside, its readable values kept), in memory or unwritable:
    // each value comes back with its type, or the default; from the files, in a new store too.
    void settings() {
        const QVariantList values{QStringList{"a, b", ""}, QStringList(), true, 0, 2.5,
                                  QString("true"), QString("Grüße ✓"), QByteArray("\x01\xff", 2)};
        const QByteArray damaged("[ok]\nkeep=yes\n[FindBar\nx=1\n");
        QTemporaryDir dir;
        QVERIFY(FifTest::write(dir.path(), "f", "x") && FifTest::write(dir.path(), "d", damaged));
        Settings memory, file(dir.filePath("new/s.ini")), lost(dir.filePath("f/s.ini"));
        Settings repaired(dir.filePath("d"));
        for (int i = 0; i < values.size(); ++i)
            for (Settings* store : {&file, &repaired, &memory, &lost})
                store->setValue(QString("/a//b/%1").arg(i), values[i]);
        file.sync(), repaired.sync(), lost.sync();
        Settings fresh(FifTest::freshCopy(file.getFileName()));
        Settings freshRepaired(FifTest::freshCopy(repaired.getFileName()));
        for (const Settings* store : {&fresh, &freshRepaired, &memory, &lost})
            for (int i = 0; i <= values.size(); ++i) {
                const QVariant read = store->getValue(QString("a/b/%1").arg(i), 5);
                QVERIFY2(read.typeId() == values.value(i, 5).typeId() && read == values.value(i, 5),
                         qPrintable(read.toString()));
            }
        QCOMPARE(contents(dir.filePath("d.corrupt")) + contents(dir.filePath("f")), damaged + "x");
        QCOMPARE(freshRepaired.getValue("ok/keep"), QVariant("yes"));
        QVERIFY(file.isPersistent() && repaired.isPersistent() && !memory.isPersistent()
                && !lost.isPersistent());
    }
    // Each dialog opens where it was last closed.
    void dialogGeometryIsKept() {
        Settings settings;
        const QRect placed(40, 50, 321, 234), other(10, 20, 100, 80);
        for (int i = 0; i < 3; ++i) { // placed, the same again, another
            Dialog dialog(nullptr, &settings, i < 2 ? "placed" : "other", false);
            dialog.setGeometry(other);
            QVERIFY(shown(&dialog));
            QTRY_COMPARE(dialog.geometry(), i == 1 ? placed : other);
            dialog.setGeometry(placed);
            QTRY_COMPARE(dialog.geometry(), placed);
            dialog.reject();
        }
    }
    // Bundled pages shown by topic and by F1 on a widget or its children;
    // bundled icons drawn.
    void helpAndIcons() {
        HelpManager* help = HelpManager::getInstance();
        const auto page = [help] { return help->getHelpWindow()->source().toString(); };
        for (const QString topic : {"index", "find-in-files-dialog", "find-in-files-results"})
            QVERIFY(help->showHelp(topic) && page() == "qrc:/help/" + topic + ".html");
        delete help->getHelpWindow();
        QWidget view;
        help->setHelpForWidget(&view, {}, "find-in-files-results");
        QVERIFY(shown(&view));
        QTest::keyClick(new QLineEdit(&view), Qt::Key_F1);
        QCOMPARE(page(), QString("qrc:/help/find-in-files-results.html"));
        for (const char* id : {"find-in-files", "show-next-fifhit", "show-previous-fifhit",
                               "show-current-fifhit", "stop-fifjob", "clear-all", "file-save"}) {
            const QImage alpha = ImageManager::getInstance()->getIcon(QString("gui-orba-") + id)
                                     .pixmap(24).toImage().convertToFormat(QImage::Format_Alpha8);
            const auto painted = 24 * 24 - std::count(alpha.bits(), alpha.bits() + 24 * 24, 0);
            QVERIFY2(painted > 24 * 24 / 10 && painted < 24 * 24, id); // drawn, not a square
            // Made once: a second request shares the first's engine and its cached pixmaps.
            QCOMPARE(ImageManager::getInstance()->getIcon(QString("gui-orba-") + id).cacheKey(),
                     ImageManager::getInstance()->getIcon(QString("gui-orba-") + id).cacheKey());
        }
    }
    // Written in full, or a failure reported with the earlier file kept as it
    // was: writes fail for real past the file size this process may write.
    void exportIsAllOrNothing() {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("hits.txt");
        QVERIFY(FifTest::write(dir.path(), "hits.txt", "an earlier file, longer than the new\n"));
        QStringListModel model({"a.txt (1): alpha", "ü.txt (12): Grüße ✓", ""});
        QString text;
        QVERIFY(ImExportDialog::writeText(model, fileName, nullptr));
        const QByteArray written = contents(fileName);
        QCOMPARE(written, model.stringList().join('\n').toUtf8() + '\n');
        model.setStringList(QStringList(500, "f.cpp (1): a line that was found"));
        auto answered = FifTest::answer<QMessageBox>([&](QMessageBox* box) {
            text = box->windowTitle() + ": " + box->text();
            box->close();
        });
        rlimit unlimited{}, lowered{1024, RLIM_INFINITY};
        std::signal(SIGXFSZ, SIG_IGN);
        QVERIFY(getrlimit(RLIMIT_FSIZE, &unlimited) == 0 && setrlimit(RLIMIT_FSIZE, &lowered) == 0);
        const bool ok = ImExportDialog::exportDialog(model, {}, ImExportDialog::TextFormat, nullptr,
                                                     fileName, nullptr);
        setrlimit(RLIMIT_FSIZE, &unlimited);
        QVERIFY(!ok && *answered);
        QVERIFY2(text.startsWith("Export Failed: ") && text.contains(fileName), qPrintable(text));
        QCOMPARE(contents(fileName), written);
    }
    // The main window holding a widget; else the active one, else the newest one alive.
    void mainWindowLookup() {
        auto first = std::make_unique<MainWindow>(), second = std::make_unique<MainWindow>();
        auto* dialog = new QDialog(first.get());
        QWidget other;
        QCOMPARE(MainWindow::getInstance(new QLineEdit(dialog)), first.get());
        QCOMPARE(MainWindow::getInstance(new QLineEdit(&other)), nullptr);
        for (QWidget* active : {(QWidget*)first.get(), (QWidget*)dialog, &other}) {
            QVERIFY(shown(active));
            QCOMPARE(MainWindow::getInstance(), active == &other ? second.get() : first.get());
        }
        second.reset();
        QCOMPARE(MainWindow::getInstance(), first.get());
        first.reset();
        QCOMPARE(MainWindow::getInstance(), nullptr);
    }
    // Actions destroyed, deleted while updated, or outliving their handler.
    void actionHandlerLifetimes() {
        QAction outlived, first;
        auto* handler = new Recorder;
        auto *second = new QAction, *gone = new QAction;
        for (QAction* action : {&first, second, &first, (QAction*)nullptr, gone, &outlived})
            handler->addAction(action);
        delete gone;
        handler->victim = second;
        handler->updateActions();
        first.trigger();
        QCOMPARE(handler->updated, (QList<QAction*>{&first, &outlived}));
        QCOMPARE(handler->triggered, QList<QAction*>{&first});
        QCOMPARE(handler->getActions(), (QList<QAction*>{&first, &outlived}));
        delete handler;
        outlived.trigger(); // reaches no handler
    }
};

FIF_HOST_TEST_MAIN(tst_Host)
#include "tst_host.moc"
