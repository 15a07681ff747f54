#include "common/ui/qprogressindicator.h"

#include <QConicalGradient>
#include <QPainter>
#include <QTimerEvent>

#include <algorithm>

namespace {

constexpr int kDegreesPerStep = 12;
constexpr int kSweep = 300; // degrees of the ring that are drawn

} // namespace

QProgressIndicator::QProgressIndicator(QWidget *parent)
    : QWidget(parent)
{
    setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
}

void QProgressIndicator::startAnimation()
{
    mAngle = 0;
    mAnimated = true;
    updateTimer();
    update();
}

void QProgressIndicator::stopAnimation()
{
    mAnimated = false;
    updateTimer();
    update();
}

void QProgressIndicator::setAnimationDelay(int milliseconds)
{
    mDelay = std::max(1, milliseconds);
    mTimer.stop();
    updateTimer();
}

void QProgressIndicator::setDisplayedWhenStopped(bool displayed)
{
    mDisplayedWhenStopped = displayed;
    update();
}

void QProgressIndicator::setColor(const QColor &color)
{
    mColor = color;
    update();
}

void QProgressIndicator::updateTimer()
{
    const bool wanted = mAnimated && isVisible();
    if (wanted && !mTimer.isActive())
        mTimer.start(mDelay, this);
    else if (!wanted)
        mTimer.stop();
}

void QProgressIndicator::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    updateTimer();
}

void QProgressIndicator::hideEvent(QHideEvent *event)
{
    QWidget::hideEvent(event);
    mTimer.stop();
}

void QProgressIndicator::timerEvent(QTimerEvent *event)
{
    if (event->timerId() != mTimer.timerId()) {
        QWidget::timerEvent(event);
        return;
    }
    mAngle = (mAngle + kDegreesPerStep) % 360;
    update();
}

// A ring whose tail fades out, turned clockwise.
void QProgressIndicator::paintEvent(QPaintEvent *)
{
    if (!mAnimated && !mDisplayedWhenStopped)
        return;
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.translate(width() / 2.0, height() / 2.0);
    painter.rotate(mAngle);
    const qreal side = std::min(width(), height());
    const qreal thickness = std::max(2.0, side / 10);
    const qreal radius = (side - thickness) / 2;

    QColor tail = mColor;
    tail.setAlpha(0);
    QConicalGradient fade(0, 0, 0);
    fade.setColorAt(0, mColor);
    fade.setColorAt(kSweep / 360.0, tail);
    painter.setPen(QPen(fade, thickness, Qt::SolidLine, Qt::FlatCap));
    const QRectF ring(-radius, -radius, 2 * radius, 2 * radius);
    painter.drawArc(ring, 0, kSweep * 16);

    painter.setPen(Qt::NoPen);
    painter.setBrush(mColor);
    painter.drawEllipse(QPointF(radius, 0), thickness / 2, thickness / 2);
}
