#include "FifDialog.h"
#include "FifHandler.h"
#include "FifJob.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "FifSettings.h"
#include "FindDialogAnswer.h"
#include "HostTestMain.h"
#include "MainWindow.h"

#include <QComboBox>
#include <QPointer>
#include <QTimer>
#include <QtTest>

#include <functional>

using namespace Gui::Orba;

namespace {

Settings* store()
{
    return ApplicationBase::getInstance()->getSettings();
}

QStringList entries(const QComboBox* box)
{
    QStringList list;
    for (int i = 0; i < box->count(); ++i)
        list << box->itemText(i);
    return list;
}

// What the test saw of the find dialog while it was open.
struct DialogSeen
{
    QPointer<FifDialog> dialog;
    QWidget* parent = nullptr;
    FifJob* job = nullptr;
    QString what;
    QStringList whatEntries;
    QString filter;
    QStringList filterEntries;
};

// Runs `action` while a timer waits for the modal find dialog, notes what
// it shows and closes it.
DialogSeen runWithDialog(const std::function<void()>& action)
{
    DialogSeen seen;
    answerFindDialog(action, [&](FifDialog* dialog) {
        seen.dialog = dialog;
        seen.parent = dialog->parentWidget();
        seen.job = dialog->getJob();
        auto* what = dialog->findChild<QComboBox*>("what");
        auto* filter = dialog->findChild<QComboBox*>("filter");
        if (what) {
            seen.what = what->currentText();
            seen.whatEntries = entries(what);
        }
        if (filter) {
            seen.filter = filter->currentText();
            seen.filterEntries = entries(filter);
        }
    });
    return seen;
}

} // namespace

class tst_FifHandler : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        // Forget what earlier cases stored.
        const FifSettings keys;
        for (const QString& key :
             {keys.getFindWhatKeyPath(), keys.getMatchCaseKeyPath(), keys.getMatchWordKeyPath(),
              keys.getMatchTypeKeyPath(), keys.getWhereKeyPath(), keys.getFilterKeyPath(),
              keys.getIncludeSubFolderKeyPath()})
            store()->setValue(key, QVariant());
    }

    void identity()
    {
        QObject owner;
        auto* handler = new FifHandler(&owner);
        QCOMPARE(FifHandler::Name(), QString("find-in-files"));
        QCOMPARE(FifHandler::Name(), FifAction::Name());
        QCOMPARE(handler->objectName(), QString("find-in-files"));
        QCOMPARE(handler->parent(), &owner);
        QCOMPARE(handler->metaObject()->className(), "Gui::Orba::FifHandler");
        QVERIFY(handler->metaObject()->indexOfSignal("getInput(Gui::Orba::FifInput&)") >= 0);
    }

    void updateActionIgnoresNull()
    {
        MainWindow window;
        FifHandler handler;
        handler.updateAction(nullptr); // must simply return
        QVERIFY(!window.findChild<FifResultsDockWidget*>());
    }

    // Disabled without the first dock, enabled with it; setEnabled is only
    // called when the state changes.
    void updateActionFollowsFirstDock()
    {
        MainWindow window;
        FifHandler handler;
        FifAction action;
        QSignalSpy enabledChanges(&action, &QAction::enabledChanged);
        QSignalSpy changes(&action, &QAction::changed);

        handler.updateAction(&action);
        QVERIFY(!action.isEnabled());
        QCOMPARE(enabledChanges.count(), 1);
        QCOMPARE(changes.count(), 1);
        handler.updateAction(&action);
        handler.updateAction(&action);
        QCOMPARE(enabledChanges.count(), 1);
        QCOMPARE(changes.count(), 1);

        auto* dock = new FifResultsDockWidget(&window);
        handler.updateAction(&action);
        QVERIFY(action.isEnabled());
        QCOMPARE(enabledChanges.count(), 2);
        QCOMPARE(changes.count(), 2);
        handler.updateAction(&action);
        QCOMPARE(enabledChanges.count(), 2);
        QCOMPARE(changes.count(), 2);

        // A dock under the second name alone does not count.
        auto* second = new FifResultsDockWidget(&window);
        QCOMPARE(second->objectName(), FifResultsDockWidget::Results2ObjectName());
        delete dock;
        handler.updateAction(&action);
        QVERIFY(!action.isEnabled());
        QCOMPARE(enabledChanges.count(), 3);
    }

    // The host's refresh of all registered actions goes through updateAction.
    void updateActionsOfRegisteredActions()
    {
        MainWindow window;
        FifHandler handler;
        FifAction action;
        handler.addAction(&action);
        handler.updateActions();
        QVERIFY(!action.isEnabled());
        new FifResultsDockWidget(&window);
        handler.updateActions();
        QVERIFY(action.isEnabled());
    }

    // The dialog runs modal on job 0 of the current main window, with the
    // window as parent; with no filters the request's filter is "*".
    void doActionOpensDialogOnJobZero()
    {
        MainWindow window;
        new FifResultsDockWidget(&window);
        FifHandler handler;
        FifJob* job = FifManager::getInstance(&window)->getJob(0);
        bool result = false;
        const DialogSeen seen = runWithDialog([&] { result = handler.doAction(); });
        QVERIFY(result);
        QVERIFY(seen.dialog.isNull()); // destroyed when doAction returns
        QCOMPARE(seen.parent, &window);
        QCOMPARE(seen.job, job);
        QCOMPARE(seen.filterEntries, QStringList{"*"});
        QCOMPARE(seen.filter, QString("*"));
        QVERIFY(!job->isRunning());
    }

    // The command triggered through the host's action reaches doAction.
    void triggerOpensDialog()
    {
        MainWindow window;
        new FifResultsDockWidget(&window);
        FifHandler handler;
        FifAction action;
        handler.addAction(&action);
        const DialogSeen seen = runWithDialog([&] { action.trigger(); });
        QCOMPARE(seen.parent, &window);
    }

    // Registered filters fill the filter box; the first one, overwritten by
    // a stored filter, is the request's.
    void filtersAndStoredRequest()
    {
        MainWindow window;
        new FifResultsDockWidget(&window);
        FifManager::getInstance(&window)->setFilters({"*.cpp;*.h", "*.txt"});
        FifHandler handler;

        DialogSeen seen = runWithDialog([&] { handler.doAction(); });
        QCOMPARE(seen.filterEntries, (QStringList{"*.cpp;*.h", "*.txt"}));
        QCOMPARE(seen.filter, QString("*.cpp;*.h"));

        const FifSettings keys;
        store()->setValue(keys.getFindWhatKeyPath(), QStringList{"foo", "bar"});
        store()->setValue(keys.getFilterKeyPath(), QString("*.md"));
        seen = runWithDialog([&] { handler.doAction(); });
        QCOMPARE(seen.what, QString("foo"));
        QCOMPARE(seen.filterEntries, (QStringList{"*.cpp;*.h", "*.txt", "*.md"}));
        QCOMPARE(seen.filter, QString("*.md"));
    }

    // getInput comes synchronously after the filters are set and before the
    // dialog is filled; a direct receiver's change shows in the dialog.
    void getInputChangesTheRequest()
    {
        MainWindow window;
        new FifResultsDockWidget(&window);
        FifManager::getInstance(&window)->setFilters({"*.txt", "*.log"});
        store()->setValue(FifSettings().getFindWhatKeyPath(), QStringList{"stored"});
        FifHandler handler;

        int calls = 0;
        QString requestSeen;
        QStringList filterBoxSeen;
        bool dialogWasModal = true;
        connect(&handler, &FifHandler::getInput, this,
                [&](FifInput& input) {
                    ++calls;
                    requestSeen = input.what;
                    dialogWasModal = QApplication::activeModalWidget() != nullptr;
                    if (auto* dialog = window.findChild<FifDialog*>()) {
                        if (auto* filter = dialog->findChild<QComboBox*>("filter"))
                            filterBoxSeen = entries(filter);
                    }
                    input.what = "needle";
                    input.filter = "*.cfg";
                },
                Qt::DirectConnection);

        const DialogSeen seen = runWithDialog([&] { handler.doAction(); });
        QCOMPARE(calls, 1);
        QCOMPARE(requestSeen, QString("stored")); // the stored entries came first
        QVERIFY(!dialogWasModal);
        QCOMPARE(filterBoxSeen, (QStringList{"*.txt", "*.log"})); // not yet filled
        QCOMPARE(seen.what, QString("needle"));
        QCOMPARE(seen.whatEntries, (QStringList{"stored", "needle"}));
        QCOMPARE(seen.filter, QString("*.cfg"));
    }
};

FIF_HOST_TEST_MAIN(tst_FifHandler)
#include "tst_fifhandler.moc"
