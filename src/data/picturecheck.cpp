#include "data/picturecheck.h"

#include <QtEndian>

#include <optional>

namespace {

const int signatureLength = 8;
const int chunkFrame = 12; // length, type and check sum around a PNG chunk's data
const int mostScans = 100; // encoders write about ten

// One segment of a JPEG's header: its marker and where its contents stand.
struct Segment
{
    quint8 marker = 0;
    int begin = 0;
    int length = 0;
};

const quint8 startOfScan = 0xDA;

bool startsFrame(quint8 marker)
{
    return marker >= 0xC0 && marker <= 0xCF && marker != 0xC4 && marker != 0xC8 && marker != 0xCC;
}

bool isProgressive(quint8 frameMarker)
{
    return frameMarker == 0xC2 || frameMarker == 0xC6 || frameMarker == 0xCA || frameMarker == 0xCE;
}

quint8 byteAt(const QByteArray &data, int at)
{
    return static_cast<quint8>(data.at(at));
}

int wordAt(const QByteArray &data, int at)
{
    return qFromBigEndian<quint16>(data.constData() + at);
}

// The segment at or after the position, which moves behind it; nothing where no segment fits.
std::optional<Segment> nextSegment(const QByteArray &jpeg, int &position)
{
    position = jpeg.indexOf('\xff', position);
    while (position >= 0 && position < jpeg.size() && byteAt(jpeg, position) == 0xFF)
        ++position;
    if (position < 0 || jpeg.size() - position < 3)
        return std::nullopt;
    const int length = wordAt(jpeg, position + 1);
    const Segment segment = {byteAt(jpeg, position), position + 3, length - 2};
    if (length < 2 || segment.length > jpeg.size() - segment.begin)
        return std::nullopt;
    position = segment.begin + segment.length;
    return segment;
}

// Two bytes for each sample of each component, by the components' sampling factors.
qint64 coefficientBytes(const QByteArray &jpeg, const Segment &frame)
{
    const int componentCount = byteAt(jpeg, frame.begin + 5);
    qint64 samples = 0;
    int widest = 1, highest = 1;
    for (int i = 0; i < componentCount; ++i) {
        const quint8 sampling = byteAt(jpeg, frame.begin + 6 + 3 * i + 1);
        widest = qMax(widest, sampling >> 4);
        highest = qMax(highest, sampling & 15);
        samples += (sampling >> 4) * (sampling & 15);
    }
    const qint64 pixels = qint64(wordAt(jpeg, frame.begin + 1)) * wordAt(jpeg, frame.begin + 3);
    return 2 * pixels * samples / (widest * highest);
}

bool isWholeFrame(const QByteArray &jpeg, const Segment &frame)
{
    return frame.length >= 6 && frame.length >= 6 + 3 * byteAt(jpeg, frame.begin + 5);
}

} // namespace

const char *pictureFormat(const QByteArray &data)
{
    static const struct
    {
        const char *start;
        const char *format;
    } formats[] = {
        {"\xff\xd8\xff", "jpeg"},
        {"\x89PNG\r\n\x1a\n", "png"},
        {"GIF8", "gif"},
        {"BM", "bmp"},
    };
    for (const auto &known : formats) {
        if (data.startsWith(known.start))
            return known.format;
    }
    return data.startsWith("RIFF") && data.mid(8, 4) == "WEBP" ? "webp" : nullptr;
}

QByteArray withoutTextChunks(const QByteArray &png)
{
    QByteArray kept;
    int keptUntil = 0; // what stands before is in the copy already, or left out
    int position = signatureLength;
    while (position < png.size()) {
        const int left = png.size() - position - chunkFrame;
        const quint32 length = left < 0 ? 0 : qFromBigEndian<quint32>(png.constData() + position);
        if (left < 0 || length > static_cast<quint32>(left))
            return QByteArray();
        const int end = position + chunkFrame + static_cast<int>(length);
        const QByteArray type = QByteArray::fromRawData(png.constData() + position + 4, 4);
        if (type == "tEXt" || type == "zTXt" || type == "iTXt") {
            kept.append(png.constData() + keptUntil, position - keptUntil);
            keptUntil = end;
        }
        position = end;
        if (type == "IEND")
            break;
    }
    if (keptUntil == 0)
        return png;
    return kept.append(png.constData() + keptUntil, position - keptUntil);
}

qint64 jpegWorkBytes(const QByteArray &jpeg)
{
    std::optional<Segment> frame;
    int position = 2;
    while (const auto segment = nextSegment(jpeg, position)) {
        if (startsFrame(segment->marker)) {
            if (!isWholeFrame(jpeg, *segment))
                return -1;
            frame = segment;
        }
        if (segment->marker != startOfScan)
            continue;
        if (!frame || segment->length < 1)
            return -1;
        const bool wholeInOneScan = byteAt(jpeg, segment->begin) == byteAt(jpeg, frame->begin + 5);
        if (wholeInOneScan && !isProgressive(frame->marker))
            return 0;
        return jpeg.count("\xff\xda") > mostScans ? -1 : coefficientBytes(jpeg, *frame);
    }
    return -1;
}
