#include "data/download.h"
#include "data/photomanager.h"
#include "support/logcapture.h"
#include "support/testconfig.h"
#include "testpictures.h"

#include <QPainter>
#include <QtEndian>
#include <QtTest>

#include <memory>

namespace {

std::unique_ptr<QPixmap> decode(const QByteArray &data)
{
    return std::unique_ptr<QPixmap>(PhotoManager::createPhoto(data.constData(), data.size()));
}

QByteArray bigEndian(quint32 value, int bytes)
{
    QByteArray text(4, '\0');
    qToBigEndian(value, text.data());
    return text.right(bytes);
}

// A chunk whose check sum nobody looks at before its length.
QByteArray chunk(const QByteArray &type, const QByteArray &data, quint32 claimed)
{
    return bigEndian(claimed, 4) + type + data + QByteArray(4, '\0');
}

// Puts a size into the frame header; its marker may become that of a progressive picture.
QByteArray withJpegSize(QByteArray jpeg, quint32 width, quint32 height, char marker)
{
    const int frame = jpeg.indexOf("\xff\xc0");
    jpeg[frame + 1] = marker;
    return jpeg.replace(frame + 5, 4, bigEndian(height, 2) + bigEndian(width, 2));
}

// An application segment with an EXIF orientation of 6: turn by a quarter to the right.
QByteArray turned(const QByteArray &jpeg)
{
    const QByteArray tiff =
        QByteArray::fromHex("4d4d002a00000008000101120003000000010006000000000000");
    const QByteArray exif = QByteArray("Exif\0\0", 6) + tiff;
    return jpeg.left(2) + "\xff\xe1" + bigEndian(quint32(exif.size()) + 2, 2) + exif + jpeg.mid(2);
}

} // namespace

class TestPictures : public QObject
{
    Q_OBJECT

private slots:
    void refusesWhatIsNoPicture_data()
    {
        QTest::addColumn<QByteArray>("data");
        const QByteArray png = encoded(plain(8, 8), "png");
        const QByteArray jpeg = encoded(plain(64, 64), "jpg");
        QTest::newRow("nothing") << QByteArray();
        QTest::newRow("page") << QByteArray("<html>not found</html>");
        QTest::newRow("vector picture")
            << QByteArray("<svg xmlns='http://www.w3.org/2000/svg' width='9' height='9'/>");
        QTest::newRow("huge text chunk") << png.left(33) + chunk("tEXt", "abcd\0e", 0x3fffffff);
        QTest::newRow("negative chunk") << png.left(33) + chunk("IDAT", "abcd", 0xfffffff0);
        QTest::newRow("cut png") << png.left(png.size() - 20);
        QTest::newRow("huge png") << encoded(QImage(8001, 8000, QImage::Format_Mono), "png");
        QTest::newRow("huge jpeg") << withJpegSize(jpeg, 65000, 65000, '\xc0');
        QTest::newRow("progressive jpeg") << withJpegSize(jpeg, 11000, 5800, '\xc2');
        QTest::newRow("empty jpeg") << withJpegSize(jpeg, 0, 0, '\xc0');
        QTest::newRow("jpeg header") << jpeg.left(jpeg.indexOf("\xff\xda"));
        QTest::newRow("huge gif") << QByteArray("GIF89a\xff\xff\xff\xff\x00\x00\x00", 13);
        QTest::newRow("bmp header") << encoded(plain(64, 64), "bmp").left(30);
    }
    void refusesWhatIsNoPicture()
    {
        QFETCH(QByteArray, data);
        QVERIFY(!decode(data));
    }

    void showsWhatThereIs()
    {
        const QByteArray jpeg = encoded(plain(640, 480), "jpg");
        const auto picture = decode(jpeg.left(jpeg.size() * 3 / 4));
        QVERIFY(picture);
        QVERIFY(picture->toImage().pixelColor(5, 5).red() > 250);
        const QByteArray png = encoded(plain(8, 8), "png"); // nor does a broken text do harm
        QVERIFY(decode(png.left(33) + chunk("zTXt", "no check sum", 12) + png.mid(33)));
    }

    void decodesOnlyLargeJpegsSmaller()
    {
        const auto decoded = [](int width, int height, const char *format) {
            const auto picture = decode(encoded(plain(width, height), format));
            return picture ? picture->size() : QSize();
        };
        QCOMPARE(decoded(2560, 1440, "jpg"), QSize(1280, 720)); // twice the screen
        QCOMPARE(decoded(2540, 1430, "jpg"), QSize(2540, 1430));
        QCOMPARE(decoded(1500, 3000, "jpg"), QSize(360, 720));
        QCOMPARE(decoded(2560, 1440, "png"), QSize(2560, 1440));
    }

    void turnsByOrientation()
    {
        QImage image = plain(64, 32);
        QPainter(&image).fillRect(0, 0, 32, 32, Qt::blue);
        const auto picture = decode(turned(encoded(image, "jpg")));
        QVERIFY(picture);
        QCOMPARE(picture->size(), QSize(32, 64));
        QVERIFY(picture->toImage().pixelColor(16, 8).blue() > 200);
        const auto large = decode(turned(encoded(plain(6000, 3000), "jpg")));
        QCOMPARE(large->size(), QSize(360, 720));
    }

    void fitsPicturesIntoLabels()
    {
        const QSize rows[][3] = {{{400, 300}, {100, 100}, {100, 75}},
                                 {{40, 30}, {400, 400}, {400, 300}},
                                 {{400, 300}, {400, 320}, {400, 300}},
                                 {{288, 216}, {280, 200}, {266, 200}},
                                 {{1000, 1}, {100, 100}, {100, 1}},
                                 {{40, 30}, {0, 0}, {40, 30}}}; // a label without a size yet
        SystemConfig::setScale(1.5);
        for (const auto &[size, room, expected] : rows) {
            TestTarget target(room);
            const QPixmap picture = QPixmap::fromImage(plain(size.width(), size.height()));
            Download::showPicture(&target, picture);
            QCOMPARE(target.shown.size(), expected);
            QCOMPARE(target.shown.devicePixelRatio(), 1.5);
            const QImage shown = target.shown.toImage();
            for (const QPoint &corner : {QPoint(0, 0), shown.rect().bottomRight()})
                QCOMPARE(shown.pixelColor(corner), QColor(Qt::red));
        }
        SystemConfig::setScale(1);
    }

    void deliversFailuresOnlyToThoseWhoStillWait()
    {
        QString url = "http://h/a";
        TestTarget home({10, 10}), detail({10, 10});
        {
            TestTarget gone({10, 10});
            Download::mHomeLabelUrlHash.insert(url, &gone);
            Download::mHomeLabelUrlHash.insert(url, &home);
        }
        Download::mDetailLabelUrlHash.insert(url, &detail);
        LogCapture log;
        Download::downloadHomePhotoCB(url, NET_TIMEOUT);
        QCOMPARE(home.placeholder, QString(":/res/image_download_failed.png"));
        QVERIFY(log.contains("downloadPhoto :" + url + "; failed with code :-90"));

        Download::mCurrentDetailImageUrl.clear();
        Download::downloadDetailPhotoCB(url, NET_REJECTED);
        QVERIFY(log.contains("Wrong maybe Wrong"));
        Download::mCurrentDetailImageUrl = "http://h/b";
        Download::downloadDetailPhotoCB(url, NET_REJECTED);
        QVERIFY(detail.placeholder.isEmpty());
        QVERIFY(Download::mDetailLabelUrlHash.contains(url));
    }

private:
    TestConfig mConfig;
};

QTEST_MAIN(TestPictures)
#include "tst_pictures.moc"
