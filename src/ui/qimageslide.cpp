#include "ui/qimageslide.h"

#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "platform/ipcthread.h"
#include "ui/paging.h"
#include "ui/slidemarks.h"
#include "ui/slidephotos.h"
#include "ui/sliderecords.h"
#include "ui/slidesetting.h"

#include <QKeyEvent>

#include <limits>
#include <utility>

using netcommon::IpcThread;

bool QImageSlide::mIsShowing = false;

namespace {

enum PlayStatus { Started = 0, Stopped = 2 };
constexpr int kStatusUpdate = 2;

int turnLength(int seconds)
{
    return qBound(1, seconds, std::numeric_limits<int>::max() / 1000 - 10) * 1000;
}

} // namespace

QImageSlide::QImageSlide(QWidget *parent, playorder::RandomSource random)
    : QWidget(parent)
    , mOptions(SlideOptions::configured())
    , mSpeed(SlideSetting::SlideSpeed)
    , mMode(SlideSetting::SlideMode)
    , mPlayArray(std::move(random))
    , mLabel(new SlideLabel(mOptions, this))
    , mMarks(new SlideMarks(mOptions.marksSeconds, this))
    , mPhotos(new SlidePhotos(mLabel, mOptions, this))
{
    setFocusPolicy(Qt::StrongFocus);
    connect(&mPlayTimer, &QTimer::timeout, this, [this] { update(); });
    connect(mPhotos, &SlidePhotos::arrived, this, &QImageSlide::takeTurnHeld);
    if (IpcThread *thread = IpcThread::getInstance())
        connect(this, &QImageSlide::signalUpdatePlaybackinfo, thread,
                &IpcThread::updatePlaybackinfo);
}

QImageSlide::~QImageSlide()
{
    if (mIsShowing && mIsPlay)
        updatePlayState(false);
    mIsShowing = false;
    delete mPhotos; // before the label that it serves
}

void QImageSlide::startSlideShow(int index)
{
    initParam(false, index);
}

void QImageSlide::startSlidePlay(int index)
{
    initParam(true, index);
    if (mIsShowing)
        updatePlayState(true);
}

void QImageSlide::initParam(bool isPlay, int index)
{
    mPlayArray.clear();
    mPhotos->clear();
    mIndex = index;
    mIsShowing = true;
    mIsHolding = false;
    mSpeed = SlideSetting::SlideSpeed;
    mMode = SlideSetting::SlideMode;
    placeParts();
    setFocus();
    mMarks->wake();
    setPlaying(isPlay);
    renewPlayArray(0);
    mPlayArray.reorder(mMode);
    update(false);
}

// Starts or stops the timer and all that goes with it.
void QImageSlide::setPlaying(bool isPlay)
{
    mIsPlay = isPlay;
    mMarks->setPlaying(isPlay);
    if (isPlay) {
        restartTimer();
    } else {
        mPlayTimer.stop();
        mLabel->setTurnLength(0);
    }
}

void QImageSlide::restartTimer()
{
    if (!mIsPlay)
        return;
    mPlayTimer.start(turnLength(mSpeed));
    mLabel->setTurnLength(mPlayTimer.interval());
}

void QImageSlide::updatePlayState(bool isPlay)
{
    logLine("QImageSlide::disable screen saver ", int(isPlay));
    emit signalUpdatePlaybackinfo(kStatusUpdate, isPlay ? Started : Stopped, 0, 0);
}

void QImageSlide::renewPlayArray(int refreshMode)
{
    logLine("enter QImageSlide::renewPlayArray, refreshMode = ", refreshMode);
    const int dataCount = sliderecords::count();
    if (mPlayArray.size() > dataCount) {
        logLine("Warning: record array more than data count");
        mPlayArray.shrink(dataCount, mMode);
    }
    mPlayArray.extend(dataCount, refreshMode ? mMode : playorder::Normal);
}

void QImageSlide::update(bool isUpdateIndex)
{
    logLine("enter QImageSlide::update()");
    if (!sliderecords::hasList()) {
        logLine("Wrong QImageSlide::update()");
        emit recordsLost();
        return;
    }
    if (mIsPlay && isUpdateIndex) {
        if (holdsOn())
            return;
        advance();
    }
    mIsHolding = false;
    refreshDatas();
    if (!clampIndex())
        return;
    renewPlayArray(1);
    showCurrent(isUpdateIndex ? SlideLabel::Change::Fade : SlideLabel::Change::Cut);
    prefetch();
}

// The turn is over, but the next photo is not there yet: it may take one turn more.
bool QImageSlide::holdsOn()
{
    if (!mOptions.waitForPhoto || mIsHolding)
        return false;
    const bool isLast = mIndex + 1 >= sliderecords::count();
    mIsHolding = isLast ? mOptions.wholeList && sliderecords::count() < sliderecords::total()
                        : !mPhotos->isSettled(urlAt(mIndex + 1));
    return mIsHolding;
}

void QImageSlide::takeTurnHeld(const QString &url)
{
    if (!mIsHolding || !mIsPlay || url != urlAt(mIndex + 1))
        return;
    update(true);
    restartTimer();
}

void QImageSlide::advance()
{
    const int count = sliderecords::count();
    ++mIndex;
    while (mOptions.skipUnreadable && mIndex + 1 < count && mPhotos->hasFailed(urlAt(mIndex)))
        ++mIndex;
    if (mOptions.loop && mIndex >= count && count > 0) {
        const int last = mPlayArray.at(mPlayArray.size() - 1);
        renewPlayArray(1);
        mPlayArray.startOver(mMode, last);
        mIndex = 0;
    }
}

void QImageSlide::refreshDatas()
{
    const int ahead = mIndex + paging::pageSize;
    const int total = sliderecords::total();
    const bool isMoreToCome =
        mOptions.wholeList ? sliderecords::count() < total : ahead < total - paging::pageSize;
    if (mIndex < paging::pageSize || ahead < sliderecords::count() || !isMoreToCome)
        return;
    logLine("QImageSlide::refreshDatas() notify to load next page datas, mIndex=", mIndex);
    emit handleSlidePageDown(mIndex + 1);
}

// Moves the position into the list. False when the play was over and the player has left.
bool QImageSlide::clampIndex()
{
    const int count = sliderecords::count();
    const bool isOver = mIndex >= count;
    mIndex = qMax(0, qMin(mIndex, count - 1));
    if (isOver && mIsPlay) {
        leave();
        return false;
    }
    mMarks->setArrows(mIndex > 0, mIndex + 1 < count);
    return true;
}

void QImageSlide::showCurrent(SlideLabel::Change change)
{
    mMarks->setPlaying(mIsPlay);
    const OrvalaPhoto *photo = sliderecords::photo(mPlayArray.at(mIndex));
    if (!photo) {
        mLabel->setPlaceholder(QStringLiteral(":/res/image_not_download.png"));
        return;
    }
    mLabel->setTexts(sliderecords::caption(*photo), sliderecords::date(*photo));
    mPhotos->show(photo->imageUrl(), photo->thumbnailUrl(), change);
}

void QImageSlide::prefetch()
{
    QStringList urls;
    for (int i = 1; i <= mOptions.ahead; ++i) {
        int position = mIndex + i;
        if (mOptions.loop && mMode == playorder::Normal && mPlayArray.size() > 0)
            position %= mPlayArray.size();
        const QString url = urlAt(position);
        if (!url.isEmpty() && !urls.contains(url))
            urls << url;
    }
    mPhotos->want(urls);
}

QString QImageSlide::urlAt(int position) const
{
    return sliderecords::url(mPlayArray.at(position));
}

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
    logLine("{QImageSlide::keyPressEvent} mIndex = ", mIndex);
    if (mIndex == 0)
        logLine("{QImageSlide::keyPressEvent} mIndex is 0, return here......");
    --mIndex;
    update(false);
    restartTimer();
}

void QImageSlide::stepOn()
{
    if (mIndex >= sliderecords::count() - 1)
        return;
    ++mIndex;
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
    mMode = mSetting->mode();
    mPlayArray.reorder(mMode);
    mSpeed = mSetting->speed();
    SlideSetting::SlideMode = mMode;
    SlideSetting::SlideSpeed = mSpeed;
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

void QImageSlide::leave()
{
    mIsShowing = false;
    const bool wasPlaying = mIsPlay;
    setPlaying(false);
    mPhotos->clear();
    hide();
    mIndex = qMax(0, mIndex);
    if (mSetting) {
        logLine("delete mSetting");
        mSetting->hide();
        mSetting->deleteLater();
        mSetting = nullptr;
    }
    if (wasPlaying)
        updatePlayState(false);
    emit returnImageSlideUpdate(mIndex + 1);
}

void QImageSlide::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    const bool isOther = mLabel->size() != size();
    placeParts();
    if (isOther && mIsShowing)
        update(false);
}

// By hand: a hidden page of a stack is not laid out, and photos are fitted before it is shown.
void QImageSlide::placeParts()
{
    mLabel->setGeometry(rect());
    mMarks->place(size());
    if (mSetting)
        mSetting->setGeometry(rect());
}
