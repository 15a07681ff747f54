#pragma once

#include "oauth/web/pageelements.h"

#include <QString>
#include <QTimer>
#include <QWebView>

// The service's sign-in and consent pages, driven by the remote: the page's fields and buttons
// become a list that the arrow keys step through, with a red outline around the one in focus.
// Select clicks a button, or asks for the keyboard for a field; Return cancels.
//
//   loadFinished() --> handleFinished()   sign-in page: fields, buttons     (first time:
//                                         consent page: approve, deny        pageLoadFinished())
//   timer          --> handleValidatePanel(): a panel with a picture came or went after a reload
//
// The page may change or go away at any time: every element is looked at with that in mind.
class OAuthView : public QWebView
{
    Q_OBJECT

public:
    static QString AuthorizeUrl; // what the consent page's address begins with
    static QString LoginUrl;     // what the sign-in page's address begins with

    explicit OAuthView(QWidget *parent = nullptr);

    // The field that the keyboard edits: its attribute "type", and its text.
    QString editedType() const;
    QString editedText() const;
    void setEditedText(const QString &text);
    // Stops loading and looking for the panel.
    void halt();

signals:
    void showKeyboard();
    void pageLoadFinished();
    void cancelAuthorize();
    void errorOccured();
    void userNameFound(const QString &name);

public slots:
    void checkFocus(); // paints the outlines
    void handleFinished(bool finished);
    QWebElement document();
    void handleValidatePanel();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    void takeConsentPage();
    void takeSignInPage();
    void takeUserName();
    void startPolling();
    void takePanel();
    void leavePanel();
    bool collect();
    void focusElement(int index);
    void moveFocus(int step);
    void activate();
    int focusedIndex() const;

    pageelements::List mWebElements;
    int mFocusIndex = 0;
    QWebElement mEditElement;
    QWebElement mDocument;
    bool mIsLoginPageShown = false;
    bool mHasPanel = false;
    QTimer *mPanelTimer = nullptr; // made on first use
};
