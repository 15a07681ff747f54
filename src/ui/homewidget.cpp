#include "ui/homewidget.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/i18n.h"
#include "base/log.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "ui/accountquestions.h"
#include "ui/cachedlist.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/homebars.h"
#include "ui/homepages.h"
#include "ui/paging.h"
#include "ui/photopopups.h"
#include "ui/picturedetailwidget.h"
#include "ui/qimageslide.h"
#include "ui/screentexts.h"
#include "ui/searchflow.h"
#include "ui/upwidget.h"

#include <QMetaMethod>
#include <QPaintEvent>
#include <QPainter>
#include <QScrollBar>
#include <QVBoxLayout>

#include <algorithm>

bool isHomeMenu = false;
HomeWidget *HomeWidget::mWidgetInst = nullptr;
Package *HomeWidget::mCurrentPackageData = nullptr;
bool HomeWidget::mIsSelfPhoto = false;
QString HomeWidget::mAlbumStr;
QString HomeWidget::mFavoritePeopleName;
bool HomeWidget::mIsMainMenuHide = false;
int HomeWidget::allPhotoNum = 0;

namespace {

void forgetRemovedPackage(const Package *package)
{
    if (HomeWidget::mCurrentPackageData == package)
        HomeWidget::mCurrentPackageData = nullptr;
}

QString titleOf(const HomeState &state)
{
    switch (state.mCurrentProperty.mType) {
    case TYPE_FEATURED_PHOTOS:
        return I18n::label(11);
    case TYPE_ALBUM_LIST:
        return state.mIsFromFavorites ? HomeWidget::mFavoritePeopleName : I18n::label(12);
    case TYPE_ALBUM_PHOTOS:
        return HomeWidget::mAlbumStr;
    case TYPE_FAVORITE_PEOPLE:
        return I18n::label(17);
    default:
        return I18n::label(14);
    }
}

} // namespace

HomeWidget::HomeWidget(QWidget *parent)
    : QWidget(parent)
    , mTitleWidget(new UpWidget(this))
    , mPages(new HomePages(this))
    , mCommentArea(mPages->grid())
    , mDetail(mPages->detail())
    , mBars(new HomeBars(this))
    , mCells(std::make_unique<CellFiller>(mCommentArea->content(), this))
    , mSearch(new SearchFlow(&mState, mPages, this))
    , mPopups(new PhotoPopups(mDetail, this))
    , mQuestions(new AccountQuestions(this))
{
    mWidgetInst = this;
    mCurrentPackageData = nullptr;
    PackageManager::setRemovalHook(forgetRemovedPackage);
    setAttribute(Qt::WA_OpaquePaintEvent); // the backdrop covers everything

    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(SystemConfig::borderLeft(), SystemConfig::borderTop(),
                               SystemConfig::borderRight(), SystemConfig::borderBottom());
    column->setSpacing(4);
    column->setSizeConstraint(QLayout::SetNoConstraint); // the screen's size is given
    column->addWidget(mTitleWidget);
    column->addWidget(mPages, 1);
    column->addWidget(mBars);
    connectParts();
    connectDetail();
    mTitleWidget->setUserName(AccountManagerHelper::getUserName());
    mTitleWidget->handleHomeEnterEvent();
}

HomeWidget::~HomeWidget()
{
    CellFiller::cancelThumbnails();
    PackageManager::setRemovalHook(nullptr);
    mCurrentPackageData = nullptr;
    mWidgetInst = nullptr;
}

void HomeWidget::connectParts()
{
    connect(mCommentArea, &FormScrollArea::enterPress, this, &HomeWidget::handleCommentEnter);
    connect(mCommentArea, &FormScrollArea::selectChanged, this, &HomeWidget::updatePhotoRatio);
    connect(mTitleWidget, &UpWidget::pressEnter, this, &HomeWidget::handleUpWidgetEnter);
    connect(mTitleWidget, &UpWidget::keyPassedOn, this, &HomeWidget::keyPressEvent);
    connect(mTitleWidget, &UpWidget::signOutRequested, mQuestions, &AccountQuestions::askToSignOut);
    connect(mQuestions, &AccountQuestions::confirmed, this, &HomeWidget::doLogout);
    connect(mQuestions, &AccountQuestions::canceled, this, &HomeWidget::returnFromLogoutCancel);
    connect(this, &HomeWidget::packageReady, this, &HomeWidget::tryToShowCurrentPackage);
    connect(mPages, &HomePages::pageChanged, this, &HomeWidget::refreshBars);
    connect(mPages, &HomePages::retryRequested, this, &HomeWidget::requestPage);
    connect(mPages, &HomePages::leaveRequested, this, &HomeWidget::leaveFailure);
    connect(mSearch, &SearchFlow::resultsWanted, this, &HomeWidget::openList);
}

void HomeWidget::connectDetail()
{
    connect(mDetail, &PictureDetailWidget::backSignal, this, &HomeWidget::returnFromDetail);
    connect(mDetail, &PictureDetailWidget::handleDetailPageChange, this,
            &HomeWidget::preparePageData);
    connect(mDetail, &PictureDetailWidget::viewChanged, this, &HomeWidget::refreshBars);
    connect(this, &HomeWidget::packageReady, mDetail, &PictureDetailWidget::updateList);
    connect(mDetail, &PictureDetailWidget::slidePlay, this, [this](int index) {
        holdPackage();
        emit slidePlay(index);
    });
    connect(mDetail, &PictureDetailWidget::slideShow, this, [this](int index) {
        holdPackage();
        emit slideShow(index);
    });
}

bool HomeWidget::isLoading() const
{
    return mPages->isShown(HomePages::Loading);
}

int HomeWidget::recordCount() const
{
    return mCurrentPackageData ? mCurrentPackageData->count() : 0;
}

// Shows the loading page and asks for what the state wants now.
void HomeWidget::requestPage()
{
    CellFiller::cancelThumbnails();
    mCurrentPackageData = nullptr;
    mPages->showLoading();
    tryToDownload(mState.mCurrentProperty);
}

void HomeWidget::tryToDownload(PackageProperty property)
{
    if (PackageManager::getPackage(property)) {
        logLine("enter NULL != package");
        emit packageReady(property);
        return;
    }
    logLine("enter NULL == package");
    if (!PackageManager::downloadPage(property, downloadPackageCB) && isLoading())
        showFailure(NET_FAILED);
}

void HomeWidget::downloadPackageCB(PackageProperty &property, ErrorCode code)
{
    if (code == NET_CONTENT_ERROR)
        logLine("{HomeWidget::downloadPackageCB} enter aResult == NET_ERROR_NOTFOUND");
    else if (code != NET_SUCCESS)
        logLine("HomeWidget::downloadPageCB :", property.mType, "; failed with code :", code);
    else
        logLine("{HomeWidget::downloadPackageCB} down load package CB");
    if (!mWidgetInst)
        return;
    if (code == NET_SUCCESS)
        emit mWidgetInst->packageReady(property);
    else if (mWidgetInst->isLoading() && property == mWidgetInst->mState.mCurrentProperty)
        mWidgetInst->showFailure(code);
}

// A page refused, or a sign-in that has expired, may need another sign-in.
void HomeWidget::showFailure(ErrorCode code)
{
    const bool isExpired = code == NET_FAILED && PackageManager::isSignInRefused();
    mPages->showFailure(isExpired ? NET_NOT_PERMITTED : code);
    if (isExpired)
        mQuestions->askAfterRefusal(ScreenTexts::question(ScreenTexts::SignInExpired));
    else if (code == NET_CONTENT_ERROR)
        mQuestions->askAfterRefusal(ScreenTexts::failure(ScreenTexts::PageNotFound));
}

void HomeWidget::tryToShowCurrentPackage(PackageProperty &property)
{
    logLine("try to show CurrentPackage");
    PackageProperty &wanted = mState.mCurrentProperty;
    if (property != wanted || (mState.isSearch() && !mState.mIsSearchShown))
        return;
    if (property.mStartIndex != wanted.mStartIndex)
        logLine("property.mStartIndex do not match");
    mCurrentPackageData = takeUsablePackage();
    if (mCurrentPackageData && mState.turnToMissingPage(*mCurrentPackageData)) {
        tryToDownload(wanted);
    } else if (mCurrentPackageData) {
        mState.packageArrived(*mCurrentPackageData);
        allPhotoNum = mState.total(mCurrentPackageData);
        pushPackageData();
        focusAfterPageDown();
    } else if (property.mStartIndex != wanted.mStartIndex) {
        tryToDownload(wanted); // another page of the list has come, without the one wanted
    } else {
        fetchAnew();
    }
}

// A page has come alone, without those before it, which the cache has let go.
void HomeWidget::fetchAnew()
{
    const bool isBelow = mPages->isShown(HomePages::Detail);
    if (mState.canRestart()) {
        PackageManager::removeCache(mState.mCurrentProperty);
        mState.restart();
        if (isBelow)
            tryToDownload(mState.mCurrentProperty);
        else
            requestPage();
    } else if (!isBelow) {
        showFailure(NET_NO_DATA);
    }
}

// The list from the cache. One that begins later than the page wanted is dropped: only a page
// fetched ahead had come when the pages before it had grown stale.
Package *HomeWidget::takeUsablePackage()
{
    PackageProperty &wanted = mState.mCurrentProperty;
    Package *package = cachedList(wanted);
    const bool beginsLater = package && wanted.mType == TYPE_FEATURED_PHOTOS &&
                             package->mProperty.mStartIndex > wanted.mStartIndex;
    if (!beginsLater)
        return package;
    PackageManager::removeCache(wanted);
    return nullptr;
}

// After the cache may have let go of it.
void HomeWidget::holdPackage()
{
    if (!mCurrentPackageData)
        mCurrentPackageData = takeUsablePackage();
}

void HomeWidget::focusAfterPageDown()
{
    const bool wanted = mState.mIsReturnFromDetail || mState.mIsPageDown;
    if (mState.mCurrentProperty.mType != TYPE_FEATURED_PHOTOS || !wanted)
        return;
    mState.mIsReturnFromDetail = mState.mIsPageDown = false;
    if (mPages->isShown(HomePages::Grid) && mayFocus())
        mCommentArea->updateFocus();
}

void HomeWidget::pushPackageData()
{
    if (!mCurrentPackageData) {
        logLine("Error: pushPackageData package is NULL");
        return;
    }
    const bool toContent = !mTitleWidget->hasFocus();
    const int shown = mCells->fill(*mCurrentPackageData, mState.recordIndex(0));
    mState.mCanPlay = true;
    if (mPages->isShown(HomePages::Detail))
        return; // the list stays below it
    if (shown == 0) {
        mPages->show(HomePages::NoPhoto);
        if (mayFocus())
            mTitleWidget->setFocus();
        return;
    }
    if (mState.mInitIndex >= 0)
        mCommentArea->content()->setIndex(std::min(mState.mInitIndex, shown - 1));
    mState.mInitIndex = -1;
    mPages->show(HomePages::Grid);
    if (toContent)
        focusContent();
    updatePhotoRatio(mCommentArea->content()->getIndex());
}

// The keys belong to the slide show while it is on the screen.
bool HomeWidget::mayFocus()
{
    if (QImageSlide::mIsShowing)
        logLine("Do not focus on current widget casue QImageSlide is showing");
    return !QImageSlide::mIsShowing;
}

void HomeWidget::focusContent()
{
    if (!mayFocus())
        return;
    mPages->focusPage();
    mTitleWidget->updateFocusMark();
}

void HomeWidget::handleUpWidgetEnter(PackageProperty &property)
{
    logLine("enter HomeWidget::handleUpWidgetEnter()");
    const PackageProperty wanted = property; // may be the state's own, which changes
    const int type = wanted.mType;
    const bool isSearch = type == TYPE_SEARCH_PHOTOS || type == TYPE_SEARCH_MORE_PHOTOS;
    if (!isSearch && type != TYPE_FEATURED_PHOTOS && type != TYPE_ALBUM_LIST &&
        type != TYPE_FAVORITE_PEOPLE) {
        logLine("Wrong can not go here HomeWidget::handleUpWidgetEnter");
        return;
    }
    CellFiller::cancelThumbnails();
    if (mPages->isShown(HomePages::Detail))
        returnFromDetail(1);
    mAlbumStr.clear();
    if (mState.enterMenu(wanted) || type == TYPE_FEATURED_PHOTOS)
        startAtFirstCell();
    mCommentArea->verticalScrollBar()->setValue(0);
    isHomeMenu = type == TYPE_FEATURED_PHOTOS;
    mIsSelfPhoto = type == TYPE_ALBUM_LIST;
    if (isSearch)
        mSearch->open();
    else
        requestPage();
}

// Now, so that a key which pages back can still move on from there; later, when no cell is shown.
void HomeWidget::startAtFirstCell()
{
    if (!mCommentArea->content()->setIndex(0))
        mState.mInitIndex = 0;
}

void HomeWidget::updatePhotoRatio(int index)
{
    mState.moveTo(index, mCurrentPackageData);
    refreshBars();
}

void HomeWidget::refreshBars()
{
    const bool canPlay = isSignalConnected(QMetaMethod::fromSignal(&HomeWidget::slidePlay));
    const bool isDetail = mPages->isShown(HomePages::Detail);
    const bool isList = mPages->isShown(HomePages::Grid);
    QString position;
    if (isDetail)
        position = QStringLiteral("%1/%2").arg(mDetail->number()).arg(mDetail->total());
    else if (isList && mCurrentPackageData)
        position =
            QStringLiteral("%1/%2").arg(mState.mPhotoIndexInTotal).arg(mState.mPhotoDataCount);
    mBars->setVisible(!mPages->isShown(HomePages::Search));
    mBars->setInformation(titleOf(mState), position);
    if (isDetail)
        mBars->showHints(mDetail->keyHints());
    else
        mBars->showHints(
            HomeBars::usefulKeys(mState, mPages->page(), mCurrentPackageData, canPlay));
}

void HomeWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (!mTitleWidget->hasFocus())
        focusContent();
}

void HomeWidget::paintEvent(QPaintEvent *event)
{
    QPainter painter(this);
    mBackdrop.paint(painter, event->region(), size(), mPages->geometry());
}
