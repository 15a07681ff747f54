#include "accountmanager/usernamelineedit.h"

#include "accountmanager/pinlineedit.h"
#include "common/ui/keymap.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>

#include <utility>

namespace {

constexpr int kLongest = 8;

} // namespace

UserNameLineEdit::UserNameLineEdit(QWidget *parent)
    : QLineEdit(parent)
{
    setMaxLength(kLongest);
    setStyleSheet(accountFieldStyle());
    setContextMenuPolicy(Qt::NoContextMenu);
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
    QLineEdit::keyPressEvent(event);
}

void UserNameLineEdit::focusOutEvent(QFocusEvent *event)
{
    QLineEdit::focusOutEvent(event);
    if (std::exchange(mIsTyped, false))
        emit typed();
}
