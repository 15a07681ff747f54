#pragma once

#include "accountmanager/accountfield.h"

// The field for the login ID of the account form. It leaves Select to the form. Digits and letters
// may also be typed straight into it.
class UserNameLineEdit : public AccountField
{
    Q_OBJECT

public:
    explicit UserNameLineEdit(QWidget *parent = nullptr);

    // Takes a text from the keyboard form.
    void setInput(const QString &text);
    // Shows a stored account, which may be longer than what is typed. Typing replaces it.
    void showAccount(const QString &account);

signals:
    void editCompleted(); // by the keyboard form
    void typed();         // the field was left after keys had changed its text

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;

private:
    bool mIsTyped = false;
};
