#pragma once

#include "data/imagetarget.h"
#include "ui/slidemotion.h"
#include "ui/slideoptions.h"
#include "ui/slideoverlay.h"
#include "ui/slidepicture.h"

#include <QBasicTimer>
#include <QElapsedTimer>
#include <QTimer>
#include <QWidget>

// The picture of the slide show: paints the photo, what fills the room beside it, and the texts
// over it, all from pixmaps that are made beforehand. Fades from photo to photo and lets a photo
// grow slowly, if configured; on a machine that cannot keep up both end by themselves, motion
// first.
class SlideLabel : public QWidget, public ImageTarget
{
    Q_OBJECT

public:
    enum class Change { Cut, Fade };

    explicit SlideLabel(const SlideOptions &options, QWidget *parent = nullptr);

    // ImageTarget: a photo that has been waited for.
    QSize imageSize() const override;
    void setImage(const QPixmap &picture) override;
    void setPlaceholder(const QString &resource) override;

    void showSlide(const SlidePicture &slide, Change change);
    // Texts of the photo that is being shown.
    void setTexts(const QString &caption, const QString &date);
    // From now on, for so many milliseconds, the photo moves; 0: it stands still.
    void setTurnLength(int milliseconds);

    const SlidePicture &slide() const { return mSlide; }
    QString placeholder() const { return mPlaceholder; } // empty while a photo is shown
    bool isFading() const { return mFade.isValid(); }
    bool isMoving() const;

protected:
    void paintEvent(QPaintEvent *event) override;
    void timerEvent(QTimerEvent *event) override;
    void showEvent(QShowEvent *event) override;
    void hideEvent(QHideEvent *event) override;

private:
    void change();
    void paintPicture(QPainter &painter);
    void paintPlaceholder(QPainter &painter) const;
    QRectF photoPlace() const;
    qreal fadeProgress() const;
    qreal moment() const;
    void stopFade();
    void animate();
    void judge(bool isLateFrame);
    void tellTime();

    SlideOptions mOptions;
    SlidePicture mSlide;
    QString mPlaceholder;
    QPixmap mPrevious; // the screen as it was when the fade began
    SlideOverlay mOverlay;
    int mTurn = 0;
    int mTurnLength = 0;
    qreal mMomentBefore = 0; // where the motion stood when its clock was started
    QElapsedTimer mTurnClock;
    QElapsedTimer mFade;
    QBasicTimer mFrameTimer;
    QElapsedTimer mLastFrame;
    bool mIsPaintSlow = false; // the last one
    SlidePace mPace;
    QTimer mMinute;
};
