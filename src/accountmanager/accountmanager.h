#pragma once

#include <QPointer>
#include <QWidget>

class LoginPage;
class QLabel;
class ShortcutBar;
class WaitWidget;

// The first screen, and the owner of the sign-in:
//
//   LoginPage                AccountManager                 main widget
//   oauthStarted()  ------>  startAuthorize()
//   loginSucessed() ------>  startLoading()
//                            showNewWidget(wait widget) --> shows it
//                            loginFinished()            --> goes on to the home screen
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
    void startAuthorize();
    void startLoading();

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    QWidget *makeTitle();
    void showWaitWidget();

    LoginPage *mLoginPage;
    ShortcutBar *mShortcutBar;
    QPointer<WaitWidget> mWaitWidget;
};
