#pragma once

#include "oauth/signinview.h"
#include "oauth/web/pagewatchdog.h"

#include <QPointer>

class OAuthView;

// OAuthView behind the interface that the program knows.
class WebSignInView : public SignInView
{
    Q_OBJECT

public:
    explicit WebSignInView(const SignInViewFactory::Addresses &addresses);
    // Clears what the browser has kept in memory. Not to be called from a signal of this object.
    ~WebSignInView() override;

    QNetworkAccessManager *networkAccessManager() override;
    void load(const QUrl &url) override;
    void close() override;
    QWidget *widget() override;
    QString editedType() const override;
    QString editedText() const override;
    void setEditedText(const QString &text) override;

private:
    PageWatchdog mWatchdog;
    QPointer<OAuthView> mView; // the widget that it is put into may end it first
};

class WebSignInViewFactory : public QObject, public SignInViewFactory
{
    Q_OBJECT
    Q_INTERFACES(SignInViewFactory)
    Q_PLUGIN_METADATA(IID ORVALA_SIGNIN_INTERFACE)

public:
    SignInView *create(const Addresses &addresses) override;
};
