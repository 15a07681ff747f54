#include "ui/slidescene.h"

#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "res/resources.h"
#include "ui/homewidget.h"
#include "ui/samplefeeds.h"

#include <QFile>
#include <QKeyEvent>

#include <cstdio>

namespace {

QByteArray pathOf(int record)
{
    return "/s0/p" + QByteArray::number(record) + ".jpg";
}

} // namespace

SlideScene::SlideScene(int &argc, char **argv, const QByteArray &slideShow)
    : mApplication(argc, argv)
{
    qInstallMessageHandler([](QtMsgType type, const QMessageLogContext &, const QString &line) {
        if (type == QtFatalMsg)
            std::fprintf(stderr, "%s\n", qPrintable(line));
    });
    initResources();
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    SystemConfig::setScale(mApplication.devicePixelRatio());
    mSettings.open();
    mSettings.write("[Max]\nCacheSize=96\nPageCacheSeconds=36000\n[Service]\nFeedBase=" +
                    mServer.url(QString()).toUtf8() + "\n[SlideShow]\n" + slideShow);
    mSettings.flush();
    SystemConfig::setConfigFile(mSettings.fileName());
    PhotoManager::init();
}

SlideScene::~SlideScene()
{
    mPage.reset();
    PackageManager::clearAll();
    PhotoManager::clearAll();
}

QSize SlideScene::screen()
{
    return QSize(1280, 720) * qApp->devicePixelRatio();
}

void SlideScene::serveList(int records)
{
    QJsonArray photos;
    for (int i = 0; i < records; ++i)
        photos << sample::photo(QString::asprintf("Photo %05d", i),
                                mServer.url(QString("/p%1.jpg").arg(i)));
    mServer.on("/data/feed/api/featured", MisbehavingServer::answer(sample::feed(photos, records)));
}

void SlideScene::serve(int records, const QList<QByteArray> &jpegs)
{
    serveList(records);
    QList<MisbehavingServer::Behaviour> answers;
    for (const QByteArray &jpeg : jpegs)
        answers << MisbehavingServer::answer(jpeg); // one copy of the bytes
    for (int i = 0; i < records; ++i)
        mServer.on(pathOf(i), answers.at(i % answers.size()));
}

void SlideScene::serveFiles(int records, const QStringList &files)
{
    serveList(records);
    for (int i = 0; i < records; ++i) {
        const QString name = files.at(i % files.size());
        mServer.on(pathOf(i), [name](QTcpSocket *socket, const MisbehavingServer::Request &asked) {
            QFile file(name);
            file.open(QIODevice::ReadOnly);
            MisbehavingServer::answer(file.readAll())(socket, asked);
        });
    }
}

void SlideScene::open(int index, bool isPlaying)
{
    mPage.reset();
    PackageManager::clearAll();
    PhotoManager::clearAll();
    mPage = std::make_unique<Widget>();
    mPage->setGeometry(0, 0, 1280, 720);
    mPage->show();
    waitFor([] { return HomeWidget::mCurrentPackageData != nullptr; });
    if (isPlaying)
        emit mPage->homeScreen()->slidePlay(index);
    else
        emit mPage->homeScreen()->slideShow(index);
    waitFor([this] { return showsPhoto(); });
}

bool SlideScene::isPrepared(int position) const
{
    const auto *photo =
        HomeWidget::mCurrentPackageData->record<OrvalaPhoto>(player()->playArray().at(position));
    return photo && player()->findChild<SlidePhotos *>()->isPrepared(photo->imageUrl());
}

void SlideScene::pressAndPaint(QWidget *target, int key)
{
    QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier);
    QApplication::sendEvent(target, &press);
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
}
