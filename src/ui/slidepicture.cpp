#include "ui/slidepicture.h"

#include "ui/slidemotion.h"

#include <QImage>
#include <QPainter>
#include <QRegion>

#include <utility>

namespace {

constexpr int kBlurredWidth = 20;      // pixels across the screen that are left of the photo
constexpr int kDoublings = 4;          // steps back: each smooths, so that no pixel can be made out
constexpr int kDarkening = 110;        // of 255, under white texts
constexpr int kThinnestBand = 4;       // pixels; what is less stays black
constexpr QRgb kNight = qRgb(0, 0, 0); // beside photos without a fill

// The part in the photo's middle that has the screen's proportions.
QRect middlePart(const QSize &photo, const QSize &screen)
{
    QRect part(QPoint(), screen.scaled(photo, Qt::KeepAspectRatio).expandedTo(QSize(1, 1)));
    part.moveCenter(QRect(QPoint(), photo).center());
    return part;
}

// The photo over the whole screen, out of focus, in as few pixels as look smooth once enlarged.
QImage outOfFocus(const QPixmap &photo, const QSize &screen)
{
    const QSize few(kBlurredWidth, qMax(1, kBlurredWidth * screen.height() / screen.width()));
    const QImage part = photo.copy(middlePart(photo.size(), screen)).toImage();
    const QImage rough = part.scaled(few * 4, Qt::IgnoreAspectRatio, Qt::FastTransformation)
                             .scaled(few, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    QImage smooth = rough.convertToFormat(QImage::Format_RGB32);
    for (int i = 0; i < kDoublings; ++i)
        smooth = smooth.scaled(smooth.size() * 2, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    QPainter(&smooth).fillRect(smooth.rect(), QColor(0, 0, 0, kDarkening));
    return smooth;
}

QVector<QRect> bandsBeside(const QRect &photo, const QSize &screen)
{
    QVector<QRect> bands;
    const QRegion beside = QRegion(QRect(QPoint(), screen)).subtracted(photo);
    for (const QRect &band : beside) {
        if (qMin(band.width(), band.height()) >= kThinnestBand)
            bands << band;
    }
    return bands;
}

SlidePicture::Band cut(const QImage &fill, const QRect &band, const QSize &screen)
{
    const qreal across = qreal(fill.width()) / screen.width();
    const qreal down = qreal(fill.height()) / screen.height();
    const QRectF source(band.x() * across, band.y() * down, band.width() * across,
                        band.height() * down);
    QImage pixels(band.size(), QImage::Format_RGB32);
    QPainter painter(&pixels);
    painter.setCompositionMode(QPainter::CompositionMode_Source);
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    painter.drawImage(QRectF(pixels.rect()), fill, source);
    painter.end();
    return {band, QPixmap::fromImage(std::move(pixels))};
}

} // namespace

void SlidePicture::paint(QPainter &painter, const QRectF &photoPlace) const
{
    const QRegion whole(QRect(QPoint(), screen));
    QRegion night = whole.subtracted(place);
    for (const Band &band : bands) {
        painter.drawPixmap(band.place.topLeft(), band.pixels);
        night -= band.place;
    }
    for (const QRect &part : night)
        painter.fillRect(part, QColor(kNight));
    const bool isAtRest = photoPlace == QRectF(place);
    painter.setRenderHint(QPainter::SmoothPixmapTransform, !isAtRest);
    painter.drawPixmap(photoPlace, photo, QRectF(photo.rect()));
}

SlidePicture makeSlide(const QPixmap &fitted, const QSize &screen, bool isFilled)
{
    SlidePicture slide;
    slide.screen = screen;
    slide.photo = fitted;
    slide.place = slidemotion::centred(fitted.size(), screen);
    if (!isFilled || fitted.isNull() || screen.isEmpty())
        return slide;
    const QVector<QRect> places = bandsBeside(slide.place, screen);
    if (places.isEmpty())
        return slide;
    const QImage fill = outOfFocus(fitted, screen);
    for (const QRect &band : places)
        slide.bands << cut(fill, band, screen);
    return slide;
}
