#include "FifHandler.h"
#include "FifResultsDockWidget.h"
#include "FifUiTest.h"
#include "MainWindow.h"

// A main window with the host's shared commands and its two result docks, tabbed.
struct Window
{
    Window()
    {
        for (FifResultsDockWidget* dock : {first, second})
            dock->linkSharedActions(&next, &previous, &stop);
        window.tabifyDockWidget(first, second);
    }
    FifHitsView* view(QDockWidget* dock) const { return qobject_cast<FifHitsView*>(dock->widget()); }
    bool usable(bool steps, bool stopping) const
    {
        return next.isEnabled() == steps && previous.isEnabled() == steps && stop.isEnabled() == stopping;
    }

    MainWindow window;
    ShowNextFifHitAction next{&window};
    ShowPreviousFifHitAction previous{&window};
    StopFifJobAction stop{&window};
    FifResultsDockWidget* first = new FifResultsDockWidget(&window);
    FifResultsDockWidget* second = new FifResultsDockWidget(&window);
    FifManager* manager = FifManager::getInstance(&window);
};

class tst_FifDocks : public QObject
{
    Q_OBJECT

private slots:
    // The shared commands act on the dock in front and are usable while it
    // holds hits, or while its job runs; they move with the tab. Closing the
    // only visible dock disables them; destroyed docks are passed over.
    void sharedCommandsFollowTheDockInFront()
    {
        QTemporaryDir dir;
        QVERIFY(FifTest::write(dir.path(), "a.txt", "needle 1\nneedle 2\n"));
        Window w;
        QVERIFY(w.usable(false, false));
        FifJob* other = w.manager->getJob(1);
        w.view(w.second)->setJob(other);
        FifTest::watch(other->getHitsModel());
        w.window.show();
        QVERIFY(FifTest::run(other, FifTest::request("needle", dir.path())));
        QSignalSpy fromFirst(w.view(w.first), &FifHitsView::showHit);
        QSignalSpy fromSecond(w.view(w.second), &FifHitsView::showHit);
        // Qt keeps a dock tabbed behind another "visible", moved out of sight.
        const auto raise = [](QDockWidget* front, QDockWidget* back) {
            front->raise();
            return QTest::qWaitFor([=] { return !front->visibleRegion().isEmpty() && back->visibleRegion().isEmpty(); });
        };
        QVERIFY(raise(w.second, w.first) && w.usable(true, false));
        w.next.trigger();
        QVERIFY(raise(w.first, w.second) && w.usable(false, false));
        QVERIFY(raise(w.second, w.first) && w.usable(true, false));
        w.next.trigger();
        w.first->close();
        w.stop.setEnabled(true);
        w.second->close();
        QVERIFY(w.usable(false, false));
        w.next.setEnabled(true);
        w.next.trigger(); // reaches no view
        delete w.first;
        w.second->show();
        QTRY_VERIFY(w.usable(true, false));
        // A call from no registered dock changes no link and passes the gone dock over.
        QMetaObject::invokeMethod(w.manager->getActionMapper(), "mapActions", Q_ARG(bool, true));
        QVERIFY(w.usable(true, false));
        w.previous.trigger();
        QStringList lines;
        for (const QList<QVariant>& signal : fromSecond)
            lines << signal.at(0).value<FifHit>().text;
        QVERIFY(fromFirst.isEmpty() && lines == QStringList({"needle 1", "needle 2", "needle 1"}));

        holdUntilStopped(other);
        FifTest::EndWatcher end(other);
        QVERIFY(other->start(FifTest::request("needle", dir.path())));
        w.second->close();
        QVERIFY(w.usable(false, false));
        w.second->show();
        QTRY_VERIFY(w.stop.isEnabled());
        w.stop.trigger();
        QVERIFY(end.wait() && !w.stop.isEnabled());
        // customize() takes a shared command back to its first state: disabled.
        for (QAction* command : QList<QAction*>{&w.next, &w.previous, &w.stop})
            command->setEnabled(true);
        w.next.customize();
        w.previous.customize();
        w.stop.customize();
        QVERIFY(w.usable(false, false));
    }

    // The find command is usable while the window has its first dock. From
    // its shortcut it opens the dialog on job 0 of the window with the
    // window's filters and the stored search, as a getInput receiver changed it.
    void theFindCommand()
    {
        FifHandler handler;
        FifAction find;
        handler.addAction(&find);
        handler.updateActions();
        QVERIFY(!find.isEnabled());
        Window w;
        handler.updateActions();
        QVERIFY(find.isEnabled());
        w.manager->setFilters({"*.cpp;*.h", "*.txt"});
        Settings* store = ApplicationBase::getInstance()->getSettings();
        store->setValue(FifSettings().getFindWhatKeyPath(), QStringList{"stored"});
        store->setValue(FifSettings().getFilterKeyPath(), QString("*.txt"));
        QString asked;
        connect(&handler, &FifHandler::getInput, this, [&](FifInput& input) { asked = input.what; input.what = "needle"; });
        QStringList seen;
        const auto answered = FifTest::answer<FifDialog>([&](FifDialog* dialog) {
            QVERIFY(dialog->parentWidget() == &w.window && dialog->getJob() == w.manager->getJob(0));
            for (auto* box : {dialog->findChild<QComboBox*>("what"), dialog->findChild<QComboBox*>("filter")})
                seen << box->currentText() + ":" << items(box);
            dialog->reject();
        });
        w.window.addAction(&find);
        w.window.show();
        QVERIFY(QTest::qWaitForWindowActive(&w.window));
        QTest::keyClick(&w.window, Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
        QVERIFY(*answered && asked == "stored");
        QCOMPARE(seen, QStringList({"needle:", "stored", "needle", "*.txt:", "*.cpp;*.h", "*.txt"}));
        delete w.first;
        handler.updateActions();
        QVERIFY(!find.isEnabled());
    }
};

FIF_HOST_TEST_MAIN(tst_FifDocks)
#include "tst_fifdocks.moc"
