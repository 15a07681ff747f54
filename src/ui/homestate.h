#pragma once

#include "data/orvaladata.h"
#include "data/package.h"
#include "data/packageproperty.h"

// What the home screen shows and how it came there: one function for each event, no widgets.
//
//   menu entry -> featured photos
//              -> albums of the user  -> photos of an album
//              -> favourite people    -> albums of a person -> photos of an album
struct HomeState
{
    // Where Return leads.
    enum class Back { Albums, People, SearchBar, SignOut };

    PackageProperty mCurrentProperty; // the list shown, and the page of it
    int mTotalPhotoNum = 0;           // the feed's total, of featured photos and searches
    int mPhotoDataCount = 0;          // the total in the information line
    int mPhotoIndexInTotal = 0;       // the number in the information line
    bool mIsPageDown = false;
    bool mIsReturnFromDetail = false;
    bool mCanPlay = false;      // a list has been shown
    int mInitIndex = -1;        // grid index to focus after a page change; -1: as it is
    PackageProperty mAlbumList; // in which the album opened last stood, and the page of it
    int mSelectedAlbumIndex = 0;
    int mSelectedPersonIndex = 0;
    int mSelectedPersonStart = 1;
    int mInitStart = 1; // page to show when the list has come
    bool mIsFromFavorites = false;
    bool mIsSearchShown = false;
    int mBlock = 0; // of search results

    // The menu asks for a list. True when it is of another kind than the last.
    bool enterMenu(const PackageProperty &property);
    void openAlbum(int cell, const Album &album);
    void openPerson(int cell, const FavoritePeople &person);

    Back back() const;
    void backToAlbums();
    void backToPeople();

    // Search words are searched for; the results are left for the search bar.
    void startSearch(const QString &text);
    void backToSearchBar();
    // The neighbouring block of search results; false, and unchanged, when there is none.
    bool changeBlock(bool next);

    // A page of the list shown; false, and unchanged, when there is none.
    bool pageUp(int arg);
    bool pageDown(int arg, const Package *package);
    // The page of a record of the list held (from 1), to focus its cell.
    void selectRecord(int number);

    // The page that holds a record, by its number in the whole list. Among search results it may
    // lie in another block.
    void followTo(int number);

    // The same on the way back from the photo screen, where this photo was shown last: its cell is
    // to be focused.
    void updateInitIndex(int number);

    // Whether the page that has come is to have the focus on its first cell; once.
    bool takeFirstCellWish();

    // The list wanted has come, or a cell of it takes the focus.
    void packageArrived(const Package &package);
    void moveTo(int cell, const Package *package);
    // The list is to be fetched anew, to show the same page; useless while that is going on.
    void restart();
    bool canRestart() const;
    // Featured photos come page by page: turns to the next one when the page to be shown after a
    // restart lies behind what is held.
    bool turnToMissingPage(const Package &package);

    int recordIndex(int cell) const;
    int firstNumber() const; // in the whole list, of the first record of the list that is held
    bool isSearch() const;
    int total(const Package *package) const;
    bool isPhotoList() const;
    bool isWholeList() const; // pages are cut from a list that is held
};
