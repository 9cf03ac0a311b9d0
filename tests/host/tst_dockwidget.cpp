#include "DockWidget.h"
#include "MainWindow.h"

#include <QtTest>

using namespace Gui::Orba;

class tst_DockWidget : public QObject
{
    Q_OBJECT

private slots:
    void dockOfAMainWindow()
    {
        MainWindow window;
        auto* dock = new DockWidget("Find in Files 1", &window, "FifResultsDockWidget");
        QCOMPARE(dock->objectName(), QString("FifResultsDockWidget"));
        window.addDockWidget(Qt::BottomDockWidgetArea, dock);
        QCOMPARE(window.dockWidgetArea(dock), Qt::BottomDockWidgetArea);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        dock->updateActions(false);
        QVERIFY(dock->isVisible());
        QCOMPARE(MainWindow::getInstance(dock), &window);
    }

    void withoutName()
    {
        DockWidget dock("t", nullptr, nullptr);
        QVERIFY(dock.objectName().isEmpty());
        dock.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dock));
        dock.repaint(); // paints through the host's paintEvent
        QVERIFY(dock.isVisible());
    }
};

QTEST_MAIN(tst_DockWidget)
#include "tst_dockwidget.moc"
