#include "ui/zoom.h"

#include <QRegularExpression>
#include <QtMath>

#include <algorithm>

namespace zoom {

namespace {

constexpr qreal kLeast = 4;
constexpr qreal kMost = 64;
constexpr qreal kPanStep = 1.0 / 3; // of the view
constexpr int kBytesPerPixel = 4;

bool isNear(int larger, int smaller)
{
    return larger - smaller <= std::max(1, smaller / 20);
}

qreal nearestOnAxis(qreal centre, qreal drawn, qreal view)
{
    if (drawn <= view)
        return 0.5;
    const qreal margin = view / 2 / drawn;
    return std::clamp(centre, margin, 1 - margin);
}

} // namespace

bool areAlike(const QSize &photo, const QSize &picture)
{
    if (photo.isEmpty() || picture.isEmpty())
        return false;
    const QSize whole = photo.scaled(picture, Qt::KeepAspectRatioByExpanding);
    return isNear(whole.width(), picture.width()) && isNear(whole.height(), picture.height());
}

QSizeF fittedSize(const QSize &photo, const QSizeF &view)
{
    return QSizeF(photo).scaled(view, Qt::KeepAspectRatio);
}

QVector<qreal> factors(const QSizeF &fitted, const QSizeF &view)
{
    if (fitted.isEmpty())
        return {2, kLeast};
    const qreal cover = std::max(view.width() / fitted.width(), view.height() / fitted.height());
    const qreal last = std::clamp(cover, kLeast, kMost);
    QVector<qreal> result;
    for (qreal factor = 2; factor * 1.25 < last; factor *= 2)
        result << factor;
    return result << last;
}

QPointF nearestCentre(const QPointF &centre, const QSizeF &drawn, const QSizeF &view)
{
    return {nearestOnAxis(centre.x(), drawn.width(), view.width()),
            nearestOnAxis(centre.y(), drawn.height(), view.height())};
}

QPointF panned(const QPointF &centre, const QPoint &direction, const QSizeF &drawn,
               const QSizeF &view)
{
    if (drawn.isEmpty())
        return centre;
    const QPointF moved =
        centre + QPointF(direction.x() * kPanStep * view.width() / drawn.width(),
                         direction.y() * kPanStep * view.height() / drawn.height());
    return nearestCentre(moved, drawn, view);
}

QRectF placement(const QPointF &centre, const QSizeF &drawn, const QSizeF &view)
{
    return {QPointF(view.width() / 2 - centre.x() * drawn.width(),
                    view.height() / 2 - centre.y() * drawn.height()),
            drawn};
}

int sourceWidth(const QSize &photo, qreal drawnWidth, qint64 mostBytes)
{
    if (photo.isEmpty())
        return 0;
    const qreal mostPixels = qreal(mostBytes) / kBytesPerPixel;
    const qreal affordable = std::sqrt(mostPixels * photo.width() / photo.height());
    return int(std::min({drawnWidth, affordable, qreal(photo.width())}));
}

QString addressForWidth(const QString &url, int width)
{
    static const QRegularExpression segment(QStringLiteral("/s\\d+(?=/[^/]*$)"));
    const QRegularExpressionMatch match = segment.match(url);
    if (!match.hasMatch() || width <= 0)
        return url;
    return url.left(match.capturedStart()) + QStringLiteral("/s") + QString::number(width) +
           url.mid(match.capturedEnd());
}

} // namespace zoom
