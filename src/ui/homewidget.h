#pragma once

#include "data/package.h"
#include "network/errorcode.h"
#include "ui/gridowner.h"
#include "ui/homestate.h"
#include "ui/homeview.h"

#include <QWidget>

class AccountQuestions;
class ListLoader;
class SearchFlow;

extern bool isHomeMenu; // featured photos are shown

// The screen that the user lives in after signing in: the menu, one page of one list, and the bar
// of key hints. There is one instance, which the static call-back reaches.
//
//   menu, cell, key --> HomeState --> ListLoader --> tryToShowCurrentPackage() --> HomeView
//
// A page that fails, or does not come within "Network/PageSeconds", ends in the failure page; an
// answer to what is no longer wanted is left alone. While the photo screen is up the list moves on
// below it: whoever returns finds the page, and the cell, of the photo shown last.
//
// The rest are objects of their own, too: SearchFlow for searching, PhotoPopups over the photo
// screen, and AccountQuestions before signing out.
class HomeWidget : public QWidget, public GridOwner
{
    Q_OBJECT

public:
    explicit HomeWidget(QWidget *parent = nullptr);
    ~HomeWidget() override;

    static HomeWidget *mWidgetInst;
    // The list shown. The package manager owns it; null once it has been taken from the cache.
    static Package *mCurrentPackageData;
    static bool mIsSelfPhoto; // the user's own albums and photos are shown
    static QString mAlbumStr; // title of the album opened last
    static QString mFavoritePeopleName;
    static bool mIsMainMenuHide;
    static int allPhotoNum; // photos in the list shown

    // Answer of the package manager.
    static void downloadPackageCB(PackageProperty &property, ErrorCode code);

    const HomeState &state() const { return mState; }

    // What the focus grid needs.
    void handleGridKey(QKeyEvent *event) override { keyPressEvent(event); }
    bool isLoading() const override;
    bool isMainMenuHidden() const override { return mIsMainMenuHide; }
    int packageType() const override { return mState.mCurrentProperty.mType; }
    int startIndex() const override { return mState.mCurrentProperty.mStartIndex; }
    int recordCount() const override;
    bool handlePageUp(int arg) override;
    bool handlePageDown(int arg) override;
    void changeBlock(bool next) override;

public slots:
    void handleUpWidgetEnter(PackageProperty &property);
    void tryToShowCurrentPackage(PackageProperty &property);
    void updatePhotoRatio(int index);
    void handleCommentEnter(int itemIndex, bool isEnterPress = false);
    // Leaves the photo screen; the index, of the record shown last, is only for the log.
    void returnFromDetail(int index);
    // The photo screen or the slide show has come to the record with this number in the whole list:
    // moves the page there, without showing it, and has the records fetched that are not held.
    // False when there is no such record or nothing could be fetched.
    bool preparePageData(int startIndex, bool nextPage);
    void returnFromLogoutCancel();
    void doLogout();
    // Shows the page of that record (from 1) with the focus on it.
    void showRecord(int number);

signals:
    void signedOut(); // nobody is signed in any longer
    void packageReady(PackageProperty &property);
    void slideShow(int index);
    void slidePlay(int index);

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void focusInEvent(QFocusEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void showEvent(QShowEvent *event) override;

private:
    void connectParts();
    void connectDetail();

    void holdPackage();
    void pushPackageData();
    void openList();
    void showOtherPage(const char *otherType);
    void reshow();
    void leaveFailure();
    bool goBack();
    void play();

    HomeState mState;
    HomeView mView;
    PictureDetailWidget *mDetail;
    SearchFlow *mSearch;
    AccountQuestions *mQuestions;
    ListLoader *mLoader;
};
