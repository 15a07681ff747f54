#pragma once

#include "oauth/oauthpage.h"

#include <QtPlugin>

class QWidget;

// The page as OAuthWidget sees it: a browser that the remote control drives. The only
// implementation is a plug-in (src/oauth/web), so that the program pays for a browser only when
// somebody signs in. Nothing in here is shared with the plug-in but what passes through this class.
class SignInView : public OAuthPage
{
    Q_OBJECT

public:
    using OAuthPage::OAuthPage;

    // The widget that shows the page; it belongs to this object and goes with it.
    virtual QWidget *widget() = 0;
    // Attribute "type" of the field that the keyboard edits; empty for none.
    virtual QString editedType() const = 0;
    virtual QString editedText() const = 0;
    // Puts the text into that field, exactly as it stands.
    virtual void setEditedText(const QString &text) = 0;

signals:
    void loadStarted();
    void loadFinished(bool finished); // false: broken off, or the server is not there
    void pageLoadFinished();          // the sign-in page is there for the first time
    void showKeyboard();              // a field was chosen
    void cancelAuthorize();           // Return was pressed
    void errorOccured();              // the page has nothing that could be filled in
    void userNameFound(const QString &name);
    void pageClosed(); // after close()
};

// What the plug-in offers.
class SignInViewFactory
{
public:
    struct Addresses
    {
        QString authorize; // what the consent page's address begins with
        QString login;     // what the sign-in page's address begins with
    };

    virtual ~SignInViewFactory() = default;
    // The caller owns the view.
    virtual SignInView *create(const Addresses &addresses) = 0;
};

#define ORVALA_SIGNIN_INTERFACE "orvala.SignInViewFactory/1"
Q_DECLARE_INTERFACE(SignInViewFactory, ORVALA_SIGNIN_INTERFACE)
