#include "FifDialog.h"
#include "FifHandler.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "FifResultsDockWidget.h"
#include "FifSettings.h"
#include "FifTest.h"
#include "MainWindow.h"

#include <QtTest>
#include <QtWidgets>

using namespace Gui::Orba;
using FifTest::holdUntilStopped;
using FifTest::items;

FifHitsView* view(QDockWidget* dock) { return qobject_cast<FifHitsView*>(dock->widget()); }

class tst_FifDocks : public QObject
{
    Q_OBJECT

private slots:
    // Two tabbed result docks: the shared commands act on the dock in front, usable while it
    // holds hits or its job runs; closing the only visible dock disables them; destroyed docks
    // are passed over. The find command, usable while the first dock exists, opens the dialog
    // on job 0 with the window's filters and the stored search, as a getInput receiver changed it.
    void sharedCommandsAndTheFindCommand()
    {
        FifHandler handler;
        FifAction find;
        handler.addAction(&find); handler.updateActions();
        QVERIFY(!find.isEnabled()); // no window
        MainWindow window;
        ShowNextFifHitAction next(&window);
        ShowPreviousFifHitAction previous(&window);
        StopFifJobAction stop(&window);
        const auto usable = [&](bool steps, bool stopping) {
            return next.isEnabled() == steps && previous.isEnabled() == steps && stop.isEnabled() == stopping;
        };
        auto *first = new FifResultsDockWidget(&window), *second = new FifResultsDockWidget(&window);
        first->linkSharedActions(&next, &previous, &stop); second->linkSharedActions(&next, &previous, &stop);
        window.tabifyDockWidget(first, second);
        handler.updateActions();
        QVERIFY(find.isEnabled() && usable(false, false));

        QTemporaryDir dir; FifManager* manager = FifManager::getInstance(&window);
        QVERIFY(FifTest::write(dir.path(), "a.txt", "needle 1\nneedle 2\nneedle 3\n"));
        FifJob* other = manager->getJob(1);
        view(second)->setJob(other); FifTest::watch(other->getHitsModel()); window.show();
        QVERIFY(FifTest::run(other, FifTest::request("needle", dir.path())));
        QSignalSpy fromFirst(view(first), &FifHitsView::showHit);
        QSignalSpy fromSecond(view(second), &FifHitsView::showHit);
        // Qt keeps a dock tabbed behind another "visible", moved out of sight.
        const auto raise = [](QDockWidget* front, QDockWidget* back) {
            front->raise();
            return QTest::qWaitFor(
                [=] { return !front->visibleRegion().isEmpty() && back->visibleRegion().isEmpty(); });
        };
        QVERIFY(raise(second, first) && usable(true, false));
        next.trigger();
        QVERIFY(raise(first, second) && usable(false, false));
        QVERIFY(raise(second, first) && usable(true, false));
        next.trigger();
        first->close(); stop.setEnabled(true); second->close();
        QVERIFY(usable(false, false));
        next.setEnabled(true); next.trigger(); // reaches no view
        first->show();
        manager->setFilters({"*.cpp;*.h", "*.txt"});
        Settings* store = ApplicationBase::getInstance()->getSettings();
        store->setValue(FifSettings().getFindWhatKeyPath(), QStringList{"stored"});
        store->setValue(FifSettings().getFilterKeyPath(), QString("*.txt"));
        QString asked;
        connect(&handler, &FifHandler::getInput, this,
                [&](FifInput& input) { asked = input.what; input.what = "needle"; });
        QStringList seen;
        const auto answered = FifTest::answer<FifDialog>([&](FifDialog* dialog) {
            QVERIFY(dialog->parentWidget() == &window && dialog->getJob() == manager->getJob(0));
            for (auto* box : {dialog->findChild<QComboBox*>("what"), dialog->findChild<QComboBox*>("filter")})
                seen << box->currentText() + ":" << items(box);
            dialog->reject();
        });
        window.addAction(&find);
        QVERIFY(QTest::qWaitForWindowActive(&window));
        QTest::keyClick(&window, Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
        QVERIFY(*answered && asked == "stored");
        QCOMPARE(seen, QStringList({"needle:", "stored", "needle", "*.txt:", "*.cpp;*.h", "*.txt"}));

        delete first; handler.updateActions();
        QVERIFY(!find.isEnabled()); // the second dock alone
        second->show();
        QTRY_VERIFY(usable(true, false));
        // A call from no registered dock changes no link and passes the gone dock over.
        QMetaObject::invokeMethod(manager->getActionMapper(), "mapActions", Q_ARG(bool, true));
        previous.trigger();
        QVERIFY(usable(true, false) && fromFirst.isEmpty() && fromSecond.size() == 3);
        holdUntilStopped(other);
        FifTest::EndWatcher end(other);
        QVERIFY(other->start(FifTest::request("needle", dir.path())));
        second->close();
        QVERIFY(usable(false, false));
        second->show();
        QTRY_VERIFY(stop.isEnabled());
        stop.trigger();
        QVERIFY(end.wait() && !stop.isEnabled());
        // customize() takes a shared command back to its first state: disabled.
        next.setEnabled(true); previous.setEnabled(true); stop.setEnabled(true);
        next.customize(); previous.customize(); stop.customize();
        QVERIFY(usable(false, false));
    }
};

FIF_HOST_TEST_MAIN(tst_FifDocks)
#include "tst_fifdocks.moc"
