#include "ui/slidemotion.h"

#include <QtMath>

namespace slidemotion {

QRect centred(const QSize &photo, const QSize &screen)
{
    return {QPoint((screen.width() - photo.width()) / 2, (screen.height() - photo.height()) / 2),
            photo};
}

QRectF moved(const QSize &photo, const QSize &screen, qreal moment, int percent, int turn)
{
    const QRect rest = centred(photo, screen);
    const qreal growth = qBound(0.0, moment, 1.0) * percent / 100;
    QRectF place(QPointF(), QSizeF(photo) * (1 + growth));
    place.moveCenter(QRectF(rest).center());
    // On each side it reaches over its place at rest by half of what it has grown: a part of that
    // is the way that it may go.
    const QPointF way(photo.width() * growth / 4, photo.height() * growth / 4);
    place.translate(turn % 2 ? way.x() : -way.x(), turn / 2 % 2 ? way.y() : -way.y());
    return place;
}

QPoint drift(int turn, int radius)
{
    const qreal angle = turn * 2 * M_PI / 8;
    return {qRound(radius * qCos(angle)), qRound(radius * qSin(angle))};
}

} // namespace slidemotion
