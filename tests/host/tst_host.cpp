// The host layer through real files, widgets and modal dialogs: settings
// store, dialogs, help, icons, export, main window lookup, action handlers.

#include "ActionHandler.h"
#include "Dialog.h"
#include "FifTest.h"
#include "HelpManager.h"
#include "ImExportDialog.h"
#include "ImageManager.h"
#include "MainWindow.h"
#include "String.h"
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

struct Rows : QStringListModel { // tells how far an export read
    using QStringListModel::QStringListModel;
    QVariant data(const QModelIndex& i, int role) const override
    {
        return asked = qMax(asked, i.row() + 1), QStringListModel::data(i, role);
    }
    mutable int asked = 0;
};

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
    // A new store on the same file, and a memory store, give each value back
    // with its type; "/a//b" and "a/b" are one key, "a%2Fb" another.
    void settingsKeepTypes() {
        const QVariantList values{QStringList{"a, b", ""}, QStringList(), true, 0, 2.5,
                                  QString("true"), QString("Grüße ✓"), QByteArray("\x01\xff", 2)};
        QTemporaryDir dir;
        const QString fileName = dir.filePath("new folder/settings.ini");
        auto file = std::make_unique<Settings>(fileName);
        Settings memory;
        for (Settings* store : {file.get(), &memory}) {
            for (int i = 0; i < values.size(); ++i) {
                store->setValue(QString("a%2Fb/%1").arg(i), 12);
                store->setValue(QString("/a//b/%1").arg(i), values[i]);
            }
        }
        file->sync();
        QVERIFY(file->isPersistent());
        file.reset(new Settings(FifTest::freshCopy(fileName)));
        for (const Settings* store : {file.get(), &memory}) {
            for (int i = 0; i < values.size(); ++i) {
                const QVariant read = store->getValue(QString("a/b/%1").arg(i), 5);
                QVERIFY2(read.typeId() == values[i].typeId() && read == values[i], qPrintable(QString::number(i) + (store == &memory ? " memory" : " file")));
                QCOMPARE(store->getValue(QString("a%2Fb/%1").arg(i)), QVariant(12));
            }
            QCOMPARE(store->getValue("a/missing", 5), QVariant(5));
        }
        QVERIFY(!memory.isPersistent() && memory.getFileName().isEmpty());
    }

    // A damaged file is kept aside and what could be read carried over.
    // Where no file can be written the values last for this run.
    void settingsFiles() {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        const QByteArray damaged("[ok]\nkeep=yes\n[FindBar\nx=1\n");
        QVERIFY(FifTest::write(dir.path(), "settings.ini", damaged));
        Settings(fileName).setValue("g/k", QStringList{"session"});
        QCOMPARE(contents(fileName + ".corrupt"), damaged);
        Settings fresh(FifTest::freshCopy(fileName));
        QVERIFY(fresh.isPersistent() && fresh.getValue("ok/keep") == QVariant("yes"));
        QCOMPARE(fresh.getValue("g/k"), QVariant(QStringList{"session"}));
        // A file where the folder should be, a folder where the file should be.
        for (const QString& name : {fileName + "/settings.ini", dir.path()}) {
            Settings store(name);
            store.setValue("g/list", QStringList{"this run"});
            store.sync();
            QVERIFY(!store.isPersistent() && QFileInfo(fileName).isFile());
            QCOMPARE(store.getValue("g/list"), QVariant(QStringList{"this run"}));
        }
    }

    // Each dialog opens where it was last closed.
    void dialogGeometryIsKept() {
        QTemporaryDir dir;
        const QRect placed(40, 50, 321, 234), other(10, 20, 100, 80);
        auto settings = std::make_unique<Settings>(dir.filePath("s.ini"));
        for (int i = 0; i < 3; ++i) { // placed, the same again, another
            Dialog dialog(nullptr, settings.get(), i < 2 ? "placed" : "other", false);
            dialog.setGeometry(other);
            QVERIFY(shown(&dialog));
            QTRY_COMPARE(dialog.geometry(), i == 1 ? placed : other);
            dialog.setGeometry(placed);
            QTRY_COMPARE(dialog.geometry(), placed);
            dialog.reject();
            settings->sync();
            settings.reset(new Settings(FifTest::freshCopy(settings->getFileName())));
        }
    }

    // Bundled pages shown by topic and by F1 on a widget.
    void help() {
        HelpManager* help = HelpManager::getInstance();
        const auto page = [help] { return help->getHelpWindow()->source().toString(); };
        for (const QString topic : {"index", "find-in-files-dialog", "find-in-files-results"}) {
            QVERIFY(help->showHelp(topic));
            QCOMPARE(page(), "qrc:/help/" + topic + ".html");
            QVERIFY(contents(HelpManager::pageForTopic(topic))
                        .contains("<title>" + help->getHelpWindow()->windowTitle().toUtf8() + "</title>"));
        }
        QVERIFY(!help->showHelp("no-such-topic"));
        delete help->getHelpWindow();
        QWidget view, plain;
        help->setHelpForWidget(&view, {}, String::convert(QString("find-in-files-results")));
        QVERIFY(shown(&plain));
        QTest::keyClick(&plain, Qt::Key_F1);
        QVERIFY(!help->getHelpWindow());
        QVERIFY(shown(&view));
        QTest::keyClick(new QLineEdit(&view), Qt::Key_F1); // a child's key reaches the view
        QCOMPARE(page(), QString("qrc:/help/find-in-files-results.html"));
    }

    void iconsRender() {
        QVERIFY(ImageManager::getInstance()->getIcon("gui-orba-no-such-icon").isNull());
        for (const char* id : {"find-in-files", "show-next-fifhit", "show-previous-fifhit",
                               "show-current-fifhit", "stop-fifjob", "clear-all", "file-save"}) {
            const QImage alpha = ImageManager::getInstance()->getIcon(QString("gui-orba-") + id)
                                     .pixmap(24, 24).toImage().convertToFormat(QImage::Format_Alpha8);
            const auto painted = 24 * 24 - std::count(alpha.bits(), alpha.bits() + 24 * 24, 0);
            QVERIFY2(painted > 24 * 24 / 10 && painted < 24 * 24, id); // drawn, not a square
        }
    }

    // Written in full, or a failure reported with the earlier file kept as it
    // was: writes fail for real past the file size this process may write.
    void exportIsAllOrNothing() {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("hits.txt");
        QVERIFY(FifTest::write(dir.path(), "hits.txt", "an earlier file, longer than the new\n"));
        Rows model({"a.txt (1): alpha", "ü.txt (12): Grüße ✓", ""});
        QString saved;
        QVERIFY(ImExportDialog::exportDialog(model, {}, ImExportDialog::TextFormat, nullptr, fileName, &saved));
        const QByteArray written = contents(saved);
        QCOMPARE(written, model.stringList().join('\n').toUtf8() + '\n');
        for (int i = 0; i < 5000; ++i)
            model.setStringList(model.stringList() << QString("f%1.cpp (%1): found").arg(i));
        QString text;
        auto answered = FifTest::answer<QMessageBox>([&](QMessageBox* box) {
            text = box->windowTitle() + ": " + box->text();
            box->close();
        });
        std::signal(SIGXFSZ, SIG_IGN);
        rlimit unlimited{}, lowered{1024, RLIM_INFINITY};
        QVERIFY(getrlimit(RLIMIT_FSIZE, &unlimited) == 0 && setrlimit(RLIMIT_FSIZE, &lowered) == 0);
        const bool ok = ImExportDialog::exportDialog(model, {}, ImExportDialog::TextFormat, nullptr, fileName, &saved);
        setrlimit(RLIMIT_FSIZE, &unlimited);
        QVERIFY(!ok && *answered);
        QVERIFY2(text.startsWith("Export Failed: ") && text.contains(fileName), qPrintable(text));
        QCOMPARE(contents(fileName), written);
        QCOMPARE(QDir(dir.path()).entryList(QDir::Files | QDir::Hidden), QStringList{"hits.txt"});
        QVERIFY2(model.asked < 2500, "the export goes on after a failed write");
    }

    // The window that holds a widget; without one, the active main window,
    // else the newest one alive.
    void mainWindowLookup() {
        auto first = std::make_unique<MainWindow>(), second = std::make_unique<MainWindow>();
        auto* dock = new QDockWidget("dock", first.get());
        dock->setWidget(new QLineEdit);
        dock->setFloating(true);
        auto* dialog = new QDialog(first.get());
        for (QWidget* widget : {dock->widget(), (QWidget*)dialog, (QWidget*)first.get()})
            QCOMPARE(MainWindow::getInstance(widget), first.get());
        QWidget other;
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

    // Actions destroyed, removed or outliving their handler.
    void actionHandlerLifetimes() {
        QAction outlived, first, third;
        auto* handler = new Recorder;
        auto *second = new QAction, *gone = new QAction;
        for (QAction* action : {&first, second, &first, (QAction*)nullptr, gone, &third, &outlived})
            handler->addAction(action);
        delete gone;
        QCOMPARE(handler->getActions(), (QList<QAction*>{&first, second, &third, &outlived}));
        handler->victim = second;
        handler->updateActions();
        QCOMPARE(handler->updated, (QList<QAction*>{&first, &third, &outlived}));
        for (QAction* action : {&third, &third, (QAction*)nullptr})
            handler->removeAction(action);
        for (QAction* action : {&first, &third, &first})
            action->trigger();
        QCOMPARE(handler->triggered, (QList<QAction*>{&first, &first}));
        QCOMPARE(handler->getActions(), (QList<QAction*>{&first, &outlived}));
        delete handler;
        outlived.trigger(); // reaches no handler
        QVERIFY(!ActionHandler().doAction());
    }
};

FIF_HOST_TEST_MAIN(tst_Host)
#include "tst_host.moc"
