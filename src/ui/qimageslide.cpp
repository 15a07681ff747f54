#include "ui/qimageslide.h"

#include "base/log.h"
#include "platform/ipcthread.h"
#include "ui/slidemarks.h"
#include "ui/slidephotos.h"
#include "ui/sliderecords.h"
#include "ui/slidesetting.h"

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
    , mWalk(mOptions, std::move(random))
    , mSpeed(SlideSetting::SlideSpeed)
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
    mPhotos->clear();
    mIsShowing = true;
    mIsHolding = mIsListLost = false;
    mBlockWanted = 0;
    mSpeed = SlideSetting::SlideSpeed;
    placeParts();
    setFocus();
    mMarks->wake();
    setPlaying(isPlay);
    mWalk.start(index, SlideSetting::SlideMode);
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

void QImageSlide::update(bool isUpdateIndex)
{
    logLine("enter QImageSlide::update()");
    if (waitsForList(isUpdateIndex))
        return;
    if (mIsPlay && isUpdateIndex) {
        if (mWalk.playArray().size() != sliderecords::count())
            mWalk.renew(1); // what comes next is known only then
        if (holdsOn())
            return;
        advance();
    }
    mIsHolding = false;
    refreshDatas();
    if (!mWalk.clamp() && mIsPlay) {
        leave(); // the play is over
        return;
    }
    mMarks->setArrows(!mWalk.isFirst(), !mWalk.isLast());
    mWalk.renew(1);
    showCurrent(isUpdateIndex ? SlideLabel::Change::Fade : SlideLabel::Change::Cut);
    prefetch();
}

// Without a list nothing can be shown. Asks for it, or for the next block of search results when
// this one has been played, again at each turn: the network may come back.
bool QImageSlide::waitsForList(bool isUpdateIndex)
{
    const bool isOver = mIsPlay && isUpdateIndex && sliderecords::count() > 0 && mWalk.isLast();
    if (isOver && mOptions.wholeList && mBlockWanted == 0)
        mBlockWanted = sliderecords::nextBlock(mOptions.loop);
    if (mBlockWanted > 0) {
        mWalk.restart();
        emit blockWanted(mBlockWanted);
        return true;
    }
    mIsListLost = !sliderecords::hasList();
    if (mIsListLost) {
        logLine("Wrong QImageSlide::update()");
        emit recordsLost();
    }
    return mIsListLost;
}

void QImageSlide::takeList()
{
    const bool isWaiting = mIsListLost || mBlockWanted > 0;
    if (!mIsShowing || !isWaiting || !sliderecords::hasList())
        return;
    const bool isNextTurn = mBlockWanted > 0 && mIsPlay;
    mIsListLost = false;
    mBlockWanted = 0;
    if (isNextTurn) {
        mWalk.renew(1);
        prefetch();
        restartTimer();
    }
    update(isNextTurn);
}

// The turn is over, but the next photo is not there yet: it may take one turn more.
bool QImageSlide::holdsOn()
{
    if (!mOptions.waitForPhoto || mIsHolding)
        return false;
    const bool isPageAwaited = mWalk.isLast() && mOptions.wholeList && sliderecords::isMoreToCome();
    const QString next = mWalk.url(1);
    mIsHolding = isPageAwaited || !(next.isEmpty() || mPhotos->isSettled(next));
    if (mIsHolding)
        prefetch();
    return mIsHolding;
}

void QImageSlide::takeTurnHeld(const QString &url)
{
    if (!mIsHolding || !mIsPlay || url != mWalk.url(1))
        return;
    update(true);
    restartTimer();
}

void QImageSlide::advance()
{
    mWalk.advance(
        [this](const QString &url) { return mOptions.skipUnreadable && mPhotos->hasFailed(url); });
}

void QImageSlide::refreshDatas()
{
    if (!mWalk.isPageWanted())
        return;
    const int index = mWalk.position();
    logLine("QImageSlide::refreshDatas() notify to load next page datas, mIndex=", index);
    emit handleSlidePageDown(index + 1);
}

void QImageSlide::showCurrent(SlideLabel::Change change)
{
    mMarks->setPlaying(mIsPlay);
    const OrvalaPhoto *photo = mWalk.photo();
    if (!photo) {
        mLabel->setPlaceholder(QStringLiteral(":/res/image_not_download.png"));
        return;
    }
    mLabel->setTexts(sliderecords::caption(*photo), sliderecords::date(*photo));
    mPhotos->show(photo->imageUrl(), photo->thumbnailUrl(), change);
}

void QImageSlide::prefetch()
{
    mPhotos->want(mWalk.urlsAhead());
}

void QImageSlide::leave()
{
    mIsShowing = false;
    const bool wasPlaying = mIsPlay;
    setPlaying(false);
    mPhotos->clear();
    hide();
    if (mSetting) {
        logLine("delete mSetting");
        mSetting->hide();
        mSetting->deleteLater();
        mSetting = nullptr;
    }
    if (wasPlaying)
        updatePlayState(false);
    const int index = qMax(0, mWalk.position());
    const int shown = mOptions.returnToPhoto ? mWalk.playArray().at(index) : index;
    emit returnImageSlideUpdate(qMax(0, shown) + 1);
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
