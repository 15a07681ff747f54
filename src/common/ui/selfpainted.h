#pragma once

#include <QEvent>
#include <QWidget>

// A frame or label that paints its ground itself: its style sheet tells the look, but must not
// paint it as well, which Qt does before the widget's own paintEvent().
template <class Base>
class SelfPainted : public Base
{
public:
    using Base::Base;

protected:
    bool event(QEvent *event) override
    {
        const bool isTaken = Base::event(event);
        this->setAttribute(Qt::WA_StyledBackground, false); // every polish sets it anew
        return isTaken;
    }
};
