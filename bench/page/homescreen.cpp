#include "page/homescreen.h"

#include "common/ui/remotekeys.h"
#include "common/ui/scale.h"
#include "data/benchpicture.h"
#include "data/download.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "network/connection.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "res/resources.h"
#include "ui/homewidget.h"
#include "ui/photoitem.h"

#include <QApplication>
#include <QDeadlineTimer>
#include <QFontDatabase>
#include <QKeyEvent>
#include <QSettings>

#include <algorithm>

namespace {

constexpr int PER_PAGE = 8;
constexpr int PATIENCE_MS = 30000;
const QString mail = QStringLiteral("anna@orvala.example");

} // namespace

HomeScreen::HomeScreen(int &argc, char **argv, int cacheMegabytes)
    : mCacheMegabytes(cacheMegabytes)
{
    qInstallMessageHandler([](QtMsgType type, const QMessageLogContext &, const QString &line) {
        if (type == QtFatalMsg)
            std::fprintf(stderr, "%s\n", qPrintable(line));
    });
    qputenv("QT_QPA_PLATFORM", "offscreen");
    configure(QString());
    prepareScale();
    mApplication = std::make_unique<QApplication>(argc, argv);
    applyScale();
    initResources();
    const int font = QFontDatabase::addApplicationFont(ORVALA_FONT_FILE);
    QApplication::setFont(QFont(QFontDatabase::applicationFontFamilies(font).value(0), 15));
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    PhotoManager::init();
}

HomeScreen::~HomeScreen()
{
    mHome.reset();
    PackageManager::clearAll();
    PhotoManager::clearAll();
    Connection::closeIdleSockets();
}

void HomeScreen::configure(const QString &origin)
{
    QSettings settings(mFolder.filePath("config.ini"), QSettings::IniFormat);
    settings.setValue("Service/FeedBase", origin);
    settings.setValue("Max/CacheSize", mCacheMegabytes);
    settings.setValue("Max/PageCacheSeconds", 3600);
    settings.setValue("Layout/Scale", 1.5);
    settings.sync();
    SystemConfig::setConfigFile(settings.fileName());
}

void HomeScreen::handleEventsUntil(const std::function<bool()> &condition)
{
    const QDeadlineTimer deadline(PATIENCE_MS);
    while (!condition()) {
        if (deadline.hasExpired())
            qFatal("the page does not come");
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }
}

QString HomeScreen::user()
{
    return mail;
}

void HomeScreen::serve(int pages, const QByteArray &firstPhoto, const QSize &size)
{
    mPhotos = pages * PER_PAGE;
    const QByteArray photo = photoJpeg(size.width(), size.height());
    bool isWritten = true;
    for (int i = 0; i < mPhotos; ++i)
        isWritten &=
            mService.addFile(QStringLiteral("anna/Photos/%1.jpg").arg(i, 4, 10, QChar('0')),
                             i == 0 && !firstPhoto.isEmpty() ? firstPhoto : photo);
    if (!isWritten || !mService.addUser(mail, "Anna", "anna") || !mService.start() ||
        !mService.waitForPhotos(mPhotos))
        qFatal("the album service does not start");
}

void HomeScreen::open(const QString &origin)
{
    mHome.reset();
    PackageManager::clearAll();
    PhotoManager::clearAll();
    Connection::closeIdleSockets();
    configure(origin);
    mHome = std::make_unique<HomeWidget>();
    mHome->resize(1280, 720);
    mHome->show();
    mHome->activateWindow();
    waitUntilIdle();
}

bool HomeScreen::isLastPage() const
{
    return startIndex() + PER_PAGE > mPhotos;
}

void HomeScreen::turn(bool forward)
{
    press(forward ? DEVICE_PAGEDOWN_KEY : DEVICE_PAGEUP_KEY);
}

void HomeScreen::openAlbums()
{
    for (int key : {DEVICE_UP_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY})
        press(key);
    handleEventsUntil([this] { return !mHome->isLoading(); });
}

void HomeScreen::press(int key)
{
    QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
    QWidget *focused = QApplication::focusWidget();
    if (!focused)
        qFatal("nothing has the focus");
    QApplication::sendEvent(focused, &event);
}

void HomeScreen::forgetPictures()
{
    PhotoManager::clearAll();
}

bool HomeScreen::isShown() const
{
    return !mHome->isLoading() && Download::mHomeLabelUrlHash.isEmpty() &&
           mHome->recordCount() >= shownUpTo();
}

void HomeScreen::waitUntilShown() const
{
    handleEventsUntil([this] { return isShown(); });
    QCoreApplication::processEvents(); // the paint events
    checkPictures();
}

void HomeScreen::waitUntilIdle() const
{
    waitUntilShown();
    handleEventsUntil(
        [this] { return mHome->recordCount() >= std::min(mPhotos, shownUpTo() + PER_PAGE); });
}

// Every picture of the page has been decoded.
void HomeScreen::checkPictures() const
{
    for (int i = startIndex() - 1; i < shownUpTo(); ++i) {
        const auto *photo = HomeWidget::mCurrentPackageData->record<OrvalaPhoto>(i);
        if (!photo || !PhotoManager::getPhoto(photo->thumbnailUrl()))
            qFatal("a picture is missing");
    }
}

int HomeScreen::startIndex() const
{
    return mHome->state().mCurrentProperty.mStartIndex;
}

int HomeScreen::shownUpTo() const
{
    return std::min(mPhotos, startIndex() - 1 + PER_PAGE);
}

QSize HomeScreen::pictureSize() const
{
    return mHome->findChild<PhotoItem *>()->imageSize();
}
