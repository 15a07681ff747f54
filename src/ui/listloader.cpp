#include "ui/listloader.h"

#include "base/log.h"
#include "data/packagemanager.h"
#include "ui/accountquestions.h"
#include "ui/cachedlist.h"
#include "ui/cellfiller.h"
#include "ui/homepages.h"
#include "ui/homestate.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"
#include "ui/screentexts.h"

ListLoader::ListLoader(HomeState *state, HomePages *pages, AccountQuestions *questions,
                       QObject *screen)
    : QObject(screen)
    , mState(state)
    , mPages(pages)
    , mQuestions(questions)
{
}

void ListLoader::request()
{
    CellFiller::cancelThumbnails();
    emit started();
    mPages->showLoading();
    tryToDownload();
}

void ListLoader::tryToDownload()
{
    PackageProperty property = mState->mCurrentProperty; // which changes when it has arrived
    if (held()) {
        logLine("enter NULL != package");
        emit arrived(property);
        return;
    }
    logLine("enter NULL == package");
    if (!PackageManager::downloadPage(property, HomeWidget::downloadPackageCB) &&
        mPages->isShown(HomePages::Loading))
        showFailure(NET_FAILED);
}

void ListLoader::finished(PackageProperty &property, ErrorCode code)
{
    if (code == NET_SUCCESS)
        emit arrived(property);
    else if (mPages->isShown(HomePages::Loading) && property == mState->mCurrentProperty)
        showFailure(code);
}

// A page refused, or a sign-in that has expired, may need another sign-in. Nobody is asked below
// the slide show: whoever leaves it has the page asked for again.
void ListLoader::showFailure(ErrorCode code)
{
    const bool isExpired = code == NET_FAILED && PackageManager::isSignInRefused();
    mPages->showFailure(isExpired ? NET_NOT_PERMITTED : code);
    if (QImageSlide::mIsShowing)
        return;
    if (isExpired)
        mQuestions->askAfterRefusal(ScreenTexts::question(ScreenTexts::SignInExpired));
    else if (code == NET_CONTENT_ERROR)
        mQuestions->askAfterRefusal(ScreenTexts::failure(ScreenTexts::PageNotFound));
}

bool ListLoader::complete(const Package *held, const PackageProperty &arrivedPage)
{
    const PackageProperty &wanted = mState->mCurrentProperty;
    const bool isOtherPage = arrivedPage.mStartIndex != wanted.mStartIndex;
    if (held && !mState->turnToMissingPage(*held)) {
        mState->packageArrived(*held);
        return true;
    }
    // Another page of the list may have come, without the one wanted.
    if (held || isOtherPage)
        tryToDownload();
    else
        fetchAnew();
    return false;
}

// A page has come alone, without those before it, which the cache has let go.
void ListLoader::fetchAnew()
{
    const bool isBelow = mPages->isShown(HomePages::Detail);
    if (mState->canRestart()) {
        PackageManager::removeCache(mState->mCurrentProperty);
        mState->restart();
        if (isBelow)
            tryToDownload();
        else
            request();
    } else if (!isBelow) {
        showFailure(NET_NO_DATA);
    }
}

Package *ListLoader::held()
{
    return cachedList(mState->mCurrentProperty);
}
