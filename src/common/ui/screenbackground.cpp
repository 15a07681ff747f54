#include "common/ui/screenbackground.h"

#include <QPalette>
#include <QVector>
#include <QWidget>

#include <random>

namespace {

constexpr int kNoiseSteps = 256; // places at which a line's noise may begin

// One line's colours, each of sixteen bits.
struct Line
{
    QVector<quint16> red, green, blue;
};

// Where a pixel of the target lies: between two of the source.
struct Place
{
    int first;
    uint weight; // of the second, in 256ths
};

QVector<Place> placesOf(int target, int source)
{
    QVector<Place> places(target);
    for (int i = 0; i < target; ++i) {
        const qint64 at = qMax<qint64>(0, (2 * i + 1) * qint64(source) * 128 / target - 128);
        const int first = int(qMin<qint64>(at / 256, source - 2));
        places[i] = {first, uint(qMin<qint64>(256, at - 256 * first))};
    }
    return places;
}

// What lies between two values; what is left below the brightest is for the noise.
quint16 between(uint first, uint second, uint weight)
{
    return quint16(((first * (256 - weight) + second * weight) >> 8) * 255 / 256);
}

Line spread(const QImage &source, int number, const QVector<Place> &places)
{
    const int width = places.size();
    const auto *pixels = reinterpret_cast<const QRgba64 *>(source.constScanLine(number));
    Line line{QVector<quint16>(width), QVector<quint16>(width), QVector<quint16>(width)};
    for (int x = 0; x < width; ++x) {
        const Place place = places.at(x);
        const QRgba64 left = pixels[place.first];
        const QRgba64 right = pixels[place.first + 1];
        line.red[x] = between(left.red(), right.red(), place.weight);
        line.green[x] = between(left.green(), right.green(), place.weight);
        line.blue[x] = between(left.blue(), right.blue(), place.weight);
    }
    return line;
}

QVector<quint16> makeNoise(int width)
{
    std::minstd_rand random;
    QVector<quint16> noise(width + kNoiseSteps);
    for (quint16 &value : noise)
        value = quint16(random() >> 8);
    return noise;
}

// The noise decides which of the two nearest shades a pixel takes.
void mix(const Line &above, const Line &below, uint weight, const quint16 *noise, QRgb *target)
{
    const uint rest = 256 - weight;
    const quint16 *const red[] = {above.red.data(), below.red.data()};
    const quint16 *const green[] = {above.green.data(), below.green.data()};
    const quint16 *const blue[] = {above.blue.data(), below.blue.data()};
    const int width = above.red.size();
    for (int x = 0; x < width; ++x) {
        const uint r = (red[0][x] * rest + red[1][x] * weight + noise[x]) >> 16;
        const uint g = (green[0][x] * rest + green[1][x] * weight + noise[x]) >> 16;
        const uint b = (blue[0][x] * rest + blue[1][x] * weight + noise[x]) >> 16;
        target[x] = 0xff000000u | r << 16 | g << 8 | b;
    }
}

} // namespace

QPixmap screenBackground(const QSize &pixels)
{
    const QImage source = QImage(QStringLiteral(":/res/orvala_background.png"))
                              .convertToFormat(QImage::Format_RGBX64);
    QImage target(pixels, QImage::Format_RGB32);
    if (source.width() < 2 || source.height() < 2 || target.isNull())
        return QPixmap();
    const QVector<quint16> noise = makeNoise(pixels.width());
    const QVector<Place> columns = placesOf(pixels.width(), source.width());
    const QVector<Place> rows = placesOf(pixels.height(), source.height());
    Line above;
    Line below;
    int last = -2;
    for (int y = 0; y < pixels.height(); ++y) {
        const Place place = rows.at(y);
        if (place.first != last) {
            above = place.first == last + 1 ? below : spread(source, place.first, columns);
            below = spread(source, place.first + 1, columns);
            last = place.first;
        }
        mix(above, below, place.weight, noise.data() + y * 151 % kNoiseSteps,
            reinterpret_cast<QRgb *>(target.scanLine(y)));
    }
    return QPixmap::fromImage(target);
}

void setScreenBackground(QWidget *widget)
{
    QPalette palette = widget->palette();
    palette.setBrush(QPalette::Window, screenBackground(widget->size()));
    palette.setBrush(QPalette::WindowText, Qt::white);
    widget->setPalette(palette);
    widget->setAutoFillBackground(true);
}
