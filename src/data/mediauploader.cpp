#include "data/mediauploader.h"

#include "base/log.h"
#include "data/picturecheck.h"
#include "data/picturereader.h"
#include "data/posthelper.h"

#include <QFile>
#include <QImage>
#include <QImageReader>

namespace {

// A small file may claim to be a huge picture, so it is looked at like one from the network.
bool isPicture(const QString &filePath)
{
    QFile file(filePath);
    if (!file.open(QIODevice::ReadOnly))
        return false;
    const QByteArray bytes = file.readAll();
    return pictureFormat(bytes) ? !readPicture(bytes).isNull() : !QImage(filePath).isNull();
}

} // namespace

ErrorCode MediaUploader::startToUpload(QString filePath, QString title, QString userId,
                                       QString albumId, QString summary, bool busy)
{
    if (busy)
        return Busy;
    if (!isPicture(filePath)) {
        logLine("MediaUploader::MediaUploader image is null!");
        return NotAnImage;
    }
    QFile file(filePath);
    if (!file.open(QIODevice::ReadOnly))
        return NotOpened;
    const QString mimeType =
        QStringLiteral("image/") + QString::fromLatin1(QImageReader::imageFormat(filePath));
    if (mimeType == QLatin1String("image/"))
        return UnknownFormat;
    const qint64 size = file.size();
    if (size <= 0)
        return UnknownFormat;
    const QByteArray bytes = file.read(size);
    if (bytes.isEmpty())
        return NothingRead;
    file.close();
    logLine("MediaUploader::startToUpload image : ", title);
    return PostHelper::postNewPhoto(userId, albumId, title, summary, mimeType, bytes, bytes.size());
}
