#include "common/ui/picture.h"

#include <QFile>
#include <QGuiApplication>
#include <QPixmapCache>
#include <QtMath>

namespace {

// The file with the fewest pixels that are enough for the ratio, else the largest there is.
QString sharpestFile(const QString &path, qreal ratio)
{
    const int dot = path.lastIndexOf(QLatin1Char('.'));
    for (int scale = qMin(3, qCeil(ratio)); scale > 1; --scale) {
        QString file = path.left(dot) + QStringLiteral("@%1x").arg(scale) + path.mid(dot);
        if (QFile::exists(file))
            return file;
    }
    return path;
}

QPixmap makePicture(const QString &path, const QSize &size, qreal ratio)
{
    QPixmap picture(sharpestFile(path, ratio));
    if (picture.isNull())
        return picture;
    const QSize layoutSize =
        size.isEmpty() ? (QSizeF(picture.size()) / picture.devicePixelRatio()).toSize() : size;
    const QSize pixels = (QSizeF(layoutSize) * ratio).toSize();
    if (picture.size() != pixels)
        picture = picture.scaled(pixels, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    picture.setDevicePixelRatio(ratio);
    return picture;
}

} // namespace

QPixmap loadPicture(const QString &path, const QSize &size)
{
    const qreal ratio = qGuiApp->devicePixelRatio();
    // Begins unlike the keys of stretchedPicture(), which shares the cache.
    const QString key = QStringLiteral("x%1 %2x%3 %4")
                            .arg(QString::number(ratio), QString::number(size.width()),
                                 QString::number(size.height()), path);
    QPixmap picture;
    if (!QPixmapCache::find(key, &picture)) {
        picture = makePicture(path, size, ratio);
        QPixmapCache::insert(key, picture);
    }
    return picture;
}
