#pragma once

#include "ui/detailaction.h"

#include <QWidget>

// The row of actions below the photo, each a picture and its name. It draws the mark of focus; the
// keys are its owner's business.
class DetailActions : public QWidget
{
    Q_OBJECT

public:
    explicit DetailActions(QWidget *parent = nullptr);

    void setActions(const DetailActionList &actions);
    // Whether the mark is shown.
    void setMarked(bool marked);
    // Moves the mark by so many places; stays at the ends.
    void move(int places);
    void moveToFirst();
    DetailAction current() const { return mActions.value(mIndex); }

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    QRect cell(int index) const;

    DetailActionList mActions;
    int mIndex = 0;
    bool mMarked = false;
};
