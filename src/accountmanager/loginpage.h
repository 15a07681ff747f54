#pragma once

#include <QList>
#include <QPointer>
#include <QWidget>

class AccountsWidget;
class QAbstractButton;
class QConfirm;
class QLabel;
class QVBoxLayout;

// The account list: the stored accounts, the one used last first, beside the buttons New and Exit.
// Select on an account signs it in with its stored PIN; its button Delete asks first. Where
// protection codes are offered, a button between the two leads to the account form, and an account
// with a code of its own is not signed in without it.
class LoginPage : public QWidget
{
    Q_OBJECT

public:
    explicit LoginPage(QWidget *parent = nullptr);

    // Reads the accounts again. A list that cannot be read leaves the rows as they are; without
    // any, each key tries anew.
    void reload();
    bool hasAccount(const QString &mail) const;
    // Shows a text below the list until the next key.
    void showMessage(const QString &text);

signals:
    void oauthStarted();
    void loginSucessed();
    void exitApp();
    // The account form is wanted, for the code of that account; an empty one: for a new one.
    void formWanted(const QString &account);

public slots:
    // Signs the current account in: loginSucessed(), or a message on the page.
    void handleSelectIndex();
    // Asks whether the current account is to go, over the whole of the parent.
    void popupConfirmDialog();
    void handleDeleteAccount();
    void handleDelCancel();

    bool eventFilter(QObject *watched, QEvent *event) override;

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void showEvent(QShowEvent *event) override;

private:
    void buildLayout();
    QAbstractButton *makeButton(QVBoxLayout *column, const QString &text);
    enum Outcome { SignedIn, NeedsCode, Failed };
    static Outcome signIn(const QString &mail);
    void restoreFocus();
    void handleLeft();
    void handleRight();
    void handleUpOrDown(int rows);
    void handleSelect();
    int focusedButton() const;
    void startOauth();
    void openForm();
    void leave();

    AccountsWidget *mAccounts;
    QAbstractButton *mNewButton = nullptr;
    QAbstractButton *mFormButton = nullptr; // null where codes are not offered
    QAbstractButton *mExitButton = nullptr;
    QList<QAbstractButton *> mButtons; // from above
    QLabel *mHint;                     // in place of the list when it is empty
    QLabel *mMessage;
    bool mIsReadable = true; // the accounts, the last time
    QPointer<QConfirm> mConfirm;
};
