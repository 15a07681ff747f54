#include "data/picturereader.h"

#include "data/jpegdecoder.h"
#include "data/picturecheck.h"
#include "network/systemconfig.h"

#include <QBuffer>
#include <QImageReader>

#include <utility>

namespace {

const qint64 mostPixels = 64 * 1000 * 1000;
const qint64 mostWorkBytes = 272 * 1000 * 1000;

bool isJpeg(const QImageReader &reader)
{
    return reader.format() == "jpeg";
}

qint64 pixelsOf(const QSize &size)
{
    return qint64(size.width()) * size.height();
}

// Size of the screen in device pixels, turned on its side for a picture that will be turned.
QSize screenFor(const QImageReader &reader)
{
    const QSize screen =
        QSize(SystemConfig::mScreen_Width, SystemConfig::mScreen_Height) * SystemConfig::scale();
    return reader.transformation() & QImageIOHandler::TransformationRotate90 ? screen.transposed()
                                                                             : screen;
}

// The size to decode at, when that is so much smaller that leaving out detail while decoding is
// faster than scaling afterwards; else the picture's own.
QSize decodeSize(const QImageReader &reader)
{
    const QSize size = reader.size();
    const QSize screen = screenFor(reader);
    if (!isJpeg(reader) || screen.isEmpty())
        return size;
    const QSize fitting = size.scaled(screen, Qt::KeepAspectRatio).expandedTo(QSize(1, 1));
    return size.width() >= 2 * fitting.width() && size.height() >= 2 * fitting.height() ? fitting
                                                                                        : size;
}

// A pixmap has 32 bits a pixel; a picture of another depth exists twice while it is converted, one
// that has to be turned while it is turned, and of a moving one the decoder keeps a copy.
qint64 decodedBytes(const QImageReader &reader, const QSize &size)
{
    const int depth = QImage::toPixelFormat(reader.imageFormat()).bitsPerPixel();
    const bool isConverted = reader.imageFormat() != QImage::Format_Invalid && depth != 32;
    const bool isTurned = reader.transformation() != QImageIOHandler::TransformationNone;
    const bool isCopied = reader.format() == "gif";
    const int bits = 32 + (isConverted ? depth : 0) + (isTurned ? 32 : 0) + (isCopied ? 32 : 0);
    return pixelsOf(size) * bits / 8;
}

bool isDecodable(const QImageReader &reader, const QSize &scaled, qint64 workBytes)
{
    const QSize size = reader.size();
    return !size.isEmpty() && pixelsOf(size) <= mostPixels && workBytes >= 0 &&
           workBytes + decodedBytes(reader, scaled) <= mostWorkBytes;
}

// Decodes at the size, or at its own for one that the reader need not scale or turn.
QImage decode(QImageReader &reader, const QByteArray &data, const QSize &size)
{
    const bool isPlain =
        size == reader.size() && reader.transformation() == QImageIOHandler::TransformationNone;
    QImage image = isJpeg(reader) && isPlain ? decodeJpeg(data) : QImage();
    if (!image.isNull())
        return image;
    if (size != reader.size())
        reader.setScaledSize(size);
    return reader.read();
}

} // namespace

QPixmap readPicture(const QByteArray &data)
{
    const QByteArray format = pictureFormat(data);
    QByteArray checked = format == "png" ? withoutTextChunks(data) : data;
    if (format.isEmpty() || checked.isEmpty())
        return QPixmap();

    QBuffer buffer(&checked);
    buffer.open(QIODevice::ReadOnly);
    QImageReader reader(&buffer, format);
    reader.setAutoTransform(true);
    const QSize size = decodeSize(reader);
    const qint64 workBytes = isJpeg(reader) ? jpegWorkBytes(checked) : 0;
    if (!isDecodable(reader, size, workBytes))
        return QPixmap();
    QImage image = decode(reader, checked, size);
    return image.isNull() ? QPixmap() : QPixmap::fromImage(std::move(image));
}
