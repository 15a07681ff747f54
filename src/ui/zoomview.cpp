#include "ui/zoomview.h"

#include "base/i18n.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"
#include "ui/detailtexts.h"
#include "ui/zoom.h"

#include <QPainter>

namespace {

constexpr QSize kMapRoom(200, 120);
constexpr int kMargin = 12;
constexpr int kKeysHeight = 40;

const QColor kGround(0x0b, 0x10, 0x16);

} // namespace

ZoomView::ZoomView(QWidget *parent)
    : QWidget(parent)
    , mKeys(new ShortcutBar(this))
{
    setAttribute(Qt::WA_OpaquePaintEvent);
    mKeys->addEntry(DEVICE_SELECT_KEY, DetailTexts::text(DetailTexts::Closer));
    mKeys->addEntry(DEVICE_PAGEDOWN_KEY, DetailTexts::text(DetailTexts::Farther));
    mKeys->addEntry(DEVICE_RETURN_KEY, I18n::shortCut(2));
    hide();
}

void ZoomView::open(const QPixmap &picture, const QSize &photo)
{
    mPhotoSize = zoom::areAlike(photo, picture.size()) ? photo : picture.size();
    mFitted = zoom::fittedSize(mPhotoSize, size());
    mFactors = zoom::factors(mFitted, size());
    mCentre = QPointF(0.5, 0.5);
    setImage(picture);
    setStep(0);
    show();
    raise();
}

// Lets go of the picture, which may be a large one.
void ZoomView::dismiss()
{
    hide();
    mPicture = mMap = QPixmap();
}

void ZoomView::leave()
{
    dismiss();
    emit left();
}

qreal ZoomView::largestWidth() const
{
    return mFactors.isEmpty() ? 0 : mFitted.width() * mFactors.last() * devicePixelRatioF();
}

void ZoomView::setImage(const QPixmap &picture)
{
    const qreal ratio = devicePixelRatioF();
    mPicture = picture;
    mPicture.setDevicePixelRatio(1);
    const QSize room = (QSizeF(kMapRoom) * ratio).toSize();
    mMap = mPicture.scaled(mPhotoSize.scaled(room, Qt::KeepAspectRatio).expandedTo(QSize(1, 1)),
                           Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    mMap.setDevicePixelRatio(ratio);
    update();
}

bool ZoomView::handleKey(int key)
{
    switch (key) {
    case DEVICE_LEFT_KEY:
        pan(-1, 0);
        return true;
    case DEVICE_RIGHT_KEY:
        pan(1, 0);
        return true;
    case DEVICE_UP_KEY:
        pan(0, -1);
        return true;
    case DEVICE_DOWN_KEY:
        pan(0, 1);
        return true;
    case DEVICE_SELECT_KEY:
        setStep(mStep + 1 < mFactors.size() ? mStep + 1 : 0);
        return true;
    case DEVICE_PAGEUP_KEY:
        setStep(qMin(mStep + 1, mFactors.size() - 1));
        return true;
    case DEVICE_PAGEDOWN_KEY:
        if (mStep == 0)
            leave();
        else
            setStep(mStep - 1);
        return true;
    case DEVICE_RETURN_KEY:
        leave();
        return true;
    default:
        return false;
    }
}

void ZoomView::setStep(int step)
{
    mStep = step;
    mCentre = zoom::nearestCentre(mCentre, drawnSize(), size());
    update();
}

void ZoomView::pan(int x, int y)
{
    mCentre = zoom::panned(mCentre, QPoint(x, y), drawnSize(), size());
    update();
}

QSizeF ZoomView::drawnSize() const
{
    return mFitted * factor();
}

// Only the part that is seen is scaled, straight from the picture's own pixels.
void ZoomView::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    painter.fillRect(rect(), kGround);
    const QRectF photo = zoom::placement(mCentre, drawnSize(), size());
    const QRectF seen = photo & QRectF(rect());
    if (mPicture.isNull() || photo.isEmpty() || seen.isEmpty())
        return;
    const qreal x = mPicture.width() / photo.width();
    const qreal y = mPicture.height() / photo.height();
    const QRectF part((seen.left() - photo.left()) * x, (seen.top() - photo.top()) * y,
                      seen.width() * x, seen.height() * y);
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    painter.drawPixmap(seen, mPicture, part);
    painter.fillRect(0, mKeys->y(), width(), mKeys->height(), QColor(0x0b, 0x10, 0x16, 0xc8));
    paintMap(painter, photo);
}

// Where in the photo the view is.
void ZoomView::paintMap(QPainter &painter, const QRectF &photo) const
{
    const QSizeF map = QSizeF(mMap.size()) / mMap.devicePixelRatioF();
    const QRectF area(QPointF(width() - map.width() - kMargin, kMargin), map);
    painter.fillRect(area.adjusted(-3, -3, 3, 3), kGround);
    painter.drawPixmap(area.topLeft(), mMap);
    const qreal scale = map.width() / photo.width();
    const QRectF seen((rect().left() - photo.left()) * scale, (rect().top() - photo.top()) * scale,
                      width() * scale, height() * scale);
    painter.fillRect(area, QColor(0x0b, 0x10, 0x16, 0x60));
    const QRectF frame = seen.translated(area.topLeft()) & area;
    painter.drawPixmap(frame, mMap,
                       QRectF((frame.topLeft() - area.topLeft()) * mMap.devicePixelRatioF(),
                              frame.size() * mMap.devicePixelRatioF()));
    painter.setPen(QPen(QColor(0xf2, 0xf6, 0xf9), 2));
    painter.drawRect(frame);
}

void ZoomView::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    mKeys->setGeometry(0, height() - kKeysHeight, width() - kMargin, kKeysHeight);
    if (mPicture.isNull())
        return;
    mFitted = zoom::fittedSize(mPhotoSize, size());
    mFactors = zoom::factors(mFitted, size());
    setStep(qMin(mStep, mFactors.size() - 1));
}
