#pragma once

#include <QFrame>
#include <QList>
#include <QWidget>

class QGridLayout;

// The content of the focus grid: cells in rows of at most mColumn. The cells are its child frames
// in the order of their creation; a hidden cell never takes the focus.
class FormScrollWidget : public QWidget
{
    Q_OBJECT

public:
    explicit FormScrollWidget(QWidget *parent = nullptr);

    // Number of columns; -1 until it is set.
    int column() const;
    bool setColumn(int columns); // false, and unchanged, below 1

    // Places a cell and takes ownership; refused, and only logged, while there are no columns.
    void addItem(QFrame *cell, int position);

    QList<QFrame *> cells() const;
    QFrame *cell(int index) const; // null outside the list
    int count() const { return cells().size(); }

    // The focused index, repaired (and the focus with it) when its cell has been hidden since; -1:
    // none.
    int getIndex();
    // Makes a cell the focused one without giving it the focus. False: no such visible cell; a
    // negative index, or an empty list, leaves no cell focused.
    bool setIndex(int index);

private:
    QObject *keyFilter() const;

    QGridLayout *mLayout;
    int mIndex = 0;
    int mColumn = -1;
};
