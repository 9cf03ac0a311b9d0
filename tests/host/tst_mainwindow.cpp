#include "MainWindow.h"

#include <QDialog>
#include <QDockWidget>
#include <QLineEdit>
#include <QtTest>

#include <memory>

using namespace Gui::Orba;

class tst_MainWindow : public QObject
{
    Q_OBJECT

private:
    static bool activate(QWidget* window)
    {
        window->show();
        window->activateWindow();
        QApplication::setActiveWindow(window);
        return QTest::qWaitForWindowActive(window);
    }

private slots:
    void cleanup()
    {
        // Nothing may outlive a case: later cases count on an empty field.
        QTRY_VERIFY(!MainWindow::getInstance());
    }

    void widgetInsideAWindow()
    {
        MainWindow first;
        MainWindow second;
        auto* central = new QWidget(&first);
        first.setCentralWidget(central);
        auto* edit = new QLineEdit(central);
        auto* dock = new QDockWidget("dock", &first);
        first.addDockWidget(Qt::BottomDockWidgetArea, dock);
        auto* inDock = new QLineEdit(dock);
        dock->setWidget(inDock);
        dock->setFloating(true);
        auto* dialog = new QDialog(&first);

        QCOMPARE(MainWindow::getInstance(edit), &first);
        QCOMPARE(MainWindow::getInstance(central), &first);
        QCOMPARE(MainWindow::getInstance(&first), &first);
        QCOMPARE(MainWindow::getInstance(inDock), &first);
        QCOMPARE(MainWindow::getInstance(dialog), &first);
        QCOMPARE(MainWindow::getInstance(&second), &second);

        QWidget loose;
        QLineEdit child(&loose);
        QMainWindow plain;
        QCOMPARE(MainWindow::getInstance(&child), nullptr);
        QCOMPARE(MainWindow::getInstance(&plain), nullptr);
    }

    void nullGivesTheActiveWindow()
    {
        MainWindow first;
        MainWindow second;
        QVERIFY(activate(&first));
        QCOMPARE(MainWindow::getInstance(), &first);
        QVERIFY(activate(&second));
        QCOMPARE(MainWindow::getInstance(), &second);

        // A dialog of the first window that has the focus speaks for it.
        QDialog dialog(&first);
        QVERIFY(activate(&dialog));
        QCOMPARE(MainWindow::getInstance(), &first);
    }

    void nullWithoutActiveGivesMostRecentAlive()
    {
        auto first = std::make_unique<MainWindow>();
        auto second = std::make_unique<MainWindow>();
        auto third = std::make_unique<MainWindow>();
        // An active window that is no main window's does not count.
        QWidget other;
        QVERIFY(activate(&other));
        QCOMPARE(MainWindow::getInstance(), third.get());
        third.reset();
        QCOMPARE(MainWindow::getInstance(), second.get());
        first.reset();
        QCOMPARE(MainWindow::getInstance(), second.get());
        second.reset();
        QCOMPARE(MainWindow::getInstance(), nullptr);
    }

    void closedWindowIsForgotten()
    {
        auto* window = new MainWindow;
        window->setAttribute(Qt::WA_DeleteOnClose);
        QPointer<MainWindow> guard(window);
        QVERIFY(activate(window));
        QCOMPARE(MainWindow::getInstance(), window);
        window->close();
        QTRY_VERIFY(!guard);
        QCOMPARE(MainWindow::getInstance(), nullptr);
    }
};

QTEST_MAIN(tst_MainWindow)
#include "tst_mainwindow.moc"
