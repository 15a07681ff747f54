#pragma once

#include <QBuffer>
#include <QImage>
#include <QRandomGenerator>

// A JPEG with soft shapes and some grain, so that it packs about as well as a photo.
inline QByteArray photoJpeg(int width, int height)
{
    QRandomGenerator random(7);
    QImage coarse(width / 24 + 2, height / 24 + 2, QImage::Format_RGB32);
    for (int y = 0; y < coarse.height(); ++y) {
        for (int x = 0; x < coarse.width(); ++x)
            coarse.setPixel(x, y, random.generate());
    }
    QImage image = coarse.scaled(width, height, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    for (int y = 0; y < height; ++y) {
        auto *line = reinterpret_cast<QRgb *>(image.scanLine(y));
        for (int x = 0; x < width; ++x) {
            const int grain = random.bounded(17) - 8;
            line[x] =
                qRgb(qBound(0, qRed(line[x]) + grain, 255), qBound(0, qGreen(line[x]) + grain, 255),
                     qBound(0, qBlue(line[x]) + grain, 255));
        }
    }
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, "jpg", 85);
    return bytes;
}
