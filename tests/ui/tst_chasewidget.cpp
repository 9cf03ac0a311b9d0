#include "ChaseWidget.h"

#include <QAbstractEventDispatcher>
#include <QApplication>
#include <QImage>
#include <QPainter>
#include <QTimerEvent>
#include <QTransform>
#include <QtTest>

using namespace Gui::Orba;

namespace {

const int dotCount = 9;

// The grey of a dot at ring position `index` counted from the brightest.
int shade(int index)
{
    return 255 - index * 28;
}

QImage render(ChaseWidget& widget, QSize size)
{
    widget.resize(size);
    QImage image(size, QImage::Format_ARGB32);
    image.fill(QColor(1, 2, 3));
    widget.render(&image);
    return image;
}

// Where a point of dot `i` lies after the ring's turns; `turn` is -40 for
// left-to-right and +40 for right-to-left.
QPoint ringPoint(QSize size, int i, int turn, qreal radius, qreal across = 0.5)
{
    QTransform t;
    t.translate(size.width() / 2, size.height() / 2);
    t.rotate(turn * (i + 1));
    const QPointF p = t.map(QPointF(radius, across));
    return QPoint(qFloor(p.x()), qFloor(p.y()));
}

// The centre pixel of each dot lies well inside its fill.
QColor dotColour(const QImage& image, int i, int turn)
{
    return image.pixelColor(ringPoint(image.size(), i, turn, 8.5));
}

// The phase that the dots' shades show, or -1 if they fit no phase.
int phaseOf(const QImage& image, int turn = -40)
{
    const QColor first = dotColour(image, 0, turn);
    if (first.red() != first.green() || first.red() != first.blue() || (255 - first.red()) % 28)
        return -1;
    const int phase = (255 - first.red()) / 28;
    for (int i = 0; i < dotCount; ++i) {
        const int value = shade((phase + i) % dotCount);
        if (dotColour(image, i, turn) != QColor(value, value, value))
            return -1;
    }
    return phase;
}

QList<int> timersOf(QObject* object)
{
    QList<int> ids;
    const auto timers = QAbstractEventDispatcher::instance()->registeredTimers(object);
    for (const auto& timer : timers)
        ids << timer.timerId;
    return ids;
}

int intervalOf(QObject* object, int id)
{
    const auto timers = QAbstractEventDispatcher::instance()->registeredTimers(object);
    for (const auto& timer : timers) {
        if (timer.timerId == id)
            return timer.interval;
    }
    return -1;
}

void tick(ChaseWidget& widget, int id)
{
    QTimerEvent event(id);
    QCoreApplication::sendEvent(&widget, &event);
}

// Records the regions that a widget is asked to paint.
class PaintRecorder : public QObject
{
public:
    explicit PaintRecorder(QWidget* widget) { widget->installEventFilter(this); }
    QList<QRegion> regions;

protected:
    bool eventFilter(QObject*, QEvent* event) override
    {
        if (event->type() == QEvent::Paint)
            regions << static_cast<QPaintEvent*>(event)->region();
        return false;
    }
};

} // namespace

class tst_ChaseWidget : public QObject
{
    Q_OBJECT

private slots:
    void cleanup() { QApplication::setLayoutDirection(Qt::LeftToRight); }

    void stillRingUsesThePaletteColours()
    {
        ChaseWidget widget;
        const QImage image = render(widget, QSize(32, 32));
        const QColor window = widget.palette().window().color();
        const QColor dark = widget.palette().dark().color();
        QCOMPARE(image.pixelColor(0, 0), window);
        for (int i = 0; i < dotCount; ++i) {
            QCOMPARE(dotColour(image, i, -40), window);
            // The outline lies on the dot's rim, 6 pixels out from the centre.
            const QColor rim = image.pixelColor(ringPoint(image.size(), i, -40, 6.0, 0.5));
            QVERIFY2(rim != window, qPrintable(QString::number(i)));
            QVERIFY(qAbs(rim.lightness() - window.lightness()) > 0);
            QVERIFY(qAbs(rim.lightness() - dark.lightness())
                    < qAbs(window.lightness() - dark.lightness()));
        }
    }

    void animationPhases()
    {
        ChaseWidget widget;
        QCOMPARE(widget.sizeHint(), QSize(32, 32));
        QVERIFY(timersOf(&widget).isEmpty());
        widget.setAnimated(true);
        const QImage image = render(widget, QSize(32, 32));
        const QList<int> expected{255, 227, 199, 171, 143, 115, 87, 59, 31};
        for (int i = 0; i < dotCount; ++i)
            QCOMPARE(dotColour(image, i, -40), QColor(expected[i], expected[i], expected[i]));

        // Each tick of its own 100 ms timer shifts the shades by one dot.
        const QList<int> timers = timersOf(&widget);
        QCOMPARE(timers.size(), 1);
        QCOMPARE(intervalOf(&widget, timers.first()), 100);
        for (int ticks = 1; ticks <= 10; ++ticks) {
            tick(widget, timers.first());
            QCOMPARE(phaseOf(render(widget, QSize(32, 32))), ticks % dotCount);
        }
        // Ticks of other timers do not; starting again keeps timer and phase.
        const int other = widget.startTimer(100000);
        tick(widget, other);
        widget.killTimer(other);
        widget.setAnimated(true);
        QCOMPARE(timersOf(&widget), timers);
        QCOMPARE(phaseOf(render(widget, QSize(32, 32))), 1);
        // A restart begins again at phase zero.
        widget.setAnimated(false);
        widget.setAnimated(true);
        QCOMPARE(timersOf(&widget).size(), 1);
        QCOMPARE(phaseOf(render(widget, QSize(32, 32))), 0);
        // And the real timer turns it.
        QTRY_VERIFY(phaseOf(render(widget, QSize(32, 32))) > 0);
    }

    void stopping()
    {
        ChaseWidget widget;
        widget.resize(32, 32);
        PaintRecorder recorder(&widget);
        widget.show();
        QVERIFY(QTest::qWaitForWindowExposed(&widget));
        QTRY_VERIFY(!recorder.regions.isEmpty());
        recorder.regions.clear();

        // Stopping a still widget asks for no repaint: only the one-pixel
        // marker below gets painted.
        widget.setAnimated(false);
        widget.update(0, 0, 1, 1);
        QTRY_VERIFY(!recorder.regions.isEmpty());
        QCOMPARE(recorder.regions.first(), QRegion(0, 0, 1, 1));

        // Stopping an animation kills the timer and repaints the still ring.
        widget.setAnimated(true);
        QTRY_VERIFY(recorder.regions.size() > 1);
        recorder.regions.clear();
        widget.setAnimated(false);
        QVERIFY(timersOf(&widget).isEmpty());
        QTRY_VERIFY(!recorder.regions.isEmpty());
        QCOMPARE(recorder.regions.first(), QRegion(widget.rect()));
        const QImage image = render(widget, QSize(32, 32));
        for (int i = 0; i < dotCount; ++i)
            QCOMPARE(dotColour(image, i, -40), widget.palette().window().color());
    }

    void dotsAreFivePixelsWideAndStartSixPixelsOut()
    {
        ChaseWidget widget;
        widget.setAnimated(true);
        const QImage image = render(widget, QSize(32, 32));
        const QColor background = image.pixelColor(0, 0);
        QCOMPARE(image.pixelColor(16, 16), background);
        for (int i = 0; i < dotCount; ++i) {
            const QColor fill(shade(i), shade(i), shade(i));
            // Inside the ring, and beyond the dots' outer rim at 11 pixels.
            QCOMPARE(image.pixelColor(ringPoint(image.size(), i, -40, 4.0)), background);
            QCOMPARE(image.pixelColor(ringPoint(image.size(), i, -40, 13.0)), background);
            // The dot itself reaches from 6 to 11 pixels out, its middle filled.
            QCOMPARE(image.pixelColor(ringPoint(image.size(), i, -40, 8.5, 0.5)), fill);
            QVERIFY(image.pixelColor(ringPoint(image.size(), i, -40, 6.5)) != background);
            QVERIFY(image.pixelColor(ringPoint(image.size(), i, -40, 10.5)) != background);
        }
        // The smaller side sets the ring: a wider widget shows the same ring,
        // moved right by half the extra width.
        QCOMPARE(render(widget, QSize(40, 32)).copy(4, 0, 32, 32), image);
    }

    void pixmapReplacesTheDots()
    {
        QPixmap picture(10, 10);
        picture.fill(Qt::red);
        ChaseWidget widget(nullptr, picture, true);
        for (bool animated : {false, true}) {
            widget.setAnimated(animated);
            const QImage image = render(widget, QSize(32, 32));
            const QColor background = widget.palette().window().color();
            for (int y = 0; y < 32; ++y) {
                for (int x = 0; x < 32; ++x)
                    QCOMPARE(image.pixelColor(x, y), (x < 10 && y < 10) ? QColor(Qt::red) : background);
            }
        }
        // Without the flag, or without a picture, the dots show.
        widget.setPixmapEnabled(false);
        QCOMPARE(phaseOf(render(widget, QSize(32, 32))), 0);
        ChaseWidget nullPicture(nullptr, QPixmap(), true);
        nullPicture.setAnimated(true);
        QCOMPARE(phaseOf(render(nullPicture, QSize(32, 32))), 0);
    }

    void rightToLeftTurnsTheOtherWay()
    {
        ChaseWidget leftToRight;
        leftToRight.setAnimated(true);
        tick(leftToRight, timersOf(&leftToRight).first());
        const QImage normal = render(leftToRight, QSize(32, 32));

        QApplication::setLayoutDirection(Qt::RightToLeft);
        ChaseWidget rightToLeft;
        rightToLeft.setAnimated(true);
        tick(rightToLeft, timersOf(&rightToLeft).first());
        const QImage mirrored = render(rightToLeft, QSize(32, 32));

        QCOMPARE(phaseOf(mirrored, +40), 1);
        QVERIFY(phaseOf(mirrored, -40) != 1);
        QCOMPARE(phaseOf(normal, -40), 1);
    }
};

QTEST_MAIN(tst_ChaseWidget)
#include "tst_chasewidget.moc"
