#include "accountmanager/managerwidget.h"

#include "accountmanager/pinlineedit.h"
#include "accountmanager/usernamelineedit.h"
#include "common/ui/remotekeys.h"

#include <QAbstractButton>
#include <QKeyEvent>

// The keys of the account form, and where they move its focus.

// The arrows and Return are the form's, whichever field they are pressed in.
void ManagerWidget::registerEvents()
{
    for (int i = 0; i < FocusCount; ++i)
        widgetAt(i)->installEventFilter(this);
}

QWidget *ManagerWidget::widgetAt(int index) const
{
    switch (index) {
    case LoginId:
        return mLoginId;
    case ListButton:
        return mListButton;
    case Next:
        return mNextButton;
    case Cancel:
        return mCancelButton;
    default:
        return mPinBoxes.at(index - FirstPin);
    }
}

void ManagerWidget::focusAt(int index)
{
    mFocusIndex = index;
    widgetAt(index)->setFocus();
}

// To the next place in that direction that takes the focus; the ends stay.
void ManagerWidget::moveFocus(int step)
{
    for (int index = mFocusIndex + step; index >= 0 && index < FocusCount; index += step) {
        if (widgetAt(index)->isEnabled())
            return focusAt(index);
    }
}

bool ManagerWidget::handleArrow(int key)
{
    const bool isPin = mFocusIndex >= FirstPin && mFocusIndex < Next;
    switch (key) {
    case DEVICE_LEFT_KEY:
        moveFocus(-1);
        return true;
    case DEVICE_RIGHT_KEY:
        moveFocus(1);
        return true;
    case DEVICE_UP_KEY:
        focusAt(mFocusIndex >= Next ? FirstPin : LoginId);
        return true;
    case DEVICE_DOWN_KEY:
        if (mFocusIndex < FirstPin)
            focusAt(FirstPin);
        else if (isPin)
            focusAt(mNextButton->isEnabled() ? Next : Cancel);
        return true;
    default:
        return false;
    }
}

bool ManagerWidget::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::FocusIn) {
        for (int i = 0; i < FocusCount; ++i) {
            if (watched == widgetAt(i))
                mFocusIndex = i;
        }
    }
    if (event->type() != QEvent::KeyPress)
        return QWidget::eventFilter(watched, event);
    const int key = static_cast<QKeyEvent *>(event)->key();
    if (key == DEVICE_RETURN_KEY) {
        onCancelClicked();
        return true;
    }
    return handleArrow(key) || QWidget::eventFilter(watched, event);
}

void ManagerWidget::keyPressEvent(QKeyEvent *event)
{
    if (event->key() != DEVICE_SELECT_KEY) {
        event->ignore();
        return;
    }
    if (mFocusIndex == LoginId)
        showInputDialog();
    else if (auto *button = qobject_cast<QAbstractButton *>(widgetAt(mFocusIndex)))
        button->click();
}

void ManagerWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    focusAt(mFocusIndex);
}
