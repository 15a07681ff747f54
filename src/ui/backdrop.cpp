#include "ui/backdrop.h"

#include "common/ui/screenbackground.h"
#include "common/ui/stretchedpicture.h"

#include <QPainter>
#include <QRegion>

void Backdrop::paint(QPainter &painter, const QRegion &region, const QSize &screen,
                     const QRect &frame)
{
    const qreal ratio = painter.device()->devicePixelRatioF();
    if (mPixels.size() != (QSizeF(screen) * ratio).toSize() || mFrame != frame) {
        mFrame = frame;
        render(screen, ratio);
    }
    for (const QRect &area : region)
        copyPixels(painter, mPixels, area, ratio);
}

void Backdrop::render(const QSize &screen, qreal ratio)
{
    mPixels = screenBackground((QSizeF(screen) * ratio).toSize());
    QPainter painter(&mPixels);
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    painter.scale(ratio, ratio);
    painter.drawPixmap(mFrame, QPixmap(QStringLiteral(":/res/Content_Bg.png")));
}
