#pragma once

#include <QKeyEvent>
#include <QPushButton>

// A button that leaves every key to the page it is on.
class PageButton : public QPushButton
{
public:
    using QPushButton::QPushButton;

protected:
    void keyPressEvent(QKeyEvent *event) override { event->ignore(); }
    void keyReleaseEvent(QKeyEvent *event) override { event->ignore(); }
};
