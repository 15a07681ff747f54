#pragma once

#include <QByteArray>
#include <QList>
#include <QMap>
#include <QNetworkReply>
#include <QObject>
#include <QPointer>
#include <QSslError>
#include <QString>
#include <QTimer>

class OAuthPage;
class QNetworkAccessManager;

// The authorisation-code flow of OAuth 2.0 for an installed program.
//
//   owner                      OAuthUtil                          service
//   startUserAuthorizate() --> page loads .../auth?client_id= -->
//                              handleTitleChanged()           <-- title "Success code=..."
//                              exchangeToken(code)            --> POST .../token
//   authorized(true)       <-- handleFinishedData()           <-- access and refresh token
//
//   scheduleRefresh(true)  --> refreshToken()                 --> POST .../token
//                              handleFinishedData()           <-- access token
//
// Tokens and their lifetime go into AccountManagerHelper, in memory only; an answer that is not a
// successful one, or lacks the access token, changes neither token. A request that is never
// answered emits nothing.
class OAuthUtil : public QObject
{
    Q_OBJECT

public:
    // The stand-alone form: refreshes tokens, with a network manager of its own.
    explicit OAuthUtil(QObject *parent = nullptr);
    // The form that signs a user in; the page is not owned and may go away first.
    explicit OAuthUtil(OAuthPage *page, QObject *parent = nullptr);
    ~OAuthUtil() override;

    void startUserAuthorizate();
    // Without an answer of the page within this time loadingPageTimeout() comes.
    void startLoadingTimer(int milliseconds);
    void stopTimer();
    // Access token of the last answer; empty when it had none.
    QString getAccessToken() const { return mAccessToken; }
    // True: refreshes at once. False: does not refresh (see there).
    void scheduleRefresh(bool now);
    // When a token of that lifetime in seconds is due for its refresh, in milliseconds.
    static int refreshInterval(int expires);

signals:
    void authorized(bool result);
    void loadingPageTimeout();

public slots:
    void handleTitleChanged(const QString &changedTitle);
    void sslErrorHandler(QNetworkReply *reply, const QList<QSslError> &errlist);
    void handleFinishedData(QNetworkReply *reply);
    void networkPost(const QString &url, const QByteArray &data);
    void exchangeToken(const QString &code);
    void refreshToken();

private:
    static const QString ClientId;
    static const QString ClientSecret;
    static const QString RedirectUri;

    void init();
    void dropReply();
    void readResponse(QNetworkReply *reply);
    void takeTokens();

    QTimer mLoadingTimer;
    QMap<QString, QString> mResponse;
    QPointer<OAuthPage> mPage;
    QPointer<QNetworkAccessManager> mManager;
    QString mAccessToken;
    QPointer<QNetworkReply> mReply; // the request in flight
};
