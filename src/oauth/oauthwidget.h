#pragma once

#include <QPointer>
#include <QString>
#include <QTimer>
#include <QWidget>

#include <memory>

class OAuthUtil;
class QLabel;
class QPopUpForm;
class QProgressIndicator;
class QStackedWidget;
class ShortcutBar;
class SignInView;

// The sign-in through the service's own pages:
//
//   startAuthorizate() --> ring turns, page loads --> showWebView(): the page, with the focus
//   a field is chosen  --> showInputDialog() --> keyboard form --> getInput() --> into the page
//   allowed or denied  --> the page closes, tokens are asked for --> oauthFinished(bool)
//
// Return leaves at every moment: authorizeCanceled(). A server that does not answer ends in
// authorizeConnectTimeout(). Whoever gets one of these signals may delete this widget later, not at
// once.
class OAuthWidget : public QWidget
{
    Q_OBJECT

public:
    explicit OAuthWidget(std::unique_ptr<SignInView> page, QWidget *parent = nullptr);
    ~OAuthWidget() override;

    // The e-mail address as it was typed into the page; empty when none was.
    QString getAccountMail() const { return mAccountMail; }
    QString getOauthAccessToken() const;
    // Shows a text in place of the page; Return is the way on.
    void showMessage(const QString &text);

signals:
    void oauthFinished(bool result);
    void authorizeCanceled();
    void authorizeConnectTimeout();

public slots:
    void startAuthorizate();
    void showAuthorizationView();
    void showInputDialog();
    void showWebView();
    void closeInputDialog();
    void getInput(const QString &contents);
    void handleError();
    void handleLoadingTimeout();
    void getAuthorizedResult(bool result);

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;
    void showEvent(QShowEvent *event) override;

private:
    void buildLayout();
    QWidget *makeLoadingPage();
    QWidget *makeBottomBar();
    void connectPage();
    void startLoading();
    void stopAnimation();
    void stopTimers();
    void handleLoadStarted();
    void handleLoadFinished(bool finished);
    void showPage(QWidget *page);
    void takePageColour();
    void takeFocus();

    std::unique_ptr<SignInView> mPage;
    std::unique_ptr<OAuthUtil> mUtil; // uses the page's manager: goes first
    QString mAccountMail;
    QStackedWidget *mStack = nullptr;
    QWidget *mLoadingPage = nullptr;
    QProgressIndicator *mRing = nullptr;
    QProgressIndicator *mBusy = nullptr; // beside a page that loads the next one
    ShortcutBar *mHints = nullptr;
    QLabel *mMessage = nullptr;
    QPointer<QPopUpForm> mInputForm;
    // Any title stops the sign-in's own timer, also that of a page of which the rest never comes.
    QTimer mStallTimer;
};
