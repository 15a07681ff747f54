#pragma once

#include <QPixmap>
#include <QRect>

class QPainter;
class QRegion;

// What lies behind the home screen: the background and, over it, the frame of the content (the look
// "QContentFrame{border-image:url(:/res/Content_Bg.png); border: 0px;}"). Stretched once for a
// size; after that a repaint takes a single copy.
class Backdrop
{
public:
    // Paints that part of a screen of this size; all in layout pixels.
    void paint(QPainter &painter, const QRegion &region, const QSize &screen, const QRect &frame);

private:
    void render(const QSize &screen, qreal ratio);

    QPixmap mPixels; // the screen's own
    QRect mFrame;
};
