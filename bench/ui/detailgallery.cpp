// Saves the photo screen's states as pictures, to be looked at, with the photos of a running album
// service: detailgallery FOLDER FEEDBASE TOKEN [COUNT]. Shows that many of the featured photos. The
// size is that of the layout, 1280 x 720, times QT_SCALE_FACTOR.

#include "accountmanager/accountmanagerhelper.h"
#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "res/resources.h"
#include "ui/detailstage.h"
#include "ui/picturedetailwidget.h"

#include <QApplication>
#include <QFile>
#include <QFontDatabase>
#include <QPainter>
#include <QTemporaryDir>
#include <QtTest>

#include <algorithm>
#include <cstdio>

namespace {

bool isListThere = false;

void configure(const QString &path, const char *feedBase, qreal scale)
{
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return;
    file.write("[Max]\nCacheSize=256\n[Layout]\nborder_left=64\nborder_right=64\n[Service]\n"
               "FeedBase=");
    file.write(feedBase);
    file.close();
    SystemConfig::setConfigFile(path);
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    SystemConfig::setScale(scale);
    PhotoManager::init();
}

// The place that the home screen gives to the photo.
class Host : public QWidget
{
public:
    Host()
        : mDetail(new PictureDetailWidget(this))
    {
        resize(1280, 720);
        mDetail->setGeometry(frame().adjusted(12, 12, -12, -12));
    }
    PictureDetailWidget *detail() { return mDetail; }

protected:
    void paintEvent(QPaintEvent *) override
    {
        QPainter painter(this);
        painter.drawPixmap(0, 0, mBackground);
        painter.drawPixmap(frame().topLeft(), mFrame);
    }

private:
    static QRect frame() { return QRect(64, 100, 1152, 548); }

    PictureDetailWidget *mDetail;
    const QPixmap mBackground = loadPicture(":/res/orvala_background.png", QSize(1280, 720));
    const QPixmap mFrame = loadPicture(":/res/Content_Bg.png", frame().size());
};

class Gallery
{
public:
    Gallery(Host *host, const QString &folder)
        : mHost(host)
        , mFolder(folder)
    {
    }
    void press(std::initializer_list<int> keys)
    {
        for (int key : keys)
            QTest::sendKeyEvent(QTest::Press, mHost->detail(), Qt::Key(key), QString(), {});
    }
    Host *host() { return mHost; }
    void take(const QString &name)
    {
        const auto *stage = mHost->findChild<DetailStage *>();
        const bool isThere = QTest::qWaitFor([stage] { return !stage->isWaiting(); }, 20000);
        QTest::qWait(400); // for comments and neighbours, which nothing reports
        mHost->grab().save(QString("%1/%2.png").arg(mFolder, name));
        std::printf("%s %s\n", qPrintable(name), isThere ? "" : "(still waiting)");
    }

private:
    Host *mHost;
    QString mFolder;
};

void takeStates(Gallery &gallery)
{
    gallery.press({DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY});
    gallery.take("actions");
    gallery.press({DEVICE_LEFT_KEY, DEVICE_SELECT_KEY});
    gallery.take("zoom-2");
    gallery.press({DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY});
    gallery.take("zoom-4");
    gallery.press({DEVICE_RETURN_KEY});
    for (int i = 0; i < 7; ++i)
        gallery.press({DEVICE_RIGHT_KEY});
    gallery.press({DEVICE_SELECT_KEY, DEVICE_UP_KEY});
    gallery.take("without-information");
    gallery.press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY});
}

// The last step of zoom and the far end of the photo.
void takeClosest(Gallery &gallery)
{
    gallery.press({DEVICE_DOWN_KEY, DEVICE_LEFT_KEY, DEVICE_LEFT_KEY, DEVICE_LEFT_KEY,
                   DEVICE_LEFT_KEY, DEVICE_LEFT_KEY, DEVICE_LEFT_KEY, DEVICE_RIGHT_KEY,
                   DEVICE_SELECT_KEY});
    for (int i = 0; i < 40; ++i)
        gallery.press({i < 6 ? DEVICE_PAGEUP_KEY : DEVICE_RIGHT_KEY});
    QTest::qWait(1000);
    gallery.take("zoom-closest");
}

// From a key to the picture that it leads to.
void measure(Gallery &gallery, const char *what, int key, int count)
{
    QVector<double> milliseconds;
    for (int i = 0; i < count; ++i) {
        QElapsedTimer timer;
        timer.start();
        gallery.press({key});
        gallery.host()->repaint();
        milliseconds << timer.nsecsElapsed() / 1e6;
    }
    std::sort(milliseconds.begin(), milliseconds.end());
    std::printf("%s: median %.1f ms, worst %.1f ms\n", what,
                milliseconds.at(milliseconds.size() / 2), milliseconds.last());
}

} // namespace

int main(int argc, char **argv)
{
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
    QApplication app(argc, argv);
    if (argc < 4)
        return std::puts("detailgallery FOLDER FEEDBASE TOKEN [COUNT]"), 1;
    initResources();
    const int id = QFontDatabase::addApplicationFont(ORVALA_FONT_FILE);
    app.setFont(QFont(QFontDatabase::applicationFontFamilies(id).value(0), 12));
    QTemporaryDir folder;
    configure(folder.filePath("config.ini"), argv[2], app.devicePixelRatio());
    AccountManagerHelper::setAccessToken(argv[3]);

    PackageProperty featured;
    featured.mType = FEATURED_PHOTOS_LIST;
    PackageManager::downloadPage(featured,
                                 [](PackageProperty &, ErrorCode) { isListThere = true; });
    if (!QTest::qWaitFor([] { return isListThere; }) || !PackageManager::getPackage(featured))
        return std::puts("no list"), 1;

    Host host;
    host.show();
    host.activateWindow();
    host.detail()->setFocus();
    host.detail()->showPhoto(0, PackageManager::getPackage(featured), true, true);
    Gallery gallery(&host, QString::fromLocal8Bit(argv[1]));
    const int count = argc > 4 ? QByteArray(argv[4]).toInt() : 8;
    for (int i = 1; i <= count; ++i) {
        gallery.take(QString("photo%1").arg(i, 2, 10, QChar('0')));
        if (i == 1)
            takeStates(gallery);
        if (i == count)
            takeClosest(gallery);
        gallery.press({DEVICE_RIGHT_KEY});
    }
    measure(gallery, "move in the magnified photo", DEVICE_LEFT_KEY, 10);
    gallery.press({DEVICE_RETURN_KEY});
    measure(gallery, "photo before, which is there", DEVICE_PRE_KEY, qMax(1, count - 1));
    return 0;
}
