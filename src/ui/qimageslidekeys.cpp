// The player's keys, and the settings panel that one of them opens.

#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "ui/qimageslide.h"
#include "ui/slidemarks.h"
#include "ui/sliderecords.h"
#include "ui/slidesetting.h"

#include <QKeyEvent>

bool QImageSlide::isKeyAnswered() const
{
    if (mOptions.keysWhileLoading)
        return true;
    if (sliderecords::isDownloading()) {
        logLine("{QImageSlide::keyPressEvent} data is downloading and return...");
        return false;
    }
    if (!sliderecords::hasList())
        logLine("{QImageSlide::keyPressEvent} mCurrentPackageData is NULL");
    return sliderecords::hasList();
}

void QImageSlide::keyPressEvent(QKeyEvent *event)
{
    logLine("enter QImageSlide::keyPressEvent()");
    if (!isKeyAnswered())
        return;
    mMarks->wake();
    switch (event->key()) {
    case DEVICE_PLAYPAUSE_KEY:
        play(!mIsPlay);
        break;
    case DEVICE_PLAY_KEY:
        play(true);
        break;
    case DEVICE_PAUSE_KEY:
    case DEVICE_SELECT_KEY:
        logLine("{QImageSlide::keyPressEvent} DEVICE_PAUSE_KEY");
        play(false);
        break;
    case DEVICE_LEFT_KEY:
    case DEVICE_PRE_KEY:
        stepBack();
        break;
    case DEVICE_RIGHT_KEY:
    case DEVICE_NEXT_KEY:
        stepOn();
        break;
    case DEVICE_SETTING_KEY:
        openSetting();
        break;
    case DEVICE_RETURN_KEY:
        logLine("{QImageSlide::keyPressEvent} DEVICE_RETURN_KEY");
        leave();
        break;
    default:
        break;
    }
}

void QImageSlide::play(bool isPlay)
{
    setPlaying(isPlay);
    updatePlayState(isPlay);
}

// Below 0 as well, deliberately: the update puts the position right.
void QImageSlide::stepBack()
{
    logLine("{QImageSlide::keyPressEvent} mIndex = ", mWalk.position());
    if (mWalk.position() == 0)
        logLine("{QImageSlide::keyPressEvent} mIndex is 0, return here......");
    mWalk.step(-1);
    update(false);
    restartTimer();
}

void QImageSlide::stepOn()
{
    if (mWalk.isLast())
        return;
    mWalk.step(1);
    update(false);
    restartTimer();
}

void QImageSlide::openSetting()
{
    if (!mSetting) {
        mSetting = new SlideSetting(this);
        connect(mSetting, &SlideSetting::clickConfirm, this, &QImageSlide::saveSetting);
        connect(mSetting, &SlideSetting::clickCancel, this, &QImageSlide::closeSetting);
    }
    mSetting->setGeometry(rect());
    mSetting->show();
    mSetting->raise();
    mSetting->load();
}

void QImageSlide::saveSetting()
{
    if (!mSetting) {
        logLine("Error: setting instance is not created!!");
        return;
    }
    mWalk.setMode(mSetting->mode());
    SlideSetting::SlideMode = mSetting->mode();
    SlideSetting::SlideSpeed = mSetting->speed();
    prefetch(); // what comes next is another photo now
    closeSetting();
}

void QImageSlide::closeSetting()
{
    if (mSetting)
        mSetting->close();
    setFocus();
    mSpeed = SlideSetting::SlideSpeed;
    restartTimer();
}
