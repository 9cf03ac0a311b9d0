#include "ApplicationBase.h"
#include "HelpManager.h"
#include "String.h"

#include <QLineEdit>
#include <QRegularExpression>
#include <QTextBrowser>
#include <QtTest>

#include <memory>

using namespace Gui::Orba;

class tst_HelpManager : public QObject
{
    Q_OBJECT

private:
    static QString page(const QString& topic)
    {
        QFile file(HelpManager::pageForTopic(topic));
        if (!file.open(QIODevice::ReadOnly))
            return QString();
        return QString::fromUtf8(file.readAll());
    }

private slots:
    void cleanup()
    {
        delete HelpManager::getInstance()->getHelpWindow();
    }

    void pagesAreBundled_data()
    {
        QTest::addColumn<QString>("topic");
        QTest::addColumn<QString>("title");
        QTest::addColumn<QStringList>("mentions");
        QTest::newRow("index") << "index" << "Find in Files Help" << QStringList{"Ctrl+Shift+F"};
        QTest::newRow("dialog") << "find-in-files-dialog" << "The Find in Files Dialog"
                                << QStringList{"Find what", "Regular Expression"};
        QTest::newRow("results") << "find-in-files-results" << "The Find in Files Results"
                                 << QStringList{"Show Next Result", "Save As..."};
    }

    void pagesAreBundled()
    {
        QFETCH(QString, topic);
        QFETCH(QString, title);
        QFETCH(QStringList, mentions);
        const QString html = page(topic);
        QVERIFY(!html.isEmpty());
        QTextDocument document;
        document.setHtml(html);
        QCOMPARE(document.metaInformation(QTextDocument::DocumentTitle), title);
        const QString text = document.toPlainText();
        for (const QString& mention : mentions)
            QVERIFY2(text.contains(mention), qPrintable(mention));

        // Every link leads to a bundled page.
        const QRegularExpression link("href=\"([^\"#]+)");
        for (auto it = link.globalMatch(html); it.hasNext();) {
            const QString target = it.next().captured(1);
            QVERIFY2(QFile::exists(":/help/" + target), qPrintable(target));
        }
    }

    void showHelpOpensTheWindow()
    {
        HelpManager* manager = HelpManager::getInstance();
        QCOMPARE(HelpManager::getInstance(), manager);
        QVERIFY(manager->showHelp("find-in-files-results"));
        QTextBrowser* window = manager->getHelpWindow();
        QVERIFY(window);
        QVERIFY(window->isVisible());
        QCOMPARE(window->source(), QUrl("qrc:/help/find-in-files-results.html"));
        QCOMPARE(window->windowTitle(), QString("The Find in Files Results"));

        // The same window serves the next topic.
        QVERIFY(manager->showHelp("find-in-files-dialog"));
        QCOMPARE(manager->getHelpWindow(), window);
        QCOMPARE(window->windowTitle(), QString("The Find in Files Dialog"));
    }

    void unknownTopicShowsNothing()
    {
        QVERIFY(!HelpManager::getInstance()->showHelp("no-such-topic"));
        QVERIFY(!HelpManager::getInstance()->getHelpWindow());
    }

    void closedWindowIsMadeAgain()
    {
        HelpManager* manager = HelpManager::getInstance();
        QVERIFY(manager->showHelp("index"));
        QPointer<QTextBrowser> window = manager->getHelpWindow();
        window->close(); // deletes itself
        QTRY_VERIFY(!window);
        QVERIFY(!manager->getHelpWindow());
        QVERIFY(manager->showHelp("index"));
        QVERIFY(manager->getHelpWindow());
    }

    void f1ShowsTheWidgetsTopic()
    {
        HelpManager* manager = HelpManager::getInstance();
        QWidget view;
        auto* edit = new QLineEdit(&view);
        manager->setHelpForWidget(&view, String::convert(ApplicationBase::getHelpFileName()),
                                  String::convert(QString("find-in-files-results")));
        QCOMPARE(manager->getHelpTopic(&view), QString("find-in-files-results"));
        view.show();
        QVERIFY(QTest::qWaitForWindowExposed(&view));

        // F1 in a child that does not use the key reaches the view.
        QTest::keyClick(edit, Qt::Key_F1);
        QVERIFY(manager->getHelpWindow());
        QCOMPARE(manager->getHelpWindow()->source(),
                 QUrl("qrc:/help/find-in-files-results.html"));

        // Registering again changes the topic.
        manager->setHelpForWidget(&view, String::convert(QString()),
                                  String::convert(QString("find-in-files-dialog")));
        QTest::keyClick(&view, Qt::Key_F1);
        QCOMPARE(manager->getHelpWindow()->source(), QUrl("qrc:/help/find-in-files-dialog.html"));
    }

    void f1ElsewhereDoesNothing()
    {
        QWidget plain;
        plain.show();
        QVERIFY(QTest::qWaitForWindowExposed(&plain));
        QTest::keyClick(&plain, Qt::Key_F1);
        QVERIFY(!HelpManager::getInstance()->getHelpWindow());
    }

    void destroyedWidgetIsForgotten()
    {
        HelpManager* manager = HelpManager::getInstance();
        auto widget = std::make_unique<QWidget>();
        const QWidget* address = widget.get();
        manager->setHelpForWidget(widget.get(), String::convert(QString()),
                                  String::convert(QString("find-in-files-dialog")));
        widget.reset();
        QVERIFY(manager->getHelpTopic(address).isEmpty());
    }
};

QTEST_MAIN(tst_HelpManager)
#include "tst_helpmanager.moc"
