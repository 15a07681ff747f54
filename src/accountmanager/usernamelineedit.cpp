#include "accountmanager/usernamelineedit.h"

#include "common/ui/keymap.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>

#include <utility>

namespace {

constexpr int kLongest = 8;

} // namespace

UserNameLineEdit::UserNameLineEdit(QWidget *parent)
    : AccountField(parent)
{
    setMaxLength(kLongest);
    KeyMap::setTakesText(this);
    connect(this, &QLineEdit::textEdited, this, [this] { mIsTyped = true; });
}

void UserNameLineEdit::setInput(const QString &text)
{
    setMaxLength(kLongest);
    setText(text);
    emit editCompleted();
}

void UserNameLineEdit::showAccount(const QString &account)
{
    setMaxLength(qMax(kLongest, account.size()));
    setText(account);
    setCursorPosition(0);
}

void UserNameLineEdit::keyPressEvent(QKeyEvent *event)
{
    if (event->key() == DEVICE_SELECT_KEY) {
        event->ignore();
        return;
    }
    if (maxLength() > kLongest && !event->text().isEmpty()) {
        clear();
        setMaxLength(kLongest);
    }
    AccountField::keyPressEvent(event);
}

void UserNameLineEdit::focusOutEvent(QFocusEvent *event)
{
    AccountField::focusOutEvent(event);
    if (std::exchange(mIsTyped, false))
        emit typed();
}
