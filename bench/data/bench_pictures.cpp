#include "benchpicture.h"
#include "data/download.h"
#include "data/imagetarget.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "support/bench.h"

#include <QGuiApplication>

#include <memory>
#include <turbojpeg.h>
#include <vector>

namespace {

class Label : public ImageTarget
{
public:
    explicit Label(const QSize &size)
        : mSize(size)
    {
    }
    QSize imageSize() const override { return mSize; }
    void setImage(const QPixmap &picture) override { shown = picture; }
    void setPlaceholder(const QString &) override {}

    QPixmap shown;

private:
    QSize mSize;
};

void decodeAndFit(const QByteArray &jpeg, Label &label)
{
    const std::unique_ptr<QPixmap> picture(
        PhotoManager::createPhoto(jpeg.constData(), jpeg.size()));
    if (!picture)
        qFatal("the picture cannot be decoded");
    Download::showPicture(&label, *picture);
}

void decodeRaw(tjhandle decoder, const QByteArray &jpeg)
{
    const auto *data = reinterpret_cast<const unsigned char *>(jpeg.constData());
    int width = 0, height = 0, subsampling = 0, colours = 0;
    tjDecompressHeader3(decoder, data, jpeg.size(), &width, &height, &subsampling, &colours);
    std::unique_ptr<unsigned char[]> pixels(new unsigned char[size_t(width) * height * 4]);
    if (tjDecompress2(decoder, data, jpeg.size(), pixels.get(), width, 0, height, TJPF_BGRX, 0))
        qFatal("%s", tjGetErrorStr2(decoder));
}

void measure(const char *what, const QSize &source, const QSize &labelSize, double goal, int count)
{
    const QByteArray jpeg = photoJpeg(source.width(), source.height());
    Label label(labelSize);
    const tjhandle decoder = tjInitDecompress();
    const auto times = [count](const bench::Work &work) {
        return [=] {
            for (int i = 0; i < count; ++i)
                work();
        };
    };
    const bench::Comparison result = bench::compare(21, times([&] { decodeAndFit(jpeg, label); }),
                                                    times([&] { decodeRaw(decoder, jpeg); }));
    tjDestroy(decoder);
    bench::row(what, result.ratio, goal, bench::milliseconds(result));
}

} // namespace

int main(int argc, char *argv[])
{
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QGuiApplication application(argc, argv);
    SystemConfig::mScreen_Width = 1920;
    SystemConfig::mScreen_Height = 1080;
    PhotoManager::init();

    measure("decode and fit, 1080p, at the label's size", {1920, 1080}, {1920, 1080}, 1.5, 4);
    measure("decode and fit, 1080p, scaled to 1500x844", {1920, 1080}, {1500, 844}, 1.5, 4);
    measure("decode and fit, thumbnails, at the label's size", {280, 200}, {280, 200}, 1.8, 80);
    measure("decode and fit, thumbnails, scaled to 266x200", {288, 216}, {280, 200}, 1.8, 80);
    measure("decode and fit, source twice the label", {3840, 2160}, {1920, 1080}, 1.05, 2);
    measure("decode and fit, 12 megapixels", {4000, 3000}, {1920, 1080}, 1.05, 2);
    return 0;
}
