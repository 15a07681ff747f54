#include "data/download.h"
#include "data/imagetarget.h"
#include "data/photomanager.h"
#include "support/logcapture.h"
#include "testconfig.h"

#include <QBuffer>
#include <QPainter>
#include <QtEndian>
#include <QtTest>

#include <memory>

namespace {

std::unique_ptr<QPixmap> decode(const QByteArray &data)
{
    return std::unique_ptr<QPixmap>(PhotoManager::createPhoto(data.constData(), data.size()));
}

QByteArray encoded(const QImage &image, const char *format)
{
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, format);
    return bytes;
}

QImage plain(int width, int height, const QColor &colour = Qt::red)
{
    QImage image(width, height, QImage::Format_RGB32);
    image.fill(colour);
    return image;
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
    const QByteArray tiff = QByteArray::fromHex("4d4d002a00000008"
                                                "0001"
                                                "0112000300000001"
                                                "00060000"
                                                "00000000");
    const QByteArray exif = QByteArray("Exif\0\0", 6) + tiff;
    return jpeg.left(2) + "\xff\xe1" + bigEndian(quint32(exif.size()) + 2, 2) + exif + jpeg.mid(2);
}

class Target : public ImageTarget
{
public:
    explicit Target(const QSize &size)
        : mSize(size)
    {
    }
    QSize imageSize() const override { return mSize; }
    void setImage(const QPixmap &picture) override { shown = picture; }
    void setPlaceholder(const QString &resource) override { placeholder = resource; }

    QPixmap shown;
    QString placeholder;

private:
    QSize mSize;
};

} // namespace

class TestPictures : public QObject
{
    Q_OBJECT

private slots:
    void decodesEveryFormat()
    {
        for (const char *format : {"png", "jpg", "bmp"}) {
            const auto picture = decode(encoded(plain(40, 30), format));
            QVERIFY2(picture, format);
            QCOMPARE(picture->size(), QSize(40, 30));
            const QColor colour = picture->toImage().pixelColor(20, 15);
            QVERIFY(colour.red() > 250 && colour.blue() < 5);
        }
        const QByteArray gif = QByteArray::fromHex( // 1 x 1, two frames
            "47494638396101000100800000ff0000ffffff2c00000000010001000002024401002c0000000001000100"
            "000202440100"
            "3b");
        const auto picture = decode(gif);
        QVERIFY(picture);
        QCOMPARE(picture->toImage().pixelColor(0, 0), QColor(Qt::red));
    }

    void refusesWhatIsNoPicture_data()
    {
        QTest::addColumn<QByteArray>("data");
        const QByteArray png = encoded(plain(8, 8), "png");
        const QByteArray jpeg = encoded(plain(64, 64), "jpg");
        const QByteArray header = png.left(33);
        QTest::newRow("nothing") << QByteArray();
        QTest::newRow("page") << QByteArray("<html>not found</html>");
        QTest::newRow("vector picture")
            << QByteArray("<svg xmlns='http://www.w3.org/2000/svg' width='9' height='9'/>");
        QTest::newRow("huge text chunk") << header + chunk("tEXt", "abcd\0e", 0x3fffffff);
        QTest::newRow("negative chunk") << header + chunk("IDAT", "abcd", 0xfffffff0);
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
        LogCapture log;
        QVERIFY(!decode(data));
        QVERIFY(log.contains(data.isEmpty() ? "invalid parameter in createPhot"
                                            : "Failed to decode photo data in createPhot"));
    }

    void showsWhatACutJpegHas()
    {
        const QByteArray jpeg = encoded(plain(640, 480), "jpg");
        const auto picture = decode(jpeg.left(jpeg.size() * 3 / 4));
        QVERIFY(picture);
        QCOMPARE(picture->toImage().pixelColor(5, 5).red() > 250, true);
    }

    void leavesTextsOfPngOut()
    {
        const QByteArray png = encoded(plain(8, 8), "png");
        const auto picture = decode(png.left(33) + chunk("zTXt", "no check sum", 12) + png.mid(33));
        QVERIFY(picture);
        QCOMPARE(picture->size(), QSize(8, 8));
    }

    void decodesOnlyLargeJpegsSmaller_data()
    {
        QTest::addColumn<QSize>("size");
        QTest::addColumn<QByteArray>("format");
        QTest::addColumn<QSize>("decoded");
        QTest::newRow("twice the screen")
            << QSize(2560, 1440) << QByteArray("jpg") << QSize(1280, 720);
        QTest::newRow("less than twice")
            << QSize(2540, 1430) << QByteArray("jpg") << QSize(2540, 1430);
        QTest::newRow("upright") << QSize(1500, 3000) << QByteArray("jpg") << QSize(360, 720);
        QTest::newRow("png") << QSize(2560, 1440) << QByteArray("png") << QSize(2560, 1440);
    }
    void decodesOnlyLargeJpegsSmaller()
    {
        QFETCH(QSize, size);
        QFETCH(QByteArray, format);
        const auto picture = decode(encoded(plain(size.width(), size.height()), format));
        QVERIFY(picture);
        QTEST(picture->size(), "decoded");
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

    void fitsPicturesIntoLabels_data()
    {
        QTest::addColumn<QSize>("picture");
        QTest::addColumn<QSize>("label");
        QTest::addColumn<QSize>("shown");
        QTest::newRow("smaller") << QSize(400, 300) << QSize(100, 100) << QSize(100, 75);
        QTest::newRow("larger") << QSize(40, 30) << QSize(400, 400) << QSize(400, 300);
        QTest::newRow("same") << QSize(400, 300) << QSize(400, 320) << QSize(400, 300);
        QTest::newRow("a little smaller") << QSize(288, 216) << QSize(280, 200) << QSize(266, 200);
        QTest::newRow("thin") << QSize(1000, 1) << QSize(100, 100) << QSize(100, 1);
        QTest::newRow("no size yet") << QSize(40, 30) << QSize(0, 0) << QSize(40, 30);
    }
    void fitsPicturesIntoLabels()
    {
        QFETCH(QSize, picture);
        QFETCH(QSize, label);
        SystemConfig::setScale(1.5);
        Target target(label);
        Download::showPicture(&target,
                              QPixmap::fromImage(plain(picture.width(), picture.height())));
        SystemConfig::setScale(1);
        QTEST(target.shown.size(), "shown");
        QCOMPARE(target.shown.devicePixelRatio(), 1.5);
        const QImage shown = target.shown.toImage();
        for (const QPoint &corner : {QPoint(0, 0), shown.rect().bottomRight()})
            QCOMPARE(shown.pixelColor(corner), QColor(Qt::red));
    }

    void deliversFailuresOnlyToThoseWhoStillWait()
    {
        QString url = "http://h/a";
        Target home({10, 10}), detail({10, 10});
        {
            Target gone({10, 10});
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

        Download::mCurrentDetailImageUrl = url;
        Download::downloadDetailPhotoCB(url, NET_SUCCESS); // not in the cache
        QVERIFY(log.contains("downloadPhoto failed to show photo :" + url));
        QVERIFY(!Download::mDetailLabelUrlHash.contains(url));
        QVERIFY(detail.shown.isNull() && detail.placeholder.isEmpty());
    }

private:
    TestConfig mConfig;
};

QTEST_MAIN(TestPictures)
#include "tst_pictures.moc"
