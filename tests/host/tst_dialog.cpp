#include "Dialog.h"
#include "HelpManager.h"
#include "IniFiles.h"
#include "Settings.h"

#include <QPushButton>
#include <QTextBrowser>
#include <QtTest>

using namespace Gui::Orba;

class tst_Dialog : public QObject
{
    Q_OBJECT

private slots:
    void construction()
    {
        Settings settings;
        Dialog dialog(nullptr, &settings, "gui-orba-find-in-files-dialog", true);
        QVERIFY(dialog.isModal());
        QCOMPARE(dialog.getGeometryKey(), QString("Dialogs/gui-orba-find-in-files-dialog/Geometry"));
        // Without a name the class names the key; without a store nothing is kept.
        Dialog modeless(nullptr, nullptr, nullptr, false);
        QVERIFY(!modeless.isModal());
        QCOMPARE(modeless.getGeometryKey(), QString("Dialogs/Gui::Orba::Dialog/Geometry"));
        modeless.show();
        QVERIFY(QTest::qWaitForWindowExposed(&modeless));
        modeless.accept();
        QVERIFY(!modeless.isVisible());
    }

    void geometrySurvivesInTheStore()
    {
        QTemporaryDir dir;
        const QString fileName = dir.filePath("settings.ini");
        const QRect placed(40, 50, 321, 234);
        {
            Settings settings(fileName);
            Dialog dialog(nullptr, &settings, "geometry-dialog", false);
            dialog.show();
            QVERIFY(QTest::qWaitForWindowExposed(&dialog));
            dialog.setGeometry(placed);
            QTRY_COMPARE(dialog.geometry(), placed);
            dialog.accept(); // done() keeps the geometry
            QVERIFY(!settings.getValue("Dialogs/geometry-dialog/Geometry").toByteArray().isEmpty());
        }
        Settings fresh(IniFiles::freshCopy(fileName));
        Dialog again(nullptr, &fresh, "geometry-dialog", false);
        again.show();
        QVERIFY(QTest::qWaitForWindowExposed(&again));
        QTRY_COMPARE(again.geometry(), placed);

        // Another dialog keeps its own place.
        Dialog other(nullptr, &fresh, "other-dialog", false);
        other.resize(100, 80);
        other.show();
        QVERIFY(QTest::qWaitForWindowExposed(&other));
        QCOMPARE(other.size(), QSize(100, 80));
    }

    void rejectAlsoKeepsTheGeometry()
    {
        Settings settings;
        Dialog dialog(nullptr, &settings, "rejected", false);
        dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));
        dialog.resize(222, 111);
        QTRY_COMPARE(dialog.size(), QSize(222, 111));
        dialog.reject();
        Dialog again(nullptr, &settings, "rejected", false);
        again.show();
        QVERIFY(QTest::qWaitForWindowExposed(&again));
        QTRY_COMPARE(again.size(), QSize(222, 111));
    }

    void helpButtonShowsTheTopic()
    {
        Dialog dialog(nullptr, nullptr, "help-dialog", false);
        auto* button = new QPushButton("Help", &dialog);
        dialog.setHelpTopic("find-in-files-dialog");
        dialog.setHelpButton(button);
        dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));

        QTest::mouseClick(button, Qt::LeftButton);
        QTextBrowser* help = HelpManager::getInstance()->getHelpWindow();
        QVERIFY(help);
        QVERIFY(help->isVisible());
        QCOMPARE(help->source(), QUrl("qrc:/help/find-in-files-dialog.html"));
        QCOMPARE(help->documentTitle(), QString("The Find in Files Dialog"));
        QVERIFY(help->toPlainText().contains("Find what"));
        help->close();
    }

    void helpButtonVisibility()
    {
        Dialog dialog(nullptr, nullptr, "help-visibility", false);
        QVERIFY(dialog.isHelpButtonVisible());
        dialog.setHelpButtonVisibility(false);
        QVERIFY(!dialog.isHelpButtonVisible());
        // A button given later follows the setting.
        auto* button = new QPushButton("Help", &dialog);
        dialog.setHelpButton(button);
        dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));
        QVERIFY(!button->isVisible());
        dialog.setHelpButtonVisibility(true);
        QVERIFY(button->isVisible());
    }

    void replacedHelpButtonIsLetGo()
    {
        Dialog dialog(nullptr, nullptr, "help-replaced", false);
        dialog.setHelpTopic("find-in-files-results");
        auto* first = new QPushButton("Old", &dialog);
        auto* second = new QPushButton("New", &dialog);
        dialog.setHelpButton(first);
        dialog.setHelpButton(second);
        if (QTextBrowser* help = HelpManager::getInstance()->getHelpWindow())
            delete help;
        first->click();
        QVERIFY(!HelpManager::getInstance()->getHelpWindow());
        second->click();
        QTextBrowser* help = HelpManager::getInstance()->getHelpWindow();
        QVERIFY(help);
        QCOMPARE(help->source(), QUrl("qrc:/help/find-in-files-results.html"));
        delete help;
    }
};

QTEST_MAIN(tst_Dialog)
#include "tst_dialog.moc"
