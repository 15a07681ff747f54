// Saves the home screen's states as pictures, to be looked at: gallery FOLDER. The size is that of
// the layout, 1280 x 720, times QT_SCALE_FACTOR.

#include "accountmanager/accountmanagerhelper.h"
#include "common/ui/remotekeys.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "res/resources.h"
#include "support/misbehavingserver.h"
#include "ui/homewidget.h"
#include "ui/samplefeeds.h"
#include "ui/upwidget.h"
#include "ui/widget.h"

#include <QApplication>
#include <QBuffer>
#include <QFile>
#include <QFontDatabase>
#include <QKeyEvent>
#include <QPainter>
#include <QTemporaryDir>
#include <QtTest>

#include <cstdio>

namespace {

// A landscape of hills, in colours of its own for every number.
QByteArray pictureFile(int number, const QSize &size)
{
    QImage image(size, QImage::Format_RGB32);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    const int hue = number * 47 % 360;
    QLinearGradient sky(0, 0, 0, size.height());
    sky.setColorAt(0, QColor::fromHsv(hue, 120, 250));
    sky.setColorAt(1, QColor::fromHsv((hue + 40) % 360, 60, 255));
    painter.fillRect(image.rect(), sky);
    painter.setPen(Qt::NoPen);
    for (int layer = 0; layer < 3; ++layer) {
        painter.setBrush(QColor::fromHsv((hue + 120) % 360, 140, 170 - 50 * layer));
        const int top = size.height() * (5 + 2 * layer) / 10;
        painter.drawEllipse(QPoint((number * 131 + layer * 170) % size.width(), size.height()),
                            size.width() * 2 / 3, size.height() - top);
    }
    painter.end();
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, "JPG", 90);
    return bytes;
}

QString thumbnail(MisbehavingServer &server, int number)
{
    const QString path = QString("/picture%1.jpg").arg(number);
    const QSize size = number % 3 == 2 ? QSize(480, 640) : QSize(640, 480);
    server.on(path.toUtf8(), MisbehavingServer::answer(pictureFile(number, size)));
    return server.url(path);
}

void serveLists(MisbehavingServer &server)
{
    const QStringList titles{"Harbour at dusk",
                             "Portrait",
                             "First snow on the way to the old mill",
                             "Wien",
                             "Two boats",
                             "A very long title that goes on and on for ever",
                             "IMG_2041",
                             "Grandmother's garden"};
    QJsonArray photos, albums, people;
    for (int i = 0; i < 16; ++i)
        photos << sample::photo(titles.at(i % 8),
                                i == 6 ? server.url("/none") : thumbnail(server, i));
    for (int i = 0; i < 7; ++i)
        albums << sample::album(titles.at(7 - i), i == 2 ? 1 : 12 * i, QString("a%1").arg(i),
                                thumbnail(server, 20 + i));
    for (int i = 0; i < 3; ++i)
        people << sample::person(
            QStringList{"Anna", "Bartholomew Featherstonehaugh-Cholmondeley", "Mehmet"}.at(i),
            QString("p%1").arg(i), thumbnail(server, 30 + i));
    server.on("/data/feed/api/featured", MisbehavingServer::answer(sample::feed(photos, 120)));
    server.on("/data/feed/api/user/default", MisbehavingServer::answer(sample::feed(albums, 7)));
    server.on("/data/feed/api/user/owner/albumid/a1",
              MisbehavingServer::answer(sample::feed(photos, 16)));
    server.on("/data/feed/api/user/default/contacts",
              MisbehavingServer::answer(sample::feed(people, 3)));
    server.on("/data/feed/api/user/p0", MisbehavingServer::answer(sample::feed({}, 0)));
    server.on("/data/feed/api/user/p1", MisbehavingServer::silence());
}

void configure(const QString &path, const QString &feedBase)
{
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return;
    file.write(
        "[Max]\nCacheSize=96\n[Layout]\nborder_left=64\nborder_right=64\nborder_top=36\n"
        "border_bottom=36\n[Font]\nTitle=26\n[Network]\nPageSeconds=1\n[Service]\nFeedBase=");
    file.write(feedBase.toUtf8() + '\n');
    file.close();
    SystemConfig::setConfigFile(path);
}

class Gallery
{
public:
    Gallery(QWidget *screen, const QString &folder)
        : mScreen(screen)
        , mFolder(folder)
    {
    }
    void press(std::initializer_list<int> keys)
    {
        for (int key : keys)
            QTest::sendKeyEvent(QTest::Press, QApplication::focusWidget(), Qt::Key(key), QString(),
                                {});
    }
    void take(const QString &name)
    {
        QTest::qWait(400); // for thumbnails, which nothing reports
        mScreen->grab().save(QString("%1/%2.png").arg(mFolder, name));
    }

private:
    QWidget *mScreen;
    QString mFolder;
};

} // namespace

int main(int argc, char **argv)
{
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
    QApplication app(argc, argv);
    if (argc != 2)
        return std::puts("gallery FOLDER"), 1;
    initResources();
    const int id = QFontDatabase::addApplicationFont(ORVALA_FONT_FILE);
    app.setFont(QFont(QFontDatabase::applicationFontFamilies(id).value(0), 12));
    QTemporaryDir folder;
    MisbehavingServer server;
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    configure(folder.filePath("config.ini"), server.url(QString()));
    serveLists(server);
    PhotoManager::init();
    AccountManagerHelper::setUserName("Maria Sundqvist");

    Widget page;
    page.resize(1280, 720);
    page.show();
    page.activateWindow();
    Gallery gallery(&page, QString::fromLocal8Bit(argv[1]));
    gallery.take("featured");
    gallery.press({DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY});
    gallery.take("focus");
    gallery.press({DEVICE_UP_KEY, DEVICE_UP_KEY, DEVICE_RIGHT_KEY});
    gallery.take("menu");
    gallery.press({DEVICE_SELECT_KEY});
    gallery.take("albums");
    gallery.press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
    gallery.take("album");
    gallery.press({DEVICE_UP_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
    gallery.take("people");
    gallery.press({DEVICE_SELECT_KEY});
    gallery.take("empty");
    gallery.press({DEVICE_RETURN_KEY});
    gallery.take("people-again");
    gallery.press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
    gallery.take("loading");
    QTest::qWait(1000);
    gallery.take("failure");
    return 0;
}
