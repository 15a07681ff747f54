#include "ui/qimageslide.h"

#include "base/log.h"
#include "platform/ipcthread.h"
#include "ui/paging.h"
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
    , mSpeed(SlideSetting::SlideSpeed)
    , mMode(SlideSetting::SlideMode)
    , mPlayArray(std::move(random))
    , mLabel(new SlideLabel(mOptions, this))
    , mMarks(new SlideMarks(mOptions.marksSeconds, this))
    , mPhotos(new SlidePhotos(mLabel, mOptions, this))
{
    setFocusPolicy(Qt::StrongFocus);
    mPlayArray.setRound(mOptions.loop);
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
    mIsHolding = mIsListLost = false;
    mBlockWanted = 0;
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
    if (waitsForList(isUpdateIndex))
        return;
    if (mIsPlay && isUpdateIndex) {
        if (mPlayArray.size() != sliderecords::count())
            renewPlayArray(1); // what comes next is known only then
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

// Without a list nothing can be shown. Asks for it, or for the next block of search results when
// this one has been played, again at each turn: the network may come back.
bool QImageSlide::waitsForList(bool isUpdateIndex)
{
    const int count = sliderecords::count();
    const bool isOver = mIsPlay && isUpdateIndex && count > 0 && mIndex + 1 >= count;
    if (isOver && mOptions.wholeList && mBlockWanted == 0)
        mBlockWanted = sliderecords::nextBlock(mOptions.loop);
    if (mBlockWanted > 0) {
        mIndex = -1; // the next turn's is its first
        mPlayArray.clear();
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
        renewPlayArray(1);
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
    const bool isPageAwaited =
        mIndex + 1 >= sliderecords::count() && mOptions.wholeList && sliderecords::isMoreToCome();
    const QString next = urlAt(mIndex + 1);
    mIsHolding = isPageAwaited || !(next.isEmpty() || mPhotos->isSettled(next));
    if (mIsHolding)
        prefetch();
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
    const int count = mPlayArray.size();
    ++mIndex;
    for (int skipped = 1; skipped < count && isSkipped(mIndex); ++skipped)
        ++mIndex;
    if (mOptions.loop && count > 0 && mIndex >= count) {
        mPlayArray.startOver(mMode);
        mIndex %= count;
    }
}

bool QImageSlide::isSkipped(int position) const
{
    return mOptions.skipUnreadable && mPhotos->hasFailed(urlAt(position));
}

void QImageSlide::refreshDatas()
{
    const int ahead = mIndex + paging::pageSize;
    const int total = sliderecords::total();
    const bool isMoreToCome =
        mOptions.wholeList ? sliderecords::isMoreToCome() : ahead < total - paging::pageSize;
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
        const QString url = urlAt(mIndex + i);
        if (!url.isEmpty() && !urls.contains(url))
            urls << url;
    }
    mPhotos->want(urls);
}

QString QImageSlide::urlAt(int position) const
{
    return sliderecords::url(mPlayArray.at(position));
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
    const int shown = mOptions.returnToPhoto ? mPlayArray.at(mIndex) : mIndex;
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
