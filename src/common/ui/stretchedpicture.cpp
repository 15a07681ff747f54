#include "common/ui/stretchedpicture.h"

#include <QFile>
#include <QPainter>
#include <QPixmapCache>
#include <QWidget>
#include <qdrawutil.h>

namespace {

QString keyOf(const QString &resource, const QSize &size, int margin)
{
    return QStringLiteral("%1 %2x%3 %4")
        .arg(resource, QString::number(size.width()), QString::number(size.height()),
             QString::number(margin));
}

// What a border picture is on a dense screen: the same, drawn that many times as large. Qt would
// take a file named @3x for a style sheet as well, and cut it in the wrong places.
constexpr int kLargeScale = 3;
constexpr int kPanelRadius = 8;

QString largeFile(const QString &resource)
{
    QString file = resource;
    return file.insert(file.lastIndexOf(QLatin1Char('.')), QStringLiteral("-large"));
}

QPixmap stretchedColumn(const QString &resource, int height)
{
    const QString key = keyOf(resource, {0, height}, -1);
    QPixmap column;
    if (!QPixmapCache::find(key, &column)) {
        const QPixmap source(resource);
        if (source.isNull())
            return source;
        column =
            source.scaled(source.width(), height, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
        QPixmapCache::insert(key, column);
    }
    return column;
}

void drawStretched(QPainter &painter, const QString &resource, const QSize &size, int margin)
{
    const QString large = largeFile(resource);
    const bool isLarge = painter.device()->devicePixelRatioF() > 1 && QFile::exists(large);
    const QPixmap source(isLarge ? large : resource);
    const int cut = isLarge ? margin * kLargeScale : margin;
    qDrawBorderPixmap(&painter, QRect(QPoint(0, 0), size), QMargins(margin, margin, margin, margin),
                      source, source.rect(), QMargins(cut, cut, cut, cut));
}

} // namespace

QPixmap stretchedPicture(const QString &resource, const QSize &size, int margin,
                         const QWidget *target)
{
    const qreal ratio = target->devicePixelRatioF();
    const QSize pixels = (QSizeF(size) * ratio).toSize();
    const QString key = keyOf(resource, pixels, margin);
    QPixmap stretched;
    if (QPixmapCache::find(key, &stretched))
        return stretched;
    if (pixels.isEmpty() || !QFile::exists(resource))
        return QPixmap();
    stretched = QPixmap(pixels);
    stretched.fill(Qt::transparent);
    stretched.setDevicePixelRatio(ratio);
    QPainter painter(&stretched);
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    drawStretched(painter, resource, size, margin);
    painter.end();
    QPixmapCache::insert(key, stretched);
    return stretched;
}

QPixmap fittedPicture(const QString &resource, const QSize &size)
{
    const QString key = keyOf(resource, size, -1);
    QPixmap fitted;
    if (QPixmapCache::find(key, &fitted))
        return fitted;
    const QPixmap source(resource);
    if (source.isNull() || size.isEmpty())
        return QPixmap();
    fitted = source.scaled(size, Qt::KeepAspectRatio, Qt::SmoothTransformation);
    QPixmapCache::insert(key, fitted);
    return fitted;
}

void paintPanel(QPainter &painter, const QString &resource, const QSize &size, Qt::Edges round)
{
    const qreal ratio = painter.device()->devicePixelRatioF();
    QBrush ground(stretchedColumn(resource, qRound(size.height() * ratio)));
    ground.setTransform(QTransform::fromScale(1 / ratio, 1 / ratio));
    QRectF shape(QPointF(0, 0), size);
    // The corners that stay square lie outside.
    shape.adjust(0, round & Qt::TopEdge ? 0 : -kPanelRadius, 0,
                 round & Qt::BottomEdge ? 0 : kPanelRadius);
    painter.save();
    painter.setClipRect(QRect(QPoint(0, 0), size), Qt::IntersectClip);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(ground);
    painter.drawRoundedRect(shape, kPanelRadius, kPanelRadius);
    painter.restore();
}

void copyPixels(QPainter &painter, const QPixmap &pixels, const QRect &area, qreal ratio)
{
    const QRect part = QRectF(QPointF(area.topLeft()) * ratio, QSizeF(area.size()) * ratio)
                           .toAlignedRect()
                           .intersected(pixels.rect());
    painter.save();
    painter.scale(1 / ratio, 1 / ratio);
    painter.drawPixmap(part.topLeft(), pixels, part);
    painter.restore();
}
