#include "ImageManager.h"

#include <QImage>
#include <QImageReader>
#include <QtTest>

using namespace Gui::Orba;

class tst_ImageManager : public QObject
{
    Q_OBJECT

private slots:
    void svgSupportIsInstalled()
    {
        // Without Qt's SVG plugins every bundled icon would draw nothing.
        QVERIFY(QImageReader::supportedImageFormats().contains("svg"));
    }

    void iconsRender_data()
    {
        QTest::addColumn<QString>("id");
        for (const char* id : {"gui-orba-find-in-files", "gui-orba-show-next-fifhit",
                               "gui-orba-show-previous-fifhit", "gui-orba-show-current-fifhit",
                               "gui-orba-stop-fifjob", "gui-orba-clear-all", "gui-orba-file-save"})
            QTest::newRow(id) << QString(id);
    }

    void iconsRender()
    {
        QFETCH(QString, id);
        const QIcon icon = ImageManager::getInstance()->getIcon(id);
        QVERIFY(!icon.isNull());
        for (int size : {16, 24, 32}) {
            const QPixmap pixmap = icon.pixmap(size, size);
            QVERIFY(!pixmap.isNull());
            QCOMPARE(pixmap.size(), QSize(size, size));
            // Something is drawn, and not over the whole square.
            const QImage image = pixmap.toImage().convertToFormat(QImage::Format_ARGB32);
            int painted = 0;
            for (int y = 0; y < image.height(); ++y)
                for (int x = 0; x < image.width(); ++x)
                    painted += qAlpha(image.pixel(x, y)) > 0 ? 1 : 0;
            QVERIFY2(painted > size * size / 10, qPrintable(QString::number(painted)));
            QVERIFY2(painted < size * size, qPrintable(QString::number(painted)));
        }
    }

    void iconsDiffer()
    {
        const QImage next = ImageManager::getInstance()
                                ->getIcon("gui-orba-show-next-fifhit").pixmap(24).toImage();
        const QImage previous = ImageManager::getInstance()
                                    ->getIcon("gui-orba-show-previous-fifhit").pixmap(24).toImage();
        QVERIFY(next != previous);
    }

    void unknownIdGivesEmptyIcon()
    {
        QVERIFY(ImageManager::getInstance()->getIcon("gui-orba-no-such-icon").isNull());
        QVERIFY(ImageManager::getInstance()->getIcon(QString()).isNull());
        QVERIFY(ImageManager::getInstance()->getIcon("../help/index").isNull());
    }
};

QTEST_MAIN(tst_ImageManager)
#include "tst_imagemanager.moc"
