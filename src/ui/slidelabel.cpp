#include "ui/slidelabel.h"

#include "base/log.h"
#include "common/ui/picture.h"
#include "platform/devicestate.h"

#include <QDateTime>
#include <QPainter>
#include <QTimerEvent>

namespace {

constexpr int kFadeFrame = 16;   // milliseconds
constexpr int kMotionFrame = 33; // a slow motion needs no more
constexpr int kPaintTime = 12;   // milliseconds that a frame may take to paint
constexpr int kPatience = 5;     // halves of a frame's time after which the next one is late

int frameTime(bool isFading)
{
    return isFading ? kFadeFrame : kMotionFrame;
}

QDateTime localTime()
{
    if (!IsSetTimeZone)
        return QDateTime::currentDateTime();
    return QDateTime::currentDateTimeUtc().addSecs(Q_INT64_C(3600) * TimeZone);
}

} // namespace

SlideLabel::SlideLabel(const SlideOptions &options, QWidget *parent)
    : QWidget(parent)
    , mOptions(options)
    , mOverlay(options, this)
{
    setAttribute(Qt::WA_OpaquePaintEvent);
    mMinute.setSingleShot(true);
    connect(&mMinute, &QTimer::timeout, this, &SlideLabel::tellTime);
}

QSize SlideLabel::imageSize() const
{
    return (QSizeF(size()) * devicePixelRatioF()).toSize();
}

void SlideLabel::setImage(const QPixmap &picture)
{
    showSlide(makeSlide(picture, imageSize(), mOptions.blurredFill), Change::Cut);
}

void SlideLabel::setPlaceholder(const QString &resource)
{
    mPlaceholder = resource;
    mSlide = SlidePicture();
    change();
    stopFade();
}

void SlideLabel::showSlide(const SlidePicture &slide, Change kind)
{
    const bool isFade = kind == Change::Fade && mOptions.fade > 0 && isVisible() &&
                        mPlaceholder.isEmpty() && !mSlide.isNull();
    if (isFade) {
        mPrevious = QPixmap(imageSize());
        QPainter painter(&mPrevious);
        mSlide.paint(painter, photoPlace());
    }
    mPlaceholder.clear();
    mSlide = slide;
    change();
    if (isFade) {
        mFade.start();
        mPace.restart();
        animate();
    } else {
        stopFade();
    }
}

// Another picture: its motion begins, and the texts move on.
void SlideLabel::change()
{
    mMomentBefore = 0;
    mTurnClock.start();
    mOverlay.setTurn(++mTurn);
    QWidget::update();
}

void SlideLabel::setTexts(const QString &caption, const QString &date)
{
    if (mOptions.caption == SlideCorner::None && mOptions.date == SlideCorner::None)
        return;
    mOverlay.setPhoto(caption, date);
    QWidget::update();
}

void SlideLabel::setTurnLength(int milliseconds)
{
    mMomentBefore = moment();
    mTurnLength = milliseconds;
    mTurnClock.start();
    animate();
}

bool SlideLabel::isMoving() const
{
    return mOptions.motion > 0 && mTurnLength > 0 && !mSlide.isNull();
}

// Where the photo's motion stands, 0 to 1. A photo that is being faded in stands still: then a
// frame takes no scaling.
qreal SlideLabel::moment() const
{
    if (!isMoving() || isFading())
        return mMomentBefore;
    const qreal elapsed = qreal(mTurnClock.elapsed()) / mTurnLength;
    return qMin(1.0, mMomentBefore + elapsed);
}

QRectF SlideLabel::photoPlace() const
{
    const qreal now = moment();
    if (now <= 0)
        return mSlide.place;
    return slidemotion::moved(mSlide.photo.size(), mSlide.screen, now, mOptions.motion, mTurn);
}

qreal SlideLabel::fadeProgress() const
{
    const qreal part = qBound(0.0, qreal(mFade.elapsed()) / qMax(1, mOptions.fade), 1.0);
    return part * part * (3 - 2 * part);
}

void SlideLabel::stopFade()
{
    if (isFading())
        mTurnClock.start();
    mFade.invalidate();
    mPrevious = QPixmap();
    animate();
}

// Starts the clock of the frames, or stops it when nothing moves.
void SlideLabel::animate()
{
    mLastFrame.invalidate();
    if (isVisible() && (isFading() || isMoving()))
        mFrameTimer.start(frameTime(isFading()), Qt::PreciseTimer, this);
    else
        mFrameTimer.stop();
}

void SlideLabel::timerEvent(QTimerEvent *event)
{
    if (event->timerId() != mFrameTimer.timerId())
        return;
    const bool isLate =
        mLastFrame.isValid() && mLastFrame.elapsed() * 2 > frameTime(isFading()) * kPatience;
    mLastFrame.start();
    judge(isLate || mIsPaintSlow);
    if (isFading() && mFade.hasExpired(mOptions.fade))
        stopFade();
    QWidget::update();
}

void SlideLabel::judge(bool isLateFrame)
{
    if (!mPace.isTooSlow(isLateFrame))
        return;
    mPace.restart();
    logLine("{SlideLabel::judge} too slow for ", isFading() ? "fades" : "motion");
    (isFading() ? mOptions.fade : mOptions.motion) = 0;
    stopFade();
}

void SlideLabel::paintEvent(QPaintEvent *)
{
    QElapsedTimer time;
    time.start();
    QPainter painter(this);
    const qreal ratio = devicePixelRatioF();
    painter.save();
    painter.scale(1 / ratio, 1 / ratio); // to device pixels, in which nothing has to be scaled
    paintPicture(painter);
    painter.restore();
    if (!mPlaceholder.isEmpty())
        paintPlaceholder(painter);
    mOverlay.paint(painter);
    painter.end();
    mIsPaintSlow = time.hasExpired(kPaintTime);
}

void SlideLabel::paintPicture(QPainter &painter)
{
    if (mSlide.isNull() || mSlide.screen != imageSize()) {
        painter.fillRect(QRect(QPoint(), imageSize()), Qt::black);
        if (mSlide.isNull())
            return;
    }
    if (isFading()) {
        painter.drawPixmap(0, 0, mPrevious);
        painter.setOpacity(fadeProgress());
    }
    mSlide.paint(painter, photoPlace());
}

void SlideLabel::paintPlaceholder(QPainter &painter) const
{
    painter.fillRect(rect(), Qt::black);
    const QPixmap picture = loadPicture(mPlaceholder);
    if (picture.isNull())
        return;
    const QSize size = (QSizeF(picture.size()) / picture.devicePixelRatioF()).toSize();
    painter.drawPixmap(slidemotion::centred(size, this->size()), picture);
}

void SlideLabel::tellTime()
{
    const QDateTime now = localTime();
    if (mOverlay.setClock(now.toString(QStringLiteral("HH:mm"))))
        QWidget::update();
    const int milliseconds = now.time().second() * 1000 + now.time().msec();
    mMinute.start(60 * 1000 - milliseconds);
}

void SlideLabel::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (mOverlay.hasClock())
        tellTime();
    animate();
}

void SlideLabel::hideEvent(QHideEvent *event)
{
    QWidget::hideEvent(event);
    mMinute.stop();
    stopFade();
    mFrameTimer.stop();
}
