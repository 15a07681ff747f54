#include "ui/homepages.h"

#include "base/log.h"
#include "common/ui/popupoverlay.h"
#include "network/systemconfig.h"
#include "ui/contentpages.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/picturedetailwidget.h"
#include "ui/qimageslide.h"
#include "ui/searchwidget.h"

#include <QStackedLayout>

namespace {

// Milliseconds after which a page that has not come counts as failed; 0: never.
int pagePatience()
{
    constexpr int kMostSeconds = 24 * 60 * 60;
    const int seconds = SystemConfig::value(QStringLiteral("Network/PageSeconds")).toInt();
    return qBound(0, seconds, kMostSeconds) * 1000;
}

// A page with the search bar in its middle. The bar's size is the screen's business: it is wider
// than the page, which shows the middle of it.
class SearchPage : public QWidget
{
public:
    SearchPage(SearchWidget *bar, QWidget *parent)
        : QWidget(parent)
        , mBar(bar)
    {
        bar->setParent(this);
        setFocusProxy(bar);
    }

protected:
    void resizeEvent(QResizeEvent *) override
    {
        mBar->move((width() - mBar->width()) / 2, (height() - mBar->height()) / 2);
    }

private:
    SearchWidget *mBar;
};

} // namespace

HomePages::HomePages(QWidget *parent)
    : QFrame(parent)
    , mCommentArea(new FormScrollArea(this))
    , mLoadingPage(new LoadingPage(this))
    , mNoPhotoPage(new NoPhotoAvailableWidget(this))
    , mFailurePage(new FailurePage(this))
    , mSearchBar(new SearchWidget)
    , mDetail(new PictureDetailWidget(this))
    , mPages(new QStackedLayout(this))
{
    auto *content = new FormScrollWidget(mCommentArea);
    mCommentArea->setWidget(content);
    content->setColumn(SystemConfig::scrollAreaMaxColumn());
    mPages->setSizeConstraint(QLayout::SetNoConstraint); // the screen's size is given
    // As Page numbers them.
    for (QWidget *page :
         std::initializer_list<QWidget *>{mCommentArea, mLoadingPage, mNoPhotoPage, mFailurePage,
                                          new SearchPage(mSearchBar, this), mDetail})
        mPages->addWidget(page);

    connect(mFailurePage, &FailurePage::retryRequested, this, &HomePages::retryRequested);
    connect(mFailurePage, &FailurePage::leaveRequested, this, &HomePages::leaveRequested);
    mPatience.setSingleShot(true);
    connect(&mPatience, &QTimer::timeout, this, [this] { showFailure(NET_TIMEOUT); });
}

HomePages::Page HomePages::page() const
{
    return Page(mPages->currentIndex());
}

void HomePages::show(Page page)
{
    if (page != Loading) {
        mPatience.stop();
        mLoadingPage->stop();
    }
    mPages->setCurrentIndex(page);
    emit pageChanged();
}

void HomePages::showLoading()
{
    mLoadingPage->start();
    show(Loading);
    takeFocus();
    if (const int patience = pagePatience())
        mPatience.start(patience);
}

void HomePages::showFailure(ErrorCode code)
{
    mFailurePage->setReason(code);
    show(Failure);
    takeFocus();
}

void HomePages::takeFocus()
{
    if (mayFocus())
        focusPage();
}

bool HomePages::mayFocus()
{
    if (QImageSlide::mIsShowing)
        logLine("Do not focus on current widget casue QImageSlide is showing");
    return !QImageSlide::mIsShowing && !PopupOverlay::holdsFocus();
}

void HomePages::focusPage()
{
    if (isShown(Grid))
        mCommentArea->initFocus();
    else if (!isShown(NoPhoto))
        mPages->currentWidget()->setFocus();
}
