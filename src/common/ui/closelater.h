#pragma once

#include <QPointer>
#include <QWidget>

// Hides what the pointer holds, forgets it, and has the event loop delete it: what closes a pop-up
// is mostly a signal of the pop-up's own. False when there was nothing to close.
template <typename Popup>
bool closeLater(QPointer<Popup> &popup)
{
    if (!popup)
        return false;
    QWidget *closed = popup;
    popup.clear(); // first: who gets the focus back may look whether it is still open
    closed->hide();
    closed->deleteLater();
    return true;
}
