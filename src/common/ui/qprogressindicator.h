#pragma once

#include <QBasicTimer>
#include <QColor>
#include <QWidget>

// A spinning ring that says that work is going on. Its timer runs only while it turns and can be
// seen.
class QProgressIndicator : public QWidget
{
    Q_OBJECT
    Q_PROPERTY(int delay READ animationDelay WRITE setAnimationDelay)
    Q_PROPERTY(bool displayedWhenStopped READ isDisplayedWhenStopped WRITE setDisplayedWhenStopped)
    Q_PROPERTY(QColor color READ color WRITE setColor)

public:
    explicit QProgressIndicator(QWidget *parent = nullptr);

    int animationDelay() const { return mDelay; } // milliseconds between two steps
    bool isDisplayedWhenStopped() const { return mDisplayedWhenStopped; }
    QColor color() const { return mColor; }
    bool isAnimated() const { return mAnimated; } // also while it is hidden
    bool isTicking() const { return mTimer.isActive(); }

    QSize sizeHint() const override { return {96, 96}; }

public slots:
    void startAnimation();
    void stopAnimation();
    void setAnimationDelay(int milliseconds);
    void setDisplayedWhenStopped(bool displayed);
    void setColor(const QColor &color);

protected:
    void paintEvent(QPaintEvent *event) override;
    void timerEvent(QTimerEvent *event) override;
    void showEvent(QShowEvent *event) override;
    void hideEvent(QHideEvent *event) override;

private:
    void updateTimer();

    QBasicTimer mTimer;
    QColor mColor{0x5a, 0xb4, 0xf0};
    int mDelay = 33;
    int mAngle = 0; // degrees
    bool mAnimated = false;
    bool mDisplayedWhenStopped = false;
};
