#pragma once

class QKeyEvent;

// What the focus grid needs of the screen that owns it: the widget two levels up.
class GridOwner
{
public:
    virtual ~GridOwner() = default;

    // Keys that the grid passes on, unchanged.
    virtual void handleGridKey(QKeyEvent *event) = 0;
    virtual bool isLoading() const = 0;
    virtual bool isMainMenuHidden() const = 0;

    virtual int packageType() const = 0;
    virtual int startIndex() const = 0;  // of the page shown, from 1
    virtual int recordCount() const = 0; // held in the list shown

    // One page of eight back or on for -1; false when there is none.
    virtual bool handlePageUp(int arg) = 0;
    virtual bool handlePageDown(int arg) = 0;
    // The previous or next block of a hundred search results.
    virtual void changeBlock(bool next) = 0;
};
