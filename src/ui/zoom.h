#pragma once

#include <QPointF>
#include <QRectF>
#include <QSize>
#include <QSizeF>
#include <QString>
#include <QVector>

// Arithmetic of the magnified photo: plain functions. A factor of 1 is the photo as it fits the
// view; a centre is the point of the photo in the middle of the view, from 0 to 1 on both axes.
namespace zoom {

// Whether a photo's size and that of a smaller picture have the same proportions, but for rounding;
// never for an empty size.
bool areAlike(const QSize &photo, const QSize &picture);

// The photo's size as it just fits the view.
QSizeF fittedSize(const QSize &photo, const QSizeF &view);

// The factors to step through, in rising order, all above 1: doubling until a photo of this fitted
// size covers the view, but at least to 4. Panoramas so get as far as others.
QVector<qreal> factors(const QSizeF &fitted, const QSizeF &view);

// The nearest centre that leaves no empty space beside a photo drawn this large; the middle on an
// axis on which the whole of it is seen.
QPointF nearestCentre(const QPointF &centre, const QSizeF &drawn, const QSizeF &view);

// A step in a direction (-1, 0 or 1 on each axis), of a third of the view.
QPointF panned(const QPointF &centre, const QPoint &direction, const QSizeF &drawn,
               const QSizeF &view);

// Where the whole photo lies, in the view's coordinates.
QRectF placement(const QPointF &centre, const QSizeF &drawn, const QSizeF &view);

// Width in pixels to ask the service for, for a photo drawn that many device pixels wide: never
// more than the photo has, nor than the decoded picture may take (bytes).
int sourceWidth(const QSize &photo, qreal drawnWidth, qint64 mostBytes);

// The address of the picture in another width; unchanged when it names none.
QString addressForWidth(const QString &url, int width);

} // namespace zoom
