#include "oauth/web/websigninview.h"

#include "oauth/web/oauthview.h"

#include <QWebPage>
#include <QWebSettings>

namespace {

// The largest page that is taken is laid out in a small part of this, even on a slow device.
constexpr std::chrono::seconds kPatience(15);

} // namespace

WebSignInView::WebSignInView(const SignInViewFactory::Addresses &addresses)
    : mWatchdog(kPatience)
{
    OAuthView::AuthorizeUrl = addresses.authorize;
    OAuthView::LoginUrl = addresses.login;
    mView = new OAuthView;
    const OAuthView *view = mView;
    connect(view, &QWebView::loadStarted, this, &SignInView::loadStarted);
    connect(view, &QWebView::loadFinished, this, &SignInView::loadFinished);
    connect(view, &OAuthView::pageLoadFinished, this, &SignInView::pageLoadFinished);
    connect(view, &OAuthView::showKeyboard, this, &SignInView::showKeyboard);
    connect(view, &OAuthView::cancelAuthorize, this, &SignInView::cancelAuthorize);
    connect(view, &OAuthView::errorOccured, this, &SignInView::errorOccured);
    connect(view, &OAuthView::userNameFound, this, &SignInView::userNameFound);
    // A title that ends the sign-in closes the page: not while the browser is still reading it.
    connect(view, &QWebView::titleChanged, this, &OAuthPage::titleChanged, Qt::QueuedConnection);
}

WebSignInView::~WebSignInView()
{
    if (mView) {
        mView->disconnect(this);
        mView->halt();
        delete mView;
    }
    QWebSettings::clearMemoryCaches();
}

QNetworkAccessManager *WebSignInView::networkAccessManager()
{
    return mView->page()->networkAccessManager();
}

void WebSignInView::load(const QUrl &url)
{
    mView->load(url);
}

void WebSignInView::close()
{
    mView->halt();
    mView->close();
    emit pageClosed();
}

QWidget *WebSignInView::widget()
{
    return mView;
}

QString WebSignInView::editedType() const
{
    return mView->editedType();
}

QString WebSignInView::editedText() const
{
    return mView->editedText();
}

void WebSignInView::setEditedText(const QString &text)
{
    mView->setEditedText(text);
}

SignInView *WebSignInViewFactory::create(const Addresses &addresses)
{
    return new WebSignInView(addresses);
}
