#pragma once

#include <QPixmap>
#include <QSize>
#include <QString>

class QPainter;
class QWidget;

// Pictures of the program's own, fitted once to the size they are painted at and then blitted: a
// style sheet's border-image would be stretched anew at every paint. Both keep what they made in
// Qt's pixmap cache.

// The picture stretched over the size (in layout pixels), its outer margin of that many pixels kept
// unstretched, as border-image does. Null when there is no such picture.
QPixmap stretchedPicture(const QString &resource, const QSize &size, int margin,
                         const QWidget *target);

// The picture as large as fits the size (in device pixels), with its proportions.
QPixmap fittedPicture(const QString &resource, const QSize &size);

// Copies part of a picture made for the screen's pixels (area in layout pixels, of a painter that
// starts at the picture's corner). Qt itself would scale such a picture, be it by 1, pixel by
// pixel.
void copyPixels(QPainter &painter, const QPixmap &picture, const QRect &area);
