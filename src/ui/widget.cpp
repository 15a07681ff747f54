#include "ui/widget.h"

#include "data/packagemanager.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"

#include <QStackedLayout>
#include <QTimer>

Widget::Widget(QWidget *parent)
    : QWidget(parent)
    , mHomeWidget(new HomeWidget(this))
    , mPlayer(new QImageSlide(this))
    , mPages(new QStackedLayout(this))
{
    mPages->setContentsMargins(0, 0, 0, 0);
    mPages->setSizeConstraint(QLayout::SetNoConstraint); // the screen's size is given
    mPages->addWidget(mHomeWidget);
    mPages->addWidget(mPlayer);
    setFocusProxy(mHomeWidget);
    connectParts();
}

void Widget::connectParts()
{
    connect(mHomeWidget, &HomeWidget::slideShow, this, &Widget::startSlideShow);
    connect(mHomeWidget, &HomeWidget::slidePlay, this, &Widget::startSlidePlay);
    connect(mPlayer, &QImageSlide::returnImageSlideUpdate, this, &Widget::updateSelectedIndex);
    connect(mPlayer, &QImageSlide::handleSlidePageDown, this, &Widget::handleSlidePageDown);
    connect(mPlayer, &QImageSlide::handleSlidePageUp, this, &Widget::handleSlidePageUp);
    connect(mPlayer, &QImageSlide::recordsLost, this,
            [this] { turnPage(true, mPlayer->position() + 1); });
    connect(mPlayer, &QImageSlide::blockWanted, this, &Widget::fetchBlock, Qt::QueuedConnection);
    connect(mHomeWidget, &HomeWidget::packageReady, mPlayer, &QImageSlide::takeList);
}

void Widget::startSlideShow(int index)
{
    mPlayer->setGeometry(rect()); // it fits its first photo before it is shown
    mPlayer->startSlideShow(index);
    showPlayer();
}

void Widget::startSlidePlay(int index)
{
    mPlayer->setGeometry(rect());
    mPlayer->startSlidePlay(index);
    showPlayer();
}

void Widget::showPlayer()
{
    if (!QImageSlide::mIsShowing)
        return;
    setFocusProxy(mPlayer);
    mPages->setCurrentWidget(mPlayer);
    mPlayer->setFocus();
}

void Widget::updateSelectedIndex(int newIndex)
{
    setFocusProxy(mHomeWidget);
    mPages->setCurrentWidget(mHomeWidget);
    mHomeWidget->showRecord(newIndex);
}

void Widget::handleSlidePageDown(int diff)
{
    turnPage(true, diff);
}

void Widget::handleSlidePageUp(int diff)
{
    turnPage(false, diff);
}

// Search results that begin with that record take the place of those held, below the player.
void Widget::fetchBlock(int record)
{
    if (!QImageSlide::mIsShowing)
        return;
    HomeWidget::mCurrentPackageData = nullptr;
    mHomeWidget->preparePageData(record, true);
    PackageProperty block = mHomeWidget->state().mCurrentProperty;
    PackageManager::removeCache(block); // which does not tell whose records it holds
}

// The page of that record, which also fetches the one behind it. From the event loop: the photo
// that a key asks for comes first. The blocks of further search results are held whole.
void Widget::turnPage(bool isDown, int record)
{
    QTimer::singleShot(0, this, [this, isDown, record] {
        if (!QImageSlide::mIsShowing || mHomeWidget->isLoading() ||
            mHomeWidget->packageType() == TYPE_SEARCH_MORE_PHOTOS)
            return;
        if (isDown)
            mHomeWidget->handlePageDown(record);
        else
            mHomeWidget->handlePageUp(record);
    });
}
