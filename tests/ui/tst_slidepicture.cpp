#include "support/logcapture.h"
#include "support/testconfig.h"
#include "ui/slidelabel.h"
#include "ui/slidemotion.h"
#include "ui/slidepicture.h"

#include <QPainter>
#include <QtTest>

namespace {

const QSize kScreen(320, 180);

QPixmap photo(int width, int height)
{
    QPixmap picture(width, height);
    picture.fill(Qt::red);
    return picture;
}

QImage painted(const SlidePicture &slide)
{
    QImage screen(slide.screen, QImage::Format_RGB32);
    screen.fill(Qt::green);
    QPainter painter(&screen);
    slide.paint(painter);
    return screen;
}

} // namespace

// What the slide show paints, without a player.
class TestSlidePicture : public QObject
{
    Q_OBJECT

private slots:
    void everyPixelIsPainted()
    {
        for (const QSize &size :
             {QSize(101, 180), QSize(320, 9), kScreen, QSize(320, 1), QSize(1, 1)}) {
            const QPixmap picture = photo(size.width(), size.height());
            QVERIFY(makeSlide(picture, kScreen, false).bands.isEmpty());
            const SlidePicture slide = makeSlide(picture, kScreen, true);
            QCOMPARE(slide.bands.isEmpty(), size == kScreen);
            const QImage screen = painted(slide);
            for (int i = 0; i < screen.width() * screen.height(); ++i) {
                const QPoint at(i % screen.width(), i / screen.width());
                const QColor colour = screen.pixelColor(at);
                QVERIFY(slide.place.contains(at) ? colour == QColor(Qt::red)
                                                 : colour.green() == 0 && colour.red() < 200);
            }
            QVERIFY(screen.pixelColor(0, 0).red() > 60); // the fill, or the photo
        }
    }

    void motionNeverUncovers()
    {
        for (const QSize &size : {QSize(320, 180), QSize(101, 180), QSize(320, 9)}) {
            const QRectF rest = slidemotion::centred(size, kScreen);
            for (int turn = 0; turn < 8; ++turn) {
                QCOMPARE(slidemotion::moved(size, kScreen, 0, 10, turn), rest);
                for (qreal moment : {0.01, 0.5, 1.0, 7.0})
                    QVERIFY(slidemotion::moved(size, kScreen, moment, 10, turn).contains(rest));
            }
            QVERIFY(slidemotion::moved(size, kScreen, 1, 10, 0) !=
                    slidemotion::moved(size, kScreen, 1, 10, 1));
        }
    }

    void fadesEndAndKeysCut()
    {
        SlideOptions options;
        options.fade = 60;
        SlideLabel label(options);
        label.resize(kScreen);
        label.show();
        label.setImage(photo(320, 180));
        QVERIFY(!label.isFading());
        QPixmap blue(320, 180);
        blue.fill(Qt::blue);
        const SlidePicture next = makeSlide(blue, kScreen, false);
        label.showSlide(next, SlideLabel::Change::Fade);
        QVERIFY(label.isFading());
        QVERIFY(label.grab().toImage().pixelColor(160, 90).red() > 100);
        QTRY_VERIFY(!label.isFading());
        QCOMPARE(label.grab().toImage().pixelColor(160, 90), QColor(Qt::blue));

        label.showSlide(makeSlide(photo(320, 180), kScreen, false), SlideLabel::Change::Fade);
        label.showSlide(next, SlideLabel::Change::Cut);
        QVERIFY(!label.isFading());
        QCOMPARE(label.grab().toImage().pixelColor(160, 90), QColor(Qt::blue));
    }

    void slowMachinesAreSpared()
    {
        SlidePace pace;
        int frames = 1;
        while (!pace.isTooSlow(true) && frames < 100)
            ++frames;
        QCOMPARE(frames, 16);
        pace.restart();
        for (int i = 0; i < 50; ++i)
            QVERIFY(!pace.isTooSlow(i % 3 == 0)); // a third is late: the decoder was at work
    }

    void optionsStayInRange();
};

void TestSlidePicture::optionsStayInRange()
{
    TestConfig config;
    config.write("[SlideShow]\nFade=99999999\nMotion=-3\nAhead=0\nClock=Top Right\n"
                 "Caption=bottomLEFT\nLoop=TRUE\nMarksSeconds=soon\n");
    const SlideOptions odd = SlideOptions::configured();
    QVERIFY(odd.fade == 5000 && odd.motion == 0 && odd.ahead == 1 && odd.marksSeconds == 0);
    QVERIFY(odd.loop && odd.clock == SlideCorner::None && odd.caption == SlideCorner::BottomLeft);
}

QTEST_MAIN(TestSlidePicture)
#include "tst_slidepicture.moc"
