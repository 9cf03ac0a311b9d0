#include "FifActions.h"
#include "ImageManager.h"

#include <QtTest>

#include <memory>

using namespace Gui::Orba;

namespace {

std::unique_ptr<QAction> makeCommand(const QString& kind, QObject* parent = nullptr)
{
    if (kind == "find")
        return std::make_unique<FifAction>(parent);
    if (kind == "next")
        return std::make_unique<ShowNextFifHitAction>(parent);
    if (kind == "previous")
        return std::make_unique<ShowPreviousFifHitAction>(parent);
    return std::make_unique<StopFifJobAction>(parent);
}

QString commandName(const QString& kind)
{
    if (kind == "find")
        return FifAction::Name();
    if (kind == "next")
        return ShowNextFifHitAction::Name();
    if (kind == "previous")
        return ShowPreviousFifHitAction::Name();
    return StopFifJobAction::Name();
}

void customize(QAction* action)
{
    if (auto* next = dynamic_cast<ShowNextFifHitAction*>(action))
        next->customize();
    else if (auto* previous = dynamic_cast<ShowPreviousFifHitAction*>(action))
        previous->customize();
    else if (auto* stop = dynamic_cast<StopFifJobAction*>(action))
        stop->customize();
}

} // namespace

class tst_FifActions : public QObject
{
    Q_OBJECT

private slots:
    void commandTable_data()
    {
        QTest::addColumn<QString>("kind");
        QTest::addColumn<QString>("name");
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("toolTip");
        QTest::addColumn<QString>("shortcut");
        QTest::addColumn<QString>("iconId");
        QTest::addColumn<QString>("statusTip");
        QTest::addColumn<bool>("enabled");

        QTest::newRow("find") << "find" << "find-in-files" << "Find in Files"
                              << "Find Text in Files" << "Ctrl+Shift+F"
                              << "gui-orba-find-in-files" << "Find a text pattern in files"
                              << true;
        QTest::newRow("next") << "next" << "show-next-fifhit" << "Show Next Result"
                              << "Next Find in Files Result" << "Ctrl+F8"
                              << "gui-orba-show-next-fifhit"
                              << "Show the next find in files result" << false;
        QTest::newRow("previous") << "previous" << "show-previous-fifhit"
                                  << "Show Previous Result" << "Previous Find in Files Result"
                                  << "Ctrl+Shift+F8" << "gui-orba-show-previous-fifhit"
                                  << "Show the previous find in files result" << false;
        QTest::newRow("stop") << "stop" << "stop-fifjob" << "Stop" << "Stop Find in Files Job"
                              << "" << "gui-orba-stop-fifjob" << "Stop current find in files job"
                              << false;
    }

    // Ids, texts, shortcuts, icons and the enabled state at construction.
    void commandTable()
    {
        QFETCH(QString, kind);
        QFETCH(QString, name);
        QFETCH(QString, text);
        QFETCH(QString, toolTip);
        QFETCH(QString, shortcut);
        QFETCH(QString, iconId);
        QFETCH(QString, statusTip);
        QFETCH(bool, enabled);

        QObject owner;
        const std::unique_ptr<QAction> action = makeCommand(kind, &owner);
        QCOMPARE(commandName(kind), name);
        QCOMPARE(action->objectName(), name);
        QCOMPARE(action->text(), text);
        QCOMPARE(action->toolTip(), toolTip);
        QCOMPARE(action->shortcut(), QKeySequence(shortcut));
        QCOMPARE(action->shortcut().toString(QKeySequence::PortableText), shortcut);
        QCOMPARE(action->statusTip(), statusTip);
        QCOMPARE(action->isEnabled(), enabled);
        QCOMPARE(action->parent(), &owner);
        QCOMPARE(action->icon().isNull(),
                 ImageManager::getInstance()->getIcon(iconId).isNull());
    }

    // The texts are built once and shared: a later instance reads the same.
    void laterInstancesShareTexts_data() { commandTable_data(); }
    void laterInstancesShareTexts()
    {
        QFETCH(QString, kind);
        const std::unique_ptr<QAction> first = makeCommand(kind);
        first->setText("changed on the first instance only");
        const std::unique_ptr<QAction> second = makeCommand(kind);
        const std::unique_ptr<QAction> third = makeCommand(kind);
        QTEST(second->text(), "text");
        QCOMPARE(third->text(), second->text());
        QCOMPARE(third->toolTip(), second->toolTip());
        QCOMPARE(third->shortcut(), second->shortcut());
        QCOMPARE(third->statusTip(), second->statusTip());
    }

    void stopHasNoShortcut()
    {
        StopFifJobAction stop;
        QVERIFY(stop.shortcut().isEmpty());
        QVERIFY(stop.shortcuts().isEmpty());
    }

    // customize() returns an enabled shared command to its constructed state.
    void customizeDisables_data()
    {
        QTest::addColumn<QString>("kind");
        QTest::newRow("next") << "next";
        QTest::newRow("previous") << "previous";
        QTest::newRow("stop") << "stop";
    }
    void customizeDisables()
    {
        QFETCH(QString, kind);
        const std::unique_ptr<QAction> action = makeCommand(kind);
        action->setEnabled(true);
        QVERIFY(action->isEnabled());
        QSignalSpy changes(action.get(), &QAction::enabledChanged);
        customize(action.get());
        QVERIFY(!action->isEnabled());
        QCOMPARE(changes.count(), 1);
        QCOMPARE(changes.first().first().toBool(), false);

        customize(action.get()); // already disabled: stays so
        QVERIFY(!action->isEnabled());
    }

    // The commands are plain actions: no meta-object of their own.
    void noOwnMetaObject()
    {
        FifAction find;
        ShowNextFifHitAction next;
        ShowPreviousFifHitAction previous;
        StopFifJobAction stop;
        for (QAction* action : {static_cast<QAction*>(&find), static_cast<QAction*>(&next),
                                static_cast<QAction*>(&previous), static_cast<QAction*>(&stop)})
            QCOMPARE(action->metaObject(), &QAction::staticMetaObject);
    }

    // The shortcut of a command reaches it from a key press in its window.
    void shortcutTriggers()
    {
        QWidget window;
        auto* next = new ShowNextFifHitAction(&window);
        next->setEnabled(true);
        window.addAction(next);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        window.activateWindow();
        QSignalSpy triggered(next, &QAction::triggered);
        QTest::keyClick(&window, Qt::Key_F8, Qt::ControlModifier);
        QCOMPARE(triggered.count(), 1);
    }
};

QTEST_MAIN(tst_FifActions)
#include "tst_fifactions.moc"
