#pragma once

#include <QPixmap>
#include <QSize>
#include <QString>

class QPainter;
class QWidget;

// Pictures of the program's own, fitted once to the size they are painted at and then blitted: a
// style sheet's border-image would be stretched anew at every paint. Both keep what they made in
// Qt's pixmap cache.

// The border of most such pictures, in layout pixels.
constexpr int kPictureBorder = 6;

// The picture stretched over the size (in layout pixels), its outer margin of that many pixels kept
// unstretched, as border-image does. Null when there is no such picture.
QPixmap stretchedPicture(const QString &resource, const QSize &size, int margin,
                         const QWidget *target);

// The picture as large as fits the size (in device pixels), with its proportions.
QPixmap fittedPicture(const QString &resource, const QSize &size);

// Paints a pop-up's ground from the painter's origin: the picture, which is the same from left to
// right, stretched to the height, with round corners at the edges given.
void paintPanel(QPainter &painter, const QString &resource, const QSize &size, Qt::Edges round);

// Copies part of a picture that holds the screen's own pixels (with a device pixel ratio of 1): the
// area is in layout pixels, the painter starts at the picture's corner, the ratio is the screen's.
// Left to itself, Qt scales such a picture pixel by pixel, be it by 1.
void copyPixels(QPainter &painter, const QPixmap &pixels, const QRect &area, qreal ratio);
