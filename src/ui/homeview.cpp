#include "ui/homeview.h"

#include "base/i18n.h"
#include "network/systemconfig.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/homebars.h"
#include "ui/homestate.h"
#include "ui/homewidget.h"
#include "ui/picturedetailwidget.h"
#include "ui/upwidget.h"

#include <QPaintEvent>
#include <QPainter>
#include <QScrollBar>
#include <QVBoxLayout>

#include <algorithm>

namespace {

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

QString asPosition(int number, int total)
{
    return QStringLiteral("%1/%2").arg(number).arg(total);
}

} // namespace

HomeView::HomeView(QWidget *screen, HomeState *state)
    : mScreen(screen)
    , mState(state)
    , mTitleWidget(new UpWidget(screen))
    , mPages(new HomePages(screen))
    , mBars(new HomeBars(screen))
    , mCells(std::make_unique<CellFiller>(grid()->content(), screen))
{
    auto *column = new QVBoxLayout(screen);
    column->setContentsMargins(SystemConfig::borderLeft(), SystemConfig::borderTop(),
                               SystemConfig::borderRight(), SystemConfig::borderBottom());
    column->setSpacing(4);
    column->setSizeConstraint(QLayout::SetNoConstraint); // the screen's size is given
    column->addWidget(mTitleWidget);
    column->addWidget(mPages, 1);
    column->addWidget(mBars);
}

HomeView::~HomeView()
{
    CellFiller::cancelThumbnails();
}

void HomeView::showList(const Package &package)
{
    const bool toContent = !mTitleWidget->hasFocus();
    const int shown = mCells->fill(package, mState->recordIndex(0));
    grid()->centreRows();
    mState->mCanPlay = true;
    if (isShown(HomePages::Detail))
        return; // the list stays below it
    if (shown == 0) {
        mPages->show(HomePages::NoPhoto);
        if (HomePages::mayFocus())
            mTitleWidget->setFocus();
        return;
    }
    if (mState->mInitIndex >= 0)
        grid()->content()->setIndex(std::min(mState->mInitIndex, shown - 1));
    mState->mInitIndex = -1;
    mPages->show(HomePages::Grid);
    if (toContent)
        focusContent();
    moveTo(grid()->content()->getIndex(), &package);
}

void HomeView::showPhoto(int cell, Package *package, bool isSelfPhoto, bool isEnterPress)
{
    CellFiller::cancelThumbnails();
    mPages->show(HomePages::Detail);
    detail()->showPhoto(mState->recordIndex(cell), package, isSelfPhoto, isEnterPress,
                        mState->firstNumber());
    detail()->setFocus();
}

void HomeView::startAtFirstCell()
{
    if (!grid()->content()->setIndex(0))
        mState->mInitIndex = 0;
}

void HomeView::scrollToTop()
{
    grid()->verticalScrollBar()->setValue(0);
}

void HomeView::focusContent()
{
    if (!HomePages::mayFocus())
        return;
    mPages->focusPage();
    mTitleWidget->updateFocusMark();
}

void HomeView::moveTo(int cell, const Package *package)
{
    mState->moveTo(cell, package);
    refreshBars(package);
}

void HomeView::refreshBars(const Package *package)
{
    QString position;
    if (isShown(HomePages::Detail))
        position = asPosition(detail()->number(), detail()->total());
    else if (isShown(HomePages::Grid) && package)
        position = asPosition(mState->mPhotoIndexInTotal, mState->mPhotoDataCount);
    mBars->setVisible(!isShown(HomePages::Search));
    mBars->setInformation(titleOf(*mState), position);
    mBars->showHints(isShown(HomePages::Detail)
                         ? detail()->keyHints()
                         : HomeBars::usefulKeys(*mState, mPages->page(), package));
}

void HomeView::paint(const QPaintEvent &event)
{
    QPainter painter(mScreen);
    mBackdrop.paint(painter, event.region(), mScreen->size(), mPages->geometry());
}
