#pragma once

#include <QPointer>
#include <QWidget>

class ErrorDialog;
class LoginPage;
class ManagerWidget;
class OAuthWidget;
class QHBoxLayout;
class ShortcutBar;
class WaitWidget;

// The first screen, and the owner of the sign-in:
//
//   LoginPage                AccountManager                    main widget
//   loginSucessed() ------>  startLoading()
//                            showNewWidget(wait widget) -----> shows it
//                            loginFinished()            -----> goes on to the home screen
//   oauthStarted()  ------>  startAuthorize()
//                            showNewWidget(web sign-in) -----> shows it
//     allowed                authorizeResult(true): stored, signed in, loginFinished()
//     refused                authorizeResult(false): an error, then the program ends
//     no answer              handleAuthorizeTimeOut(): an error on the account list
//     Return                 handleAuthorizeCancel(): the account list
//   formWanted()    ------>  showForm(): the account form in place of the list. Its account is
//                            proved or chosen there, and signed in, or stored with its PIN
//   exitApp(), Return ---->  onReturnClicked(): asks the platform to end the program
class AccountManager : public QWidget
{
    Q_OBJECT

public:
    explicit AccountManager(QWidget *parent = nullptr);
    ~AccountManager() override;

signals:
    // Asks for the widget to be shown in place of this one; it stays owned by this one's side.
    void showNewWidget(QWidget *w);
    // An account is signed in: AccountManagerHelper has its tokens.
    void loginFinished();

public slots:
    void onReturnClicked();
    void authorizeResult(bool allow);
    void startAuthorize();
    void startLoading();
    void handleAuthorizeCancel();
    void handleAuthorizeTimeOut();
    void showForm(const QString &account);
    void closeForm();

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    enum Outcome { SignedIn, NotStored, NotSignedIn };

    QWidget *makeTitle();
    void showWaitWidget();
    bool prepareWizard();
    Outcome storeAccount(const QString &account, const QString &pin, const QString &token);
    void askForOtherCode(const QString &account);
    ErrorDialog *showError(const QString &text);
    void dropWizard();
    void showAccounts();

    LoginPage *mLoginPage;
    QPointer<ManagerWidget> mForm; // in place of the list
    QHBoxLayout *mMiddle;
    ShortcutBar *mShortcutBar;
    QPointer<WaitWidget> mWaitWidget;
    QPointer<OAuthWidget> oauthWizard;
};
