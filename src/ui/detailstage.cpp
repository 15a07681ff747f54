#include "ui/detailstage.h"

#include "common/ui/picture.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/stretchedpicture.h"
#include "common/ui/textfit.h"
#include "ui/zoom.h"

#include <QPainter>

namespace {

constexpr int kFrame = 4; // room for the mark around the photo
constexpr int kMark = 3;
constexpr int kIndicatorDelay = 600; // milliseconds
constexpr int kMessageHeight = 20;   // pixels of the font
constexpr QSize kArrow(48, 96);
constexpr int kArrowInset = 24; // where no usual photo has its edge

// The nearest place at which a picture's pixels fall on the screen's.
QPointF onPixels(const QPainter &painter, const QPointF &point)
{
    const QTransform &toDevice = painter.deviceTransform();
    return toDevice.inverted().map(QPointF(toDevice.map(point).toPoint()));
}

} // namespace

DetailStage::DetailStage(QWidget *parent)
    : QWidget(parent)
    , mIndicator(new QProgressIndicator(this))
{
    QFont larger = font();
    larger.setPixelSize(kMessageHeight);
    setFont(larger);
    mIndicatorDelay.setSingleShot(true);
    mIndicatorDelay.setInterval(kIndicatorDelay);
    connect(&mIndicatorDelay, &QTimer::timeout, mIndicator, &QProgressIndicator::startAnimation);
}

void DetailStage::showPreview(const QPixmap &thumbnail, const QSize &photo)
{
    mPicture = thumbnail;
    mPhotoSize = photo;
    mIsPreview = true;
    mIsWaiting = true;
    mHasFailed = false;
    setMessage(QString());
    setBusy(true);
    update();
}

void DetailStage::setBusy(bool busy)
{
    if (!busy) {
        mIndicatorDelay.stop();
        mIndicator->stopAnimation();
    } else if (!mIndicator->isAnimated() && !mIndicatorDelay.isActive()) {
        mIndicatorDelay.start();
    }
}

void DetailStage::setMessage(const QString &message)
{
    if (message == mMessage)
        return;
    mMessage = message;
    update();
}

void DetailStage::setMarked(bool marked)
{
    if (marked == mMarked)
        return;
    mMarked = marked;
    update();
}

void DetailStage::setNeighbours(bool previous, bool next)
{
    mHasPrevious = previous;
    mHasNext = next;
    update();
}

QSize DetailStage::imageSize() const
{
    const QSize room = size() - QSize(2 * kFrame, 2 * kFrame);
    return (QSizeF(room.expandedTo(QSize(1, 1))) * devicePixelRatioF()).toSize();
}

void DetailStage::setImage(const QPixmap &picture)
{
    mPicture = picture;
    // A message about the list stays: only the one about a failed picture is out of date.
    if (mHasFailed)
        setMessage(QString());
    mHasFailed = false;
    endWaiting();
}

void DetailStage::setPlaceholder(const QString &resource)
{
    mPicture = loadPicture(resource);
    mHasFailed = true;
    endWaiting();
}

void DetailStage::endWaiting()
{
    mIsPreview = false;
    mIsWaiting = false;
    setBusy(false);
    update();
}

// Where the picture lies; a thumbnail takes the place that the photo is going to have.
QRect DetailStage::pictureArea() const
{
    const QSize room = size() - QSize(2 * kFrame, 2 * kFrame);
    QSize shown = (QSizeF(mPicture.size()) / mPicture.devicePixelRatioF()).toSize();
    if (mIsPreview) {
        const bool useRecord = zoom::areAlike(mPhotoSize, mPicture.size());
        shown = (useRecord ? mPhotoSize : mPicture.size()).scaled(room, Qt::KeepAspectRatio);
    }
    shown = shown.expandedTo(QSize(1, 1));
    return {QPoint((width() - shown.width()) / 2, (height() - shown.height()) / 2), shown};
}

void DetailStage::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    if (!mPicture.isNull()) {
        const QRect area = pictureArea();
        if (mMarked)
            painter.fillRect(area.adjusted(-kMark, -kMark, kMark, kMark), QColor(0xf2, 0xf6, 0xf9));
        if (mIsPreview) {
            painter.setRenderHint(QPainter::SmoothPixmapTransform);
            painter.drawPixmap(area, mPicture);
        } else {
            painter.drawPixmap(onPixels(painter, area.topLeft()), mPicture);
        }
    }
    if (mMarked)
        paintArrows(painter);
    if (!mMessage.isEmpty())
        paintMessage(painter);
}

void DetailStage::paintArrows(QPainter &painter) const
{
    const int top = (height() - kArrow.height()) / 2;
    if (mHasPrevious)
        painter.drawPixmap(kArrowInset, top, loadPicture(QStringLiteral(":/res/left_arrow.png")));
    if (mHasNext)
        painter.drawPixmap(width() - kArrow.width() - kArrowInset, top,
                           loadPicture(QStringLiteral(":/res/right_arrow.png")));
}

void DetailStage::paintMessage(QPainter &painter) const
{
    const int line = fontMetrics().lineSpacing();
    const QSize box(width() - 48, 2 * line);
    const QString text = fitText(mMessage, font(), box);
    const QRect needed = fontMetrics().boundingRect(QRect(QPoint(), box), Qt::AlignLeft, text);
    QRect area(QPoint(), needed.size() + QSize(32, 20));
    const int bottom = mHasFailed && !mPicture.isNull() ? pictureArea().bottom() : height();
    area.moveCenter(QPoint(width() / 2, bottom - area.height() / 2 - 16));
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(0x0b, 0x10, 0x16, 0xdd));
    painter.drawRoundedRect(area, 8, 8);
    painter.setPen(QColor(0xe6, 0xed, 0xf2));
    painter.drawText(area, Qt::AlignCenter, text);
}

void DetailStage::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    const QSize indicator = mIndicator->sizeHint();
    mIndicator->setGeometry(QRect(
        QPoint((width() - indicator.width()) / 2, (height() - indicator.height()) / 2), indicator));
    emit resized();
}
