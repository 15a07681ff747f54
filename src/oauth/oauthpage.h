#pragma once

#include <QObject>
#include <QString>

class QNetworkAccessManager;
class QUrl;

// The web view as OAuthUtil sees it. What embeds a browser implements this, so that nothing here
// depends on one.
class OAuthPage : public QObject
{
    Q_OBJECT

public:
    using QObject::QObject;

    // The manager that loads the page; the token request goes through it too, and shares its
    // cookies. Owned by the page, never null.
    virtual QNetworkAccessManager *networkAccessManager() = 0;
    virtual void load(const QUrl &url) = 0;
    // Stops loading and closes the view. Neither this object nor the manager may go away in here.
    virtual void close() = 0;

signals:
    // The service tells the result of a sign-in in the title of its page.
    void titleChanged(const QString &title);
};
