#include "ui/slidewalk.h"

#include "base/log.h"
#include "ui/paging.h"
#include "ui/sliderecords.h"

#include <utility>

SlideWalk::SlideWalk(const SlideOptions &options, playorder::RandomSource random)
    : mOptions(options)
    , mPlayArray(std::move(random))
{
    mPlayArray.setRound(options.loop);
}

void SlideWalk::start(int index, int mode)
{
    mPlayArray.clear();
    mIndex = index;
    mMode = mode;
    renew(0);
    mPlayArray.reorder(mode);
}

void SlideWalk::restart()
{
    mIndex = -1;
    mPlayArray.clear();
}

void SlideWalk::setMode(int mode)
{
    mMode = mode;
    mPlayArray.reorder(mode);
}

void SlideWalk::renew(int refreshMode)
{
    logLine("enter QImageSlide::renewPlayArray, refreshMode = ", refreshMode);
    const int dataCount = sliderecords::count();
    if (mPlayArray.size() > dataCount) {
        logLine("Warning: record array more than data count");
        mPlayArray.shrink(dataCount, mMode);
    }
    mPlayArray.extend(dataCount, refreshMode ? mMode : playorder::Normal);
}

void SlideWalk::advance(const std::function<bool(const QString &url)> &isSkipped)
{
    const int count = mPlayArray.size();
    ++mIndex;
    for (int skipped = 1; skipped < count && isSkipped(url(0)); ++skipped)
        ++mIndex;
    if (mOptions.loop && count > 0 && mIndex >= count) {
        mPlayArray.startOver(mMode);
        mIndex %= count;
    }
}

bool SlideWalk::clamp()
{
    const int count = sliderecords::count();
    const bool isInside = mIndex < count;
    mIndex = qMax(0, qMin(mIndex, count - 1));
    return isInside;
}

bool SlideWalk::isLast() const
{
    return mIndex + 1 >= sliderecords::count();
}

bool SlideWalk::isPageWanted() const
{
    const int ahead = mIndex + paging::pageSize;
    const bool isMoreToCome = mOptions.wholeList ? sliderecords::isMoreToCome()
                                                 : ahead < sliderecords::total() - paging::pageSize;
    return mIndex >= paging::pageSize && ahead >= sliderecords::count() && isMoreToCome;
}

const OrvalaPhoto *SlideWalk::photo() const
{
    return sliderecords::photo(mPlayArray.at(mIndex));
}

QString SlideWalk::url(int ahead) const
{
    return sliderecords::url(mPlayArray.at(mIndex + ahead));
}

QStringList SlideWalk::urlsAhead() const
{
    QStringList urls;
    for (int i = 1; i <= mOptions.ahead; ++i) {
        const QString next = url(i);
        if (!next.isEmpty() && !urls.contains(next))
            urls << next;
    }
    return urls;
}
