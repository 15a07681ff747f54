#pragma once

#include "common/ui/picturebutton.h"

#include <QKeyEvent>

// A button that leaves every key to the page it is on.
class PageButton : public PictureButton
{
public:
    using PictureButton::PictureButton;

protected:
    void keyPressEvent(QKeyEvent *event) override { event->ignore(); }
    void keyReleaseEvent(QKeyEvent *event) override { event->ignore(); }
};
