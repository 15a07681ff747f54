#pragma once

#include "ui/gridfocus.h"

#include <QScrollArea>

class FormScrollWidget;
class GridOwner;

// The thumbnail grid of the browsing screens: the remote's keys move the focus over the cells of
// its FormScrollWidget, scroll its row into view and, at the edges, ask the owner (the widget two
// levels up, a GridOwner) for the next or previous page. It downloads nothing.
class FormScrollArea : public QScrollArea
{
    Q_OBJECT

public:
    explicit FormScrollArea(QWidget *parent = nullptr);

    FormScrollWidget *content() const; // null until one is set as the area's widget

    // Gives the focus to the cell at the content's index.
    void initFocus();
    // Gives the focus to the first cell.
    void updateFocus();

    // A page's rows in the middle of the area, if they leave room, however many are shown. Call it
    // when the cells have changed their size.
    void centreRows();

    bool eventFilter(QObject *watched, QEvent *event) override;

signals:
    void enterPress(int index, bool isEnterPress);
    void selectChanged(int index);

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void focusInEvent(QFocusEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    GridOwner *owner() const;
    bool isRefused(const GridOwner *owner) const;
    void handleKey(GridOwner *owner, QKeyEvent *event);
    void handleUnfocused(GridOwner *owner, QKeyEvent *event);
    void handleRed(GridOwner *owner, QKeyEvent *event);
    void take(const gridfocus::Step &step, GridOwner *owner, QKeyEvent *event);
    void change(GridOwner *owner, int key, bool next);
    void moveFocus(const gridfocus::Step &step, GridOwner *owner, int key);
    bool focusCell(int index);
    void scrollTo(int index, int key);
};
