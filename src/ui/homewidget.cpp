#include "ui/homewidget.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/log.h"
#include "data/packagemanager.h"
#include "ui/accountquestions.h"
#include "ui/formscrollarea.h"
#include "ui/listloader.h"
#include "ui/paging.h"
#include "ui/photopopups.h"
#include "ui/picturedetailwidget.h"
#include "ui/searchflow.h"
#include "ui/upwidget.h"

#include <QKeyEvent>

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

} // namespace

HomeWidget::HomeWidget(QWidget *parent)
    : QWidget(parent)
    , mView(this, &mState)
    , mDetail(mView.detail())
    , mSearch(new SearchFlow(&mState, mView.pages(), this))
    , mQuestions(new AccountQuestions(this))
    , mLoader(new ListLoader(&mState, mView.pages(), mQuestions, this))
{
    mWidgetInst = this;
    mCurrentPackageData = nullptr;
    PackageManager::setRemovalHook(forgetRemovedPackage);
    setAttribute(Qt::WA_OpaquePaintEvent); // the backdrop covers everything
    new PhotoPopups(mDetail, this);
    connectParts();
    connectDetail();
    mView.menu()->setUserName(AccountManagerHelper::getUserName());
    mView.menu()->handleHomeEnterEvent();
}

HomeWidget::~HomeWidget()
{
    PackageManager::setRemovalHook(nullptr);
    mCurrentPackageData = nullptr;
    mWidgetInst = nullptr;
}

void HomeWidget::connectParts()
{
    const UpWidget *menu = mView.menu();
    const HomePages *pages = mView.pages();
    connect(mView.grid(), &FormScrollArea::enterPress, this, &HomeWidget::handleCommentEnter);
    connect(mView.grid(), &FormScrollArea::selectChanged, this, &HomeWidget::updatePhotoRatio);
    connect(menu, &UpWidget::pressEnter, this, &HomeWidget::handleUpWidgetEnter);
    connect(menu, &UpWidget::keyPassedOn, this, &HomeWidget::keyPressEvent);
    connect(menu, &UpWidget::signOutRequested, mQuestions, &AccountQuestions::askToSignOut);
    connect(mQuestions, &AccountQuestions::confirmed, this, &HomeWidget::doLogout);
    connect(mQuestions, &AccountQuestions::canceled, this, &HomeWidget::returnFromLogoutCancel);
    connect(mLoader, &ListLoader::started, this, [] { mCurrentPackageData = nullptr; });
    connect(mLoader, &ListLoader::arrived, this, &HomeWidget::packageReady);
    connect(this, &HomeWidget::packageReady, this, &HomeWidget::tryToShowCurrentPackage);
    connect(pages, &HomePages::pageChanged, this,
            [this] { mView.refreshBars(mCurrentPackageData); });
    connect(pages, &HomePages::retryRequested, mLoader, &ListLoader::request);
    connect(pages, &HomePages::leaveRequested, this, &HomeWidget::leaveFailure);
    connect(mSearch, &SearchFlow::resultsWanted, this, &HomeWidget::openList);
}

void HomeWidget::connectDetail()
{
    connect(mDetail, &PictureDetailWidget::backSignal, this, &HomeWidget::returnFromDetail);
    connect(mDetail, &PictureDetailWidget::handleDetailPageChange, this,
            &HomeWidget::preparePageData);
    connect(mDetail, &PictureDetailWidget::viewChanged, this,
            [this] { mView.refreshBars(mCurrentPackageData); });
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
    return mView.isShown(HomePages::Loading);
}

int HomeWidget::recordCount() const
{
    return mCurrentPackageData ? mCurrentPackageData->count() : 0;
}

void HomeWidget::downloadPackageCB(PackageProperty &property, ErrorCode code)
{
    if (code == NET_CONTENT_ERROR)
        logLine("{HomeWidget::downloadPackageCB} enter aResult == NET_ERROR_NOTFOUND");
    else if (code != NET_SUCCESS)
        logLine("HomeWidget::downloadPageCB :", property.mType, "; failed with code :", code);
    else
        logLine("{HomeWidget::downloadPackageCB} down load package CB");
    if (mWidgetInst)
        mWidgetInst->mLoader->finished(property, code);
}

void HomeWidget::tryToShowCurrentPackage(PackageProperty &property)
{
    logLine("try to show CurrentPackage");
    if (property != mState.mCurrentProperty || (mState.isSearch() && !mState.mIsSearchShown))
        return;
    if (property.mStartIndex != mState.mCurrentProperty.mStartIndex)
        logLine("property.mStartIndex do not match");
    mCurrentPackageData = mLoader->held();
    if (!mLoader->complete(mCurrentPackageData, property))
        return;
    allPhotoNum = mState.total(mCurrentPackageData);
    pushPackageData();
    if (mState.takeFirstCellWish() && mView.isShown(HomePages::Grid) && HomePages::mayFocus())
        mView.grid()->updateFocus();
}

void HomeWidget::pushPackageData()
{
    if (mCurrentPackageData)
        mView.showList(*mCurrentPackageData);
    else
        logLine("Error: pushPackageData package is NULL");
}

// After the cache may have let go of it, or the photo screen has gone on to further search results,
// which are a list of their own.
void HomeWidget::holdPackage()
{
    const int type = mState.mCurrentProperty.mType;
    if (!mCurrentPackageData || mCurrentPackageData->mProperty.mType != type)
        mCurrentPackageData = mLoader->held();
}

void HomeWidget::handleUpWidgetEnter(PackageProperty &property)
{
    logLine("enter HomeWidget::handleUpWidgetEnter()");
    const PackageProperty wanted = property; // may be the state's own, which changes
    const int type = wanted.mType;
    const bool isSearch = paging::isSearch(type);
    if (!isSearch && type != TYPE_FEATURED_PHOTOS && type != TYPE_ALBUM_LIST &&
        type != TYPE_FAVORITE_PEOPLE) {
        logLine("Wrong can not go here HomeWidget::handleUpWidgetEnter");
        return;
    }
    CellFiller::cancelThumbnails();
    if (mView.isShown(HomePages::Detail))
        returnFromDetail(1);
    mAlbumStr.clear();
    if (mState.enterMenu(wanted) || type == TYPE_FEATURED_PHOTOS)
        mView.startAtFirstCell();
    mView.scrollToTop();
    isHomeMenu = type == TYPE_FEATURED_PHOTOS;
    mIsSelfPhoto = type == TYPE_ALBUM_LIST;
    if (isSearch)
        mSearch->open();
    else
        mLoader->request();
}

void HomeWidget::updatePhotoRatio(int index)
{
    mView.moveTo(index, mCurrentPackageData);
}

void HomeWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (!mView.menu()->hasFocus())
        mView.focusContent();
}

// From a pop-up, below which another page than before is shown.
void HomeWidget::focusInEvent(QFocusEvent *event)
{
    QWidget::focusInEvent(event);
    mView.focusContent();
    if (hasFocus())
        mView.menu()->setFocus();
}

void HomeWidget::paintEvent(QPaintEvent *event)
{
    mView.paint(*event);
}
