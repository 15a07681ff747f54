#pragma once

#include <QPointer>
#include <QWidget>

class AccountsWidget;
class QAbstractButton;
class QConfirm;
class QLabel;
class QVBoxLayout;

// The account list: the stored accounts, the one used last first, beside the buttons New and Exit.
// Select on an account signs it in with its stored PIN; its button Delete asks first.
class LoginPage : public QWidget
{
    Q_OBJECT

public:
    explicit LoginPage(QWidget *parent = nullptr);

    // Reads the accounts again. A list that cannot be read leaves the rows as they are.
    void reload();
    bool hasAccount(const QString &mail) const;
    // Shows a text below the list until the next key.
    void showMessage(const QString &text);

signals:
    void oauthStarted();
    void loginSucessed();
    void exitApp();

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
    bool signIn(const QString &mail);
    void restoreFocus();
    void handleUpOrDown(int rows);
    void handleSelect();
    void startOauth();
    void leave();

    AccountsWidget *mAccounts;
    QAbstractButton *mNewButton = nullptr;
    QAbstractButton *mExitButton = nullptr;
    QLabel *mHint; // in place of the list when it is empty
    QLabel *mMessage;
    QPointer<QConfirm> mConfirm;
};
