#pragma once

#include <QPixmap>
#include <QRect>
#include <QVector>

class QPainter;

// A photo as the slide show paints it, made for one size of the screen: the photo already scaled to
// fit, and what fills the room beside it. Sizes are device pixels.
struct SlidePicture
{
    struct Band
    {
        QRect place;
        QPixmap pixels;
    };

    QSize screen;
    QPixmap photo;
    QRect place;         // of the photo at rest
    QVector<Band> bands; // beside it, or above and below; none: black

    bool isNull() const { return photo.isNull(); }
    // With the photo at another place than at rest, which it must cover.
    void paint(QPainter &painter, const QRectF &photoPlace) const;
    void paint(QPainter &painter) const { paint(painter, place); }
};

// A photo scaled to fit the screen, ready to be painted; with the bands filled by the photo itself,
// out of focus and darkened, or without.
SlidePicture makeSlide(const QPixmap &fitted, const QSize &screen, bool isFilled);
