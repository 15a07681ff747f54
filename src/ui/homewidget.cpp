#include "ui/homewidget.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "data/packagemanager.h"
#include "network/systemconfig.h"
#include "ui/contentpages.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/homebars.h"
#include "ui/paging.h"
#include "ui/qimageslide.h"
#include "ui/upwidget.h"

#include <QFrame>
#include <QMetaMethod>
#include <QPaintEvent>
#include <QPainter>
#include <QScrollBar>
#include <QStackedLayout>
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

// Milliseconds after which a page that has not come counts as failed; 0: never.
int pagePatience()
{
    return SystemConfig::value(QStringLiteral("Network/PageSeconds"), QStringLiteral("0")).toInt() *
           1000;
}

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
    , mFrame(new QFrame(this))
    , mBars(new HomeBars(this))
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
    column->addWidget(mFrame, 1);
    column->addWidget(mBars);
    buildPages(mFrame);
    connectParts();
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

void HomeWidget::buildPages(QWidget *frame)
{
    mPages = new QStackedLayout(frame);
    mCommentArea = new FormScrollArea(frame);
    auto *content = new FormScrollWidget(mCommentArea);
    mCommentArea->setWidget(content);
    content->setColumn(SystemConfig::scrollAreaMaxColumn());
    mCells = std::make_unique<CellFiller>(content, this);

    mLoadingPage = new LoadingPage(frame);
    mNoPhotoPage = new NoPhotoAvailableWidget(frame);
    mFailurePage = new FailurePage(frame);
    for (QWidget *page :
         {static_cast<QWidget *>(mCommentArea), static_cast<QWidget *>(mLoadingPage),
          static_cast<QWidget *>(mNoPhotoPage), static_cast<QWidget *>(mFailurePage)})
        mPages->addWidget(page);
}

void HomeWidget::connectParts()
{
    connect(mCommentArea, &FormScrollArea::enterPress, this, &HomeWidget::handleCommentEnter);
    connect(mCommentArea, &FormScrollArea::selectChanged, this, &HomeWidget::updatePhotoRatio);
    connect(mTitleWidget, &UpWidget::pressEnter, this, &HomeWidget::handleUpWidgetEnter);
    connect(mTitleWidget, &UpWidget::keyPassedOn, this, &HomeWidget::keyPressEvent);
    connect(mTitleWidget, &UpWidget::signOutRequested, this, &HomeWidget::confirmSignOut);
    connect(this, &HomeWidget::packageReady, this, &HomeWidget::tryToShowCurrentPackage);
    connect(mFailurePage, &FailurePage::retryRequested, this, &HomeWidget::requestPage);
    connect(mFailurePage, &FailurePage::leaveRequested, this, &HomeWidget::leaveFailure);
    mPageTimer.setSingleShot(true);
    connect(&mPageTimer, &QTimer::timeout, this, [this] { showFailure(NET_TIMEOUT); });
}

bool HomeWidget::isLoading() const
{
    return mPages->currentWidget() == mLoadingPage;
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
    mLoadingPage->start();
    showPage(mLoadingPage);
    if (mayFocus())
        mLoadingPage->setFocus();
    if (const int patience = pagePatience())
        mPageTimer.start(patience);
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
    if (!PackageManager::downloadPage(property, downloadPackageCB))
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

void HomeWidget::showPage(QWidget *page)
{
    if (page != mLoadingPage) {
        mPageTimer.stop();
        mLoadingPage->stop();
    }
    mPages->setCurrentWidget(page);
    refreshBars();
}

void HomeWidget::showFailure(ErrorCode code)
{
    mFailurePage->setReason(code);
    showPage(mFailurePage);
    if (mayFocus())
        mFailurePage->setFocus();
}

void HomeWidget::tryToShowCurrentPackage(PackageProperty &property)
{
    logLine("try to show CurrentPackage");
    PackageProperty &wanted = mState.mCurrentProperty;
    if (property != wanted)
        return;
    if (property.mStartIndex != wanted.mStartIndex)
        logLine("property.mStartIndex do not match");
    mCurrentPackageData = takeUsablePackage();
    if (mCurrentPackageData) {
        mState.packageArrived(*mCurrentPackageData);
        allPhotoNum = mState.total(mCurrentPackageData);
        pushPackageData();
        focusAfterPageDown();
    } else if (property.mStartIndex != wanted.mStartIndex) {
        tryToDownload(wanted); // another page of the list has come, without the one wanted
    } else {
        showFailure(NET_NO_DATA);
    }
}

// The list from the cache. One that begins later than the page wanted is dropped: only a page
// fetched ahead had come when the pages before it had grown stale.
Package *HomeWidget::takeUsablePackage()
{
    PackageProperty &wanted = mState.mCurrentProperty;
    Package *package = PackageManager::getPackage(wanted);
    const bool beginsLater = package && wanted.mType == TYPE_FEATURED_PHOTOS &&
                             package->mProperty.mStartIndex > wanted.mStartIndex;
    if (!beginsLater)
        return package;
    PackageManager::removeCache(wanted);
    return nullptr;
}

void HomeWidget::focusAfterPageDown()
{
    const bool wanted = mState.mIsReturnFromDetail || mState.mIsPageDown;
    if (mState.mCurrentProperty.mType != TYPE_FEATURED_PHOTOS || !wanted)
        return;
    mState.mIsReturnFromDetail = mState.mIsPageDown = false;
    if (mPages->currentWidget() == mCommentArea && mayFocus())
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
    if (shown == 0) {
        showPage(mNoPhotoPage);
        if (mayFocus())
            mTitleWidget->setFocus();
        return;
    }
    if (mState.mInitIndex >= 0)
        mCommentArea->content()->setIndex(std::min(mState.mInitIndex, shown - 1));
    mState.mInitIndex = -1;
    showPage(mCommentArea);
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
    if (mPages->currentWidget() == mCommentArea)
        mCommentArea->initFocus();
    else if (mPages->currentWidget() != mNoPhotoPage)
        mPages->currentWidget()->setFocus();
    mTitleWidget->updateFocusMark();
}

void HomeWidget::handleUpWidgetEnter(PackageProperty &property)
{
    logLine("enter HomeWidget::handleUpWidgetEnter()");
    const int type = property.mType;
    if (type == TYPE_SEARCH_PHOTOS || type == TYPE_SEARCH_MORE_PHOTOS) {
        logLine("{HomeWidget::handleUpWidgetEnter} search is refused");
        mTitleWidget->takeSelectionBack();
        return;
    }
    if (type != TYPE_FEATURED_PHOTOS && type != TYPE_ALBUM_LIST && type != TYPE_FAVORITE_PEOPLE) {
        logLine("Wrong can not go here HomeWidget::handleUpWidgetEnter");
        return;
    }
    mAlbumStr.clear();
    if (mState.enterMenu(PackageProperty(property)) || type == TYPE_FEATURED_PHOTOS)
        startAtFirstCell();
    mCommentArea->verticalScrollBar()->setValue(0);
    isHomeMenu = type == TYPE_FEATURED_PHOTOS;
    mIsSelfPhoto = type == TYPE_ALBUM_LIST;
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
    const bool isList = mPages->currentWidget() == mCommentArea;
    const QString position =
        isList && mCurrentPackageData
            ? QStringLiteral("%1/%2").arg(mState.mPhotoIndexInTotal).arg(mState.mPhotoDataCount)
            : QString();
    mBars->setInformation(titleOf(mState), position);
    mBars->showKeys(isLoading() ? QList<int>() : usefulKeys(isList));
}

// The keys that lead somewhere now.
QList<int> HomeWidget::usefulKeys(bool isList) const
{
    QList<int> keys{DEVICE_RED_KEY};
    const int start = mState.mCurrentProperty.mStartIndex;
    if (mState.back() != HomeState::Back::SignOut)
        keys << DEVICE_RETURN_KEY;
    if (!isList)
        return keys;
    if (!mState.isPhotoList())
        keys << DEVICE_SELECT_KEY;
    else if (isSignalConnected(QMetaMethod::fromSignal(&HomeWidget::slidePlay)))
        keys << DEVICE_PLAY_KEY;
    if (paging::pageUp(start, paging::onePage).exists)
        keys << DEVICE_PAGEUP_KEY;
    if (paging::pageDown(start, mState.total(mCurrentPackageData), paging::onePage).exists)
        keys << DEVICE_PAGEDOWN_KEY;
    return keys;
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
    mBackdrop.paint(painter, event->region(), size(), mFrame->geometry());
}
