// A step of the slide show, from the key to the repainted screen: to a photo that was prepared, and
// to one that is still with the server, each against a program that decodes the same file with
// turbojpeg and paints it scaled. Then the memory over many steps. The screen is 1280 x 720, times
// QT_SCALE_FACTOR: 1.5 for 1080p.

#include "benchpicture.h"
#include "common/ui/remotekeys.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "res/resources.h"
#include "support/bench.h"
#include "support/misbehavingserver.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"
#include "ui/samplefeeds.h"
#include "ui/slidephotos.h"
#include "ui/slidesetting.h"
#include "ui/widget.h"

#include <QApplication>
#include <QFile>
#include <QKeyEvent>
#include <QPainter>
#include <QTemporaryFile>
#include <QtTest>

#include <turbojpeg.h>
#include <unistd.h>

namespace {

constexpr int kPhotos = 2000;
constexpr int kRounds = 40;
constexpr int kSteps = 10000;
constexpr int kWarmUp = 1000;
constexpr double kTwoFrames = 2.0 / 60;

// The reference: decodes at the key, and paints scaled to fit.
class Plain : public QWidget
{
public:
    explicit Plain(const QByteArray &jpeg)
        : mJpeg(jpeg)
        , mDecoder(tjInitDecompress())
    {
        setAttribute(Qt::WA_OpaquePaintEvent);
    }
    ~Plain() override { tjDestroy(mDecoder); }

protected:
    void keyPressEvent(QKeyEvent *) override
    {
        const auto *bytes = reinterpret_cast<const unsigned char *>(mJpeg.constData());
        int width = 0, height = 0, subsampling = 0, colours = 0;
        tjDecompressHeader3(mDecoder, bytes, mJpeg.size(), &width, &height, &subsampling, &colours);
        mImage = QImage(width, height, QImage::Format_RGB32);
        tjDecompress2(mDecoder, bytes, mJpeg.size(), mImage.bits(), width, mImage.bytesPerLine(),
                      height, TJPF_BGRX, 0);
        update();
    }
    void paintEvent(QPaintEvent *) override
    {
        QPainter painter(this);
        painter.setRenderHint(QPainter::SmoothPixmapTransform);
        painter.drawImage(rect(), mImage);
    }

private:
    QByteArray mJpeg;
    tjhandle mDecoder;
    QImage mImage;
};

void pressAndPaint(QWidget *target, int key)
{
    QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier);
    QApplication::sendEvent(target, &press);
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
}

template <typename Condition>
void waitFor(Condition condition)
{
    if (!QTest::qWaitFor(condition))
        qFatal("the photo does not come");
}

// One album of many photos, all with the same bytes.
void serve(MisbehavingServer &server, const QByteArray &jpeg)
{
    const auto answer = MisbehavingServer::answer(jpeg); // one copy of the bytes
    QJsonArray photos;
    for (int i = 0; i < kPhotos; ++i) {
        const QByteArray number = QByteArray::number(i);
        photos << sample::photo("Photo " + number, server.url("/p" + number + ".jpg"));
        server.on("/s0/p" + number + ".jpg", answer);
    }
    server.on("/data/feed/api/featured", MisbehavingServer::answer(sample::feed(photos, kPhotos)));
}

void configure(QTemporaryFile &file, const QString &feedBase)
{
    file.open();
    file.write("[Max]\nCacheSize=96\n[Service]\nFeedBase=" + feedBase.toUtf8() +
               "\n[SlideShow]\nBlurredFill=true\nCaption=BottomLeft\nClock=TopRight\nFade=900\n");
    file.flush();
    SystemConfig::setConfigFile(file.fileName());
}

double residentMegabytes()
{
    QFile file("/proc/self/statm");
    file.open(QIODevice::ReadOnly);
    return file.readAll().split(' ').at(1).toDouble() * double(sysconf(_SC_PAGESIZE)) / 1e6;
}

// Resident memory after the first steps and at the end, there and back through the photos.
void measureMemory(QImageSlide *player, MisbehavingServer &server)
{
    double before = 0;
    int key = DEVICE_RIGHT_KEY;
    for (int step = 0; step < kSteps; ++step) {
        if (step == kWarmUp)
            before = residentMegabytes();
        if (player->position() == 0)
            key = DEVICE_RIGHT_KEY;
        else if (player->position() == kPhotos - 1)
            key = DEVICE_LEFT_KEY;
        pressAndPaint(player, key);
        server.forgetRequests();
        if (step % 4 == 0)
            waitFor([player] { return player->label()->placeholder().isEmpty(); });
    }
    const double grown = residentMegabytes() - before;
    bench::row("slide show, megabytes grown from step 1,000 to 10,000", grown, 2,
               std::to_string(int(before)) + " MB before");
}

struct Times
{
    std::vector<double> prepared, fresh, plain;
};

// The three in turn, on new photos each round.
Times measureSteps(QImageSlide *player, QWidget *plain)
{
    Times times;
    auto *photos = player->findChild<SlidePhotos *>();
    const auto *list = HomeWidget::mCurrentPackageData;
    for (int round = 0; round < kRounds; ++round) {
        const QString next = list->record<OrvalaPhoto>(player->position() + 1)->imageUrl();
        waitFor([&] { return photos->isPrepared(next); });
        times.prepared.push_back(
            bench::seconds([player] { pressAndPaint(player, DEVICE_RIGHT_KEY); }));
        times.fresh.push_back(bench::seconds([player] {
            pressAndPaint(player, DEVICE_RIGHT_KEY);
            while (!player->label()->placeholder().isEmpty())
                QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
            QCoreApplication::sendPostedEvents();
            QCoreApplication::processEvents();
        }));
        times.plain.push_back(bench::seconds([plain] { pressAndPaint(plain, DEVICE_RIGHT_KEY); }));
    }
    return times;
}

void report(const char *what, const std::vector<double> &ours, const std::vector<double> &plain,
            double goal, const std::string &size)
{
    const double a = bench::median(ours), b = bench::median(plain);
    bench::row(what + size, a / b, goal, bench::milliseconds({0, a, b}));
}

} // namespace

int main(int argc, char **argv)
{
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
    QApplication app(argc, argv);
    initResources();
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    SystemConfig::setScale(app.devicePixelRatio());
    SlideSetting::SlideSpeed = 3600;
    MisbehavingServer server;
    QTemporaryFile settings;
    configure(settings, server.url(QString()));
    const QSize screen = QSize(1280, 720) * app.devicePixelRatio();
    const QByteArray jpeg = photoJpeg(screen.width() * 7 / 8, screen.height() * 7 / 8);
    serve(server, jpeg);
    PhotoManager::init();

    Plain plain(jpeg);
    plain.resize(1280, 720);
    plain.show();
    Widget page;
    page.resize(1280, 720);
    page.show();
    waitFor([] { return HomeWidget::mCurrentPackageData != nullptr; });
    emit page.homeScreen()->slideShow(0);

    const Times times = measureSteps(page.player(), &plain);
    const std::string size = std::to_string(screen.height()) + "p";
    report("slide step to a prepared photo against decode and scaled blit, ", times.prepared,
           times.plain, 0.5, size);
    report("slide step to a photo at the server against decode and scaled blit, ", times.fresh,
           times.plain, 0, size);
    const double slowest = *std::max_element(times.prepared.begin(), times.prepared.end());
    bench::row("slowest of them against two frames, " + size, slowest / kTwoFrames, 1,
               std::to_string(slowest * 1e3) + " ms");
    measureMemory(page.player(), server);
    return 0;
}
