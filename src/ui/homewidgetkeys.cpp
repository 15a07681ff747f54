// The home screen's keys: what they open, where they page and lead back.

#include "ui/homewidget.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "ui/accountquestions.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/listloader.h"
#include "ui/paging.h"
#include "ui/picturedetailwidget.h"
#include "ui/searchflow.h"
#include "ui/upwidget.h"

#include <QKeyEvent>

namespace {

bool openAlbum(HomeState &state, const Package &package, int cell)
{
    const auto *album = package.record<Album>(state.recordIndex(cell));
    if (!album) {
        logLine("Wrong iAlbum HomeWidget::handleCommentEnter");
        return false;
    }
    state.openAlbum(cell, *album);
    HomeWidget::mAlbumStr = album->title();
    return true;
}

bool openPerson(HomeState &state, const Package &package, int cell)
{
    const auto *person = package.record<FavoritePeople>(state.recordIndex(cell));
    if (!person) {
        logLine("Wrong favorite people HomeWidget::handleCommentEnter");
        return false;
    }
    state.openPerson(cell, *person);
    HomeWidget::mFavoritePeopleName = person->nickname();
    return true;
}

} // namespace

void HomeWidget::handleCommentEnter(int itemIndex, bool isEnterPress)
{
    if (!mCurrentPackageData) {
        reshow(); // the cache has let go of the list
        return;
    }
    const int type = mState.mCurrentProperty.mType;
    if (mState.isPhotoList())
        mView.showPhoto(itemIndex, mCurrentPackageData, mIsSelfPhoto, isEnterPress);
    else if (type == TYPE_ALBUM_LIST ? openAlbum(mState, *mCurrentPackageData, itemIndex)
                                     : openPerson(mState, *mCurrentPackageData, itemIndex))
        openList();
}

// Shows the list that the state has turned to, from its first cell on.
void HomeWidget::openList()
{
    mView.startAtFirstCell();
    mView.scrollToTop();
    mLoader->request();
}

void HomeWidget::returnFromDetail(int index)
{
    logLine("enter HomeWidget::returnFromDetail(), index = ", index);
    if (!mView.isShown(HomePages::Detail))
        return;
    mState.updateInitIndex(mDetail->number());
    mView.pages()->show(HomePages::Grid);
    if (mState.isSearch())
        mCurrentPackageData = nullptr; // may be another block by now
    holdPackage();
    mState.mIsReturnFromDetail = !mCurrentPackageData;
    reshow();
}

bool HomeWidget::preparePageData(int startIndex, bool nextPage)
{
    logLine("{HomeWidget::preparePageData} startIndex = ", startIndex, " nextPage = ", nextPage);
    if (startIndex < 1 || !mState.isPhotoList())
        return false;
    mState.followTo(startIndex);
    PackageProperty &wanted = mState.mCurrentProperty;
    const bool isHeld = mCurrentPackageData && mState.recordIndex(0) < recordCount();
    if (!isHeld)
        return PackageManager::downloadPage(wanted, downloadPackageCB);
    if (nextPage && wanted.mType == TYPE_FEATURED_PHOTOS)
        PackageManager::getPackage(wanted); // has the page behind it fetched ahead
    return true;
}

bool HomeWidget::handlePageUp(int arg)
{
    if (mView.isShown(HomePages::Detail))
        return preparePageData(arg, false);
    if (!mState.pageUp(arg))
        return arg == paging::onePage && mSearch->changeBlock(false);
    showOtherPage("Page Up, other mCurrentProperty type:");
    return true;
}

bool HomeWidget::handlePageDown(int arg)
{
    logLine("enter HomeWidget::handlePageDown()");
    if (mView.isShown(HomePages::Detail))
        return preparePageData(arg, true);
    if (!mCurrentPackageData && mView.isShown(HomePages::Grid))
        reshow(); // the cache has let go of the list; what it holds is known when it is back
    if (!mState.pageDown(arg, mCurrentPackageData))
        return arg == paging::onePage && mSearch->changeBlock(true);
    showOtherPage("Page Down, other mCurrentProperty type:");
    return true;
}

// Featured photos come page by page; the other lists are held whole.
void HomeWidget::showOtherPage(const char *otherType)
{
    const int type = mState.mCurrentProperty.mType;
    if (type == TYPE_FEATURED_PHOTOS)
        handleUpWidgetEnter(mState.mCurrentProperty);
    else if (mState.isWholeList())
        reshow();
    else
        logLine(otherType, type);
}

void HomeWidget::showRecord(int number)
{
    if (mView.isShown(HomePages::Detail) && mCurrentPackageData) {
        const int first = mState.firstNumber(); // the play began on the photo screen
        mState.followTo(first + number - 1);
        mDetail->showPhoto(number - 1, mCurrentPackageData, mIsSelfPhoto, false, first);
        mDetail->setFocus();
        return;
    }
    mState.selectRecord(number);
    mView.menu()->clearFocus();
    if (mView.isShown(HomePages::Detail))
        mView.pages()->show(HomePages::Grid);
    if (mState.mCurrentProperty.mType == TYPE_FEATURED_PHOTOS)
        mLoader->request();
    else
        reshow();
}

void HomeWidget::reshow()
{
    if (mCurrentPackageData) {
        CellFiller::cancelThumbnails();
        pushPackageData();
        return;
    }
    mState.restart();
    mLoader->request();
}

void HomeWidget::changeBlock(bool next)
{
    mSearch->changeBlock(next);
}

void HomeWidget::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (isLoading()) {
        logLine(" it is downloading data now, so no key press events!");
        return;
    }
    switch (event->key()) {
    case DEVICE_RETURN_KEY:
        if (!goBack()) {
            logLine("Exit app");
            mQuestions->askToSignOut();
        }
        break;
    case DEVICE_DOWN_KEY:
        logLine("<DEVICE_DOWN_KEY> setFocus()");
        mView.focusContent();
        break;
    case DEVICE_UP_KEY:
        logLine("<DEVICE_UP_KEY> mTitleWidget->setFocus()");
        mView.menu()->setFocus();
        break;
    case DEVICE_PLAY_KEY:
    case DEVICE_PLAYPAUSE_KEY:
        play();
        break;
    case DEVICE_RED_KEY:
        mView.menu()->returnToHome();
        updatePhotoRatio(0);
        break;
    case DEVICE_PAGEUP_KEY:
        if (mView.isShown(HomePages::Grid))
            handlePageUp(paging::onePage);
        break;
    case DEVICE_PAGEDOWN_KEY:
        if (mView.isShown(HomePages::Grid))
            handlePageDown(paging::onePage);
        break;
    default:
        event->ignore();
    }
}

bool HomeWidget::goBack()
{
    if (mView.isShown(HomePages::Detail)) {
        returnFromDetail(1);
        return true;
    }
    switch (mState.back()) {
    case HomeState::Back::SearchBar:
        mSearch->backToBar();
        updatePhotoRatio(0);
        return true;
    case HomeState::Back::Albums:
        mState.backToAlbums();
        break;
    case HomeState::Back::People:
        mState.backToPeople();
        break;
    default:
        return false;
    }
    mLoader->request();
    return true;
}

void HomeWidget::play()
{
    if (mView.isShown(HomePages::Detail)) {
        holdPackage();
        emit slidePlay(mDetail->recordIndex());
        return;
    }
    if (!mState.isPhotoList() || (mState.isSearch() && !mState.mIsSearchShown))
        return;
    const int cell = mView.grid()->content()->getIndex();
    const int index = mState.recordIndex(cell);
    if (cell >= 0 && mState.mCanPlay && index >= 0 && index < recordCount())
        emit slidePlay(index);
    else
        logLine("{HomeWidget::keyPressEvent} mCurrentPackageData is NULL");
}

// What belongs to the account goes with it.
void HomeWidget::doLogout()
{
    AccountManagerHelper::logout();
    CellFiller::cancelThumbnails();
    PackageManager::clearAll();
    PhotoManager::clearAll();
    emit signedOut();
}

void HomeWidget::returnFromLogoutCancel()
{
    mView.menu()->cancelSignOut();
}

// Return on the failure page: to the list or page before, or up to the menu.
void HomeWidget::leaveFailure()
{
    if (goBack() || handlePageUp(paging::onePage))
        return;
    mView.menu()->setFocus();
}
