// The home screen's keys: what they open, where they page and lead back.

#include "ui/homewidget.h"

#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "ui/contentpages.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/paging.h"
#include "ui/upwidget.h"

#include <QKeyEvent>
#include <QScrollBar>
#include <QStackedLayout>

void HomeWidget::handleCommentEnter(int itemIndex, bool)
{
    if (!mCurrentPackageData) {
        reshow(); // the cache has let go of the list
        return;
    }
    bool opened = false;
    if (mState.mCurrentProperty.mType == TYPE_ALBUM_LIST)
        opened = openAlbum(itemIndex);
    else if (mState.mCurrentProperty.mType == TYPE_FAVORITE_PEOPLE)
        opened = openPerson(itemIndex);
    if (!opened)
        return;
    startAtFirstCell();
    mCommentArea->verticalScrollBar()->setValue(0);
    requestPage();
}

bool HomeWidget::openAlbum(int itemIndex)
{
    const auto *album = mCurrentPackageData->record<Album>(mState.recordIndex(itemIndex));
    if (!album) {
        logLine("Wrong iAlbum HomeWidget::handleCommentEnter");
        return false;
    }
    mState.openAlbum(itemIndex, *album);
    mAlbumStr = album->title();
    return true;
}

bool HomeWidget::openPerson(int itemIndex)
{
    const auto *person = mCurrentPackageData->record<FavoritePeople>(mState.recordIndex(itemIndex));
    if (!person) {
        logLine("Wrong favorite people HomeWidget::handleCommentEnter");
        return false;
    }
    mState.openPerson(itemIndex, *person);
    mFavoritePeopleName = person->nickname();
    return true;
}

bool HomeWidget::handlePageUp(int arg)
{
    if (!mState.pageUp(arg))
        return false;
    showOtherPage("Page Up, other mCurrentProperty type:");
    return true;
}

bool HomeWidget::handlePageDown(int arg)
{
    logLine("enter HomeWidget::handlePageDown()");
    if (!mCurrentPackageData && mPages->currentWidget() == mCommentArea)
        reshow(); // the cache has let go of the list; what it holds is known when it is back
    if (!mState.pageDown(arg, mCurrentPackageData))
        return false;
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
    mState.selectRecord(number);
    mTitleWidget->clearFocus();
    if (mState.mCurrentProperty.mType == TYPE_FEATURED_PHOTOS)
        requestPage();
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
    requestPage();
}

void HomeWidget::changeBlock(bool)
{
    // Blocks are a matter of search results, which have no page here yet.
}

void HomeWidget::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (isLoading()) {
        logLine(" it is downloading data now, so no key press events!");
        return;
    }
    const bool failed = mPages->currentWidget() == mFailurePage;
    switch (event->key()) {
    case DEVICE_RETURN_KEY:
        if (!goBack())
            confirmSignOut();
        break;
    case DEVICE_DOWN_KEY:
        logLine("<DEVICE_DOWN_KEY> setFocus()");
        focusContent();
        break;
    case DEVICE_UP_KEY:
        logLine("<DEVICE_UP_KEY> mTitleWidget->setFocus()");
        mTitleWidget->setFocus();
        break;
    case DEVICE_PLAY_KEY:
    case DEVICE_PLAYPAUSE_KEY:
        play();
        break;
    case DEVICE_RED_KEY:
        mTitleWidget->returnToHome();
        updatePhotoRatio(0);
        break;
    case DEVICE_PAGEUP_KEY:
        if (!failed)
            handlePageUp(paging::onePage);
        break;
    case DEVICE_PAGEDOWN_KEY:
        if (!failed)
            handlePageDown(paging::onePage);
        break;
    default:
        event->ignore();
    }
}

bool HomeWidget::goBack()
{
    switch (mState.back()) {
    case HomeState::Back::Albums:
        mState.backToAlbums();
        break;
    case HomeState::Back::People:
        mState.backToPeople();
        break;
    default:
        return false;
    }
    requestPage();
    return true;
}

void HomeWidget::play()
{
    const int type = mState.mCurrentProperty.mType;
    const bool isSearch = type == TYPE_SEARCH_PHOTOS || type == TYPE_SEARCH_MORE_PHOTOS;
    if (!mState.isPhotoList() || (isSearch && !mState.mIsSearchShown))
        return;
    const int cell = mCommentArea->content()->getIndex();
    const int index = mState.recordIndex(cell);
    if (cell >= 0 && mState.mCanPlay && index >= 0 && index < recordCount())
        emit slidePlay(index);
    else
        logLine("{HomeWidget::keyPressEvent} mCurrentPackageData is NULL");
}

void HomeWidget::confirmSignOut()
{
    logLine("{HomeWidget::confirmSignOut} signing out is refused");
    returnFromLogoutCancel();
}

void HomeWidget::returnFromLogoutCancel()
{
    mTitleWidget->cancelSignOut();
}

// Return on the failure page: to the list or page before, or up to the menu.
void HomeWidget::leaveFailure()
{
    if (goBack() || handlePageUp(paging::onePage))
        return;
    mTitleWidget->setFocus();
}
