#include "ApplicationBase.h"
#include "IniFiles.h"
#include "Settings.h"

#include <QtTest>

using namespace Gui::Orba;

class tst_ApplicationBase : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        QVERIFY(QStandardPaths::isTestModeEnabled());
        QVERIFY(QDir(QStandardPaths::writableLocation(QStandardPaths::AppConfigLocation))
                    .removeRecursively());
    }

    void defaultStoreLivesInTheConfigFolder()
    {
        ApplicationBase* app = ApplicationBase::getInstance();
        QCOMPARE(ApplicationBase::getInstance(), qApp);
        Settings* settings = app->getSettings();
        QVERIFY(settings);
        QCOMPARE(app->getSettings(), settings);
        const QString folder = QStandardPaths::writableLocation(QStandardPaths::AppConfigLocation);
        QCOMPARE(QFileInfo(settings->getFileName()).absolutePath(), QDir(folder).absolutePath());
        QVERIFY(settings->isPersistent());

        settings->setValue("FindBar/Find what", QStringList{"from the application"});
        settings->sync();
        QVERIFY(QFileInfo::exists(settings->getFileName()));
        Settings fresh(IniFiles::freshCopy(settings->getFileName()));
        QCOMPARE(fresh.getValue("FindBar/Find what"), QVariant(QStringList{"from the application"}));
    }

    void givenStoreReplacesTheDefault()
    {
        ApplicationBase* app = ApplicationBase::getInstance();
        Settings* defaultStore = app->getSettings();
        {
            Settings mine;
            app->setSettings(&mine);
            QCOMPARE(app->getSettings(), &mine);
            app->setSettings(nullptr);
        }
        QCOMPARE(app->getSettings(), defaultStore);
        QCOMPARE(defaultStore->getValue("FindBar/Find what"),
                 QVariant(QStringList{"from the application"}));
    }

    void helpFileIsBundled()
    {
        const QString name = ApplicationBase::getHelpFileName();
        QVERIFY(!name.isEmpty());
        const QUrl url(name);
        QCOMPARE(url.scheme(), QString("qrc"));
        QVERIFY(QFile::exists(":" + url.path()));
    }
};

int main(int argc, char** argv)
{
    QStandardPaths::setTestModeEnabled(true);
    QCoreApplication::setOrganizationName("FindInFilesTests");
    QCoreApplication::setApplicationName("tst_applicationbase");
    ApplicationBase app(argc, argv);
    tst_ApplicationBase test;
    QTEST_SET_MAIN_SOURCE_PATH
    return QTest::qExec(&test, argc, argv);
}

#include "tst_applicationbase.moc"
