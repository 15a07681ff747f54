#pragma once

#include "network/errorcode.h"

#include <QFrame>
#include <QTimer>

class FailurePage;
class FormScrollArea;
class LoadingPage;
class NoPhotoAvailableWidget;
class PictureDetailWidget;
class QStackedLayout;
class SearchWidget;

// The pages of the home screen, of which one is shown: a list in the focus grid, what stands in for
// it, the search bar and the photo screen. Child of the screen that owns the grid.
class HomePages : public QFrame
{
    Q_OBJECT

public:
    enum Page { Grid, Loading, NoPhoto, Failure, Search, Detail };

    explicit HomePages(QWidget *parent);

    Page page() const;
    bool isShown(Page page) const { return this->page() == page; }
    void show(Page page);
    // Shows the loading page, with the focus. After "Network/PageSeconds" seconds without another
    // page it gives way to the failure page; without the key it stays.
    void showLoading();
    void showFailure(ErrorCode code);
    // Whether the keys are the home screen's: not while the slide show is on the screen, nor while
    // a pop-up waits for an answer.
    static bool mayFocus();
    // Gives the focus to what the page shown has for it; a page without anything leaves it alone.
    void focusPage();

    FormScrollArea *grid() const { return mCommentArea; }
    SearchWidget *searchBar() const { return mSearchBar; }
    PictureDetailWidget *detail() const { return mDetail; }

signals:
    void pageChanged();
    // On the failure page.
    void retryRequested();
    void leaveRequested();

private:
    void takeFocus();

    FormScrollArea *mCommentArea; // the focus grid
    LoadingPage *mLoadingPage;
    NoPhotoAvailableWidget *mNoPhotoPage;
    FailurePage *mFailurePage;
    SearchWidget *mSearchBar;
    PictureDetailWidget *mDetail;
    QStackedLayout *mPages;
    QTimer mPatience;
};
