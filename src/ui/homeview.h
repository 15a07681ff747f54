#pragma once

#include "ui/backdrop.h"
#include "ui/cellfiller.h"
#include "ui/homepages.h"

#include <memory>

class FormScrollArea;
class HomeBars;
class Package;
class PictureDetailWidget;
class QPaintEvent;
class QWidget;
class UpWidget;
struct HomeState;

// What is seen of the home screen: the menu, one of its pages and the bars, laid out on it. Shows
// what the state says; the widgets belong to the screen.
class HomeView
{
public:
    HomeView(QWidget *screen, HomeState *state);
    ~HomeView();

    UpWidget *menu() const { return mTitleWidget; }
    HomePages *pages() const { return mPages; }
    FormScrollArea *grid() const { return mPages->grid(); }
    PictureDetailWidget *detail() const { return mPages->detail(); }
    bool isShown(HomePages::Page page) const { return mPages->isShown(page); }

    // Lays the state's page of the list into the grid and shows it, or that there is nothing; under
    // the photo screen the grid changes unseen.
    void showList(const Package &package);
    // The photo of a cell, on the photo screen.
    void showPhoto(int cell, Package *package, bool isSelfPhoto, bool isEnterPress);

    // The focus is to be on the first cell: now, so that a key which pages back can still move on
    // from there; with the next list, when no cell is shown.
    void startAtFirstCell();
    void scrollToTop();
    // The content gets the focus, if anybody may have it.
    void focusContent();

    // The cell with the focus, for the information line.
    void moveTo(int cell, const Package *package);
    void refreshBars(const Package *package);
    void paint(const QPaintEvent &event);

private:
    QWidget *mScreen;
    HomeState *mState;
    UpWidget *mTitleWidget;
    HomePages *mPages;
    HomeBars *mBars;
    std::unique_ptr<CellFiller> mCells;
    Backdrop mBackdrop;
};
