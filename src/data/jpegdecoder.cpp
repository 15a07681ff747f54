#include "data/jpegdecoder.h"

#include <memory>
#include <turbojpeg.h>

QImage decodeJpeg(const QByteArray &jpeg)
{
    const std::unique_ptr<void, int (*)(tjhandle)> decoder(tjInitDecompress(), &tjDestroy);
    if (!decoder)
        return QImage();

    const auto *bytes = reinterpret_cast<const unsigned char *>(jpeg.constData());
    const auto length = static_cast<unsigned long>(jpeg.size());
    int width = 0, height = 0, sampling = 0, colours = 0;
    if (tjDecompressHeader3(decoder.get(), bytes, length, &width, &height, &sampling, &colours))
        return QImage();
    if (colours == TJCS_CMYK || colours == TJCS_YCCK)
        return QImage();

    QImage image(width, height, QImage::Format_RGB32);
    if (image.isNull())
        return QImage();
    const int failed = tjDecompress2(decoder.get(), bytes, length, image.bits(), width,
                                     image.bytesPerLine(), height, TJPF_BGRA, 0);
    // A warning is a picture that is cut or has small faults: what there is of it is shown.
    return failed && tjGetErrorCode(decoder.get()) != TJERR_WARNING ? QImage() : image;
}
