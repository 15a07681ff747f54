#include "data/mediauploader.h"

#include "base/log.h"
#include "data/picturereader.h"
#include "data/posthelper.h"

#include <QFile>
#include <QImage>
#include <QImageReader>

ErrorCode MediaUploader::startToUpload(QString filePath, QString title, QString userId,
                                       QString albumId, QString summary, bool busy)
{
    if (busy)
        return Busy;
    if (QImage(filePath).isNull()) {
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
