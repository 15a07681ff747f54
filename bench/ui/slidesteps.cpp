// A step of the slide show, from the key to the repainted screen: to a photo that was prepared, and
// to one that is still with the server, each against a program that decodes the same file with
// turbojpeg and paints it scaled; and what a long list costs. The screen is 1280 x 720, times
// QT_SCALE_FACTOR: 1.5 for 1080p.

#include "benchpicture.h"
#include "common/ui/remotekeys.h"
#include "support/bench.h"
#include "ui/slidescene.h"
#include "ui/slidesetting.h"

#include <QPainter>

#include <turbojpeg.h>

namespace {

constexpr int kRounds = 40;
constexpr int kShort = 10, kLong = 10000; // records
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

double stepTime(SlideScene &scene, int key)
{
    return bench::seconds([&] { SlideScene::pressAndPaint(scene.player(), key); });
}

struct Times
{
    std::vector<double> prepared, fresh, plain;
};

// The three in turn, on new photos each round.
Times measureSteps(SlideScene &scene, QWidget *plain)
{
    Times times;
    for (int round = 0; round < kRounds; ++round) {
        SlideScene::waitFor([&] { return scene.isPrepared(scene.player()->position() + 1); });
        times.prepared.push_back(stepTime(scene, DEVICE_RIGHT_KEY));
        times.fresh.push_back(bench::seconds([&scene] {
            SlideScene::pressAndPaint(scene.player(), DEVICE_RIGHT_KEY);
            while (!scene.showsPhoto())
                QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
            QCoreApplication::sendPostedEvents();
            QCoreApplication::processEvents();
        }));
        times.plain.push_back(
            bench::seconds([plain] { SlideScene::pressAndPaint(plain, DEVICE_RIGHT_KEY); }));
    }
    return times;
}

// To and fro between two prepared photos in the middle of a list.
void stepInList(SlideScene &scene, const QByteArray &jpeg, int records, std::vector<double> &times)
{
    scene.serve(records, {jpeg});
    scene.open(records / 2);
    for (int round = 0; round < 2 * kRounds; ++round) {
        const bool isOn = round % 2 == 0;
        const int next = scene.player()->position() + (isOn ? 1 : -1);
        SlideScene::waitFor([&] { return scene.isPrepared(next); });
        times.push_back(stepTime(scene, isOn ? DEVICE_RIGHT_KEY : DEVICE_LEFT_KEY));
    }
}

void report(const std::string &what, const std::vector<double> &ours,
            const std::vector<double> &reference, double goal)
{
    const double a = bench::median(ours), b = bench::median(reference);
    bench::row(what, a / b, goal, bench::milliseconds({0, a, b}));
}

} // namespace

int main(int argc, char **argv)
{
    SlideScene scene(argc, argv,
                     "BlurredFill=true\nCaption=BottomLeft\nClock=TopRight\nFade=900\n");
    SlideSetting::SlideSpeed = 3600;
    const QSize screen = SlideScene::screen();
    const std::string size = std::to_string(screen.height()) + "p";
    const QByteArray jpeg = photoJpeg(screen.width() * 7 / 8, screen.height() * 7 / 8);
    Plain plain(jpeg);
    plain.resize(1280, 720);
    plain.show();
    scene.serve(3 * kRounds, {jpeg});
    scene.open(0);

    const Times times = measureSteps(scene, &plain);
    report("slide step to a prepared photo against decode and scaled blit, " + size, times.prepared,
           times.plain, 0.5);
    report("slide step to a photo at the server against decode and scaled blit, " + size,
           times.fresh, times.plain, 0);
    const double slowest = *std::max_element(times.prepared.begin(), times.prepared.end());
    bench::row("slowest step to a prepared photo against two frames, " + size, slowest / kTwoFrames,
               1, std::to_string(slowest * 1e3) + " ms");

    std::vector<double> few, many;
    for (int i = 0; i < 4; ++i) {
        stepInList(scene, jpeg, kShort, few);
        stepInList(scene, jpeg, kLong, many);
    }
    report("slide step with 10,000 records against 10", many, few, 1.2);
    return 0;
}
