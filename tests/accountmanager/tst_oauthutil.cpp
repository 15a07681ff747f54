#include "accountmanager/accountmanagerhelper.h"
#include "network/systemconfig.h"
#include "oauth/oauthpage.h"
#include "oauth/oauthutil.h"
#include "support/logcapture.h"
#include "support/misbehavingserver.h"

#include <QNetworkAccessManager>
#include <QTemporaryDir>
#include <QtTest>

#include <memory>

namespace {

using Server = MisbehavingServer;

const QByteArray kTokens =
    R"({"access_token":"new","refresh_token":"new-r","expires_in":3600,"token_type":"Bearer"})";

// Stands for the web view: remembers what it was told.
class Page : public OAuthPage
{
public:
    QNetworkAccessManager *networkAccessManager() override { return &manager; }
    void load(const QUrl &url) override { loaded = url; }
    void close() override { ++closed; }

    QNetworkAccessManager manager;
    QUrl loaded;
    int closed = 0;
};

} // namespace

class TestOAuthUtil : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void authorizationPage();
    void codeIsExchanged();
    void titles_data();
    void titles();
    void refresh();
    void oddAnswersChangeNoToken_data();
    void oddAnswersChangeNoToken();
    void lifetimes_data();
    void lifetimes();
    void onlyTheOwnReplyCounts();
    void aNewRequestReplacesTheOldOne();
    void endsWhileItWaits();
    void tls();
    void refreshIsNotScheduled();

private:
    void serve(Server::Transport transport, bool verify = false);

    QTemporaryDir mFolder;
    std::unique_ptr<Server> mServer;
};

void TestOAuthUtil::init()
{
    AccountManagerHelper::setAccessToken("old");
    AccountManagerHelper::setRefreshToken("old-r");
    AccountManagerHelper::setExpires(0);
    qRegisterMetaType<QNetworkReply *>();
    serve(Server::Plain);
}

void TestOAuthUtil::serve(Server::Transport transport, bool verify)
{
    mServer = std::make_unique<Server>(transport);
    QFile config(mFolder.filePath("config.ini"));
    QVERIFY(config.open(QIODevice::WriteOnly));
    config.write("[Service]\nOAuthBase=" + mServer->url("/o/oauth2/").toUtf8() +
                 "\nScope=https://album.example/data/\n[Network]\nVerifyCertificates=" +
                 (verify ? "true" : "false") + "\n");
    config.close();
    SystemConfig::setConfigFile(config.fileName());
}

void TestOAuthUtil::authorizationPage()
{
    Page page;
    OAuthUtil util(&page);
    QSignalSpy timeout(&util, &OAuthUtil::loadingPageTimeout);
    util.startLoadingTimer(0);
    QTRY_VERIFY(!timeout.isEmpty());
    util.startUserAuthorizate();
    QCOMPARE(page.loaded.toString(),
             mServer->url("/o/oauth2/auth?client_id=583920174652-abcdefghijklmnopqrstuvwxyz"
                          "&redirect_uri=urn:ietf:wg:oauth:2.0:oob"
                          "&scope=https://album.example/data/&response_type=code"));
}

void TestOAuthUtil::codeIsExchanged()
{
    mServer->on("/o/oauth2/token", Server::answer(kTokens));
    Page page;
    OAuthUtil util(&page);
    util.startUserAuthorizate();
    QSignalSpy authorized(&util, &OAuthUtil::authorized);
    emit page.titleChanged("Sign in");
    QCOMPARE(page.closed, 0);
    emit page.titleChanged("Success code=4/a=b");
    QCOMPARE(page.closed, 1);
    emit page.titleChanged("Success code=again");
    QTRY_COMPARE(mServer->requests().size(), 1);
    QTRY_COMPARE(authorized.size(), 1);
    QCOMPARE(authorized.first().first().toBool(), true);
    QCOMPARE(mServer->requests().size(), 1);
    QCOMPARE(mServer->requests().first().body,
             QByteArray("code=4/a=b&client_id=583920174652-abcdefghijklmnopqrstuvwxyz"
                        "&client_secret=Qm7rT2vXk9LpZ4wHs1NdYb8E"
                        "&redirect_uri=urn:ietf:wg:oauth:2.0:oob&grant_type=authorization_code"));
    QCOMPARE(util.getAccessToken(), QString("new"));
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("new"));
    QCOMPARE(AccountManagerHelper::getRefreshToken(), QString("new-r"));
    QCOMPARE(AccountManagerHelper::getExpires(), 3600);
}

void TestOAuthUtil::titles_data()
{
    QTest::addColumn<QString>("title");
    QTest::addColumn<int>("closed");
    QTest::addColumn<int>("denied");
    QTest::addColumn<int>("posted");
    QTest::newRow("empty code") << "Success code=" << 1 << 0 << 1;
    QTest::newRow("no code") << "Success code" << 1 << 0 << 0;
    QTest::newRow("denied") << "Denied error=access_denied" << 1 << 1 << 0;
    QTest::newRow("other case") << "denied error=x" << 0 << 0 << 0;
    QTest::newRow("not at the start") << " Success code=1" << 0 << 0 << 0;
}

void TestOAuthUtil::titles()
{
    QFETCH(QString, title);
    Page page;
    OAuthUtil util(&page);
    util.startUserAuthorizate();
    QSignalSpy authorized(&util, &OAuthUtil::authorized);
    QSignalSpy answered(&page.manager, &QNetworkAccessManager::finished);
    emit page.titleChanged(title);
    QTEST(page.closed, "closed");
    QTEST(authorized.size(), "denied");
    QFETCH(int, posted);
    QTRY_COMPARE(answered.size(), posted);
    QCOMPARE(mServer->requests().size(), posted);
}

void TestOAuthUtil::refresh()
{
    mServer->on("/o/oauth2/token", Server::answer(R"({"access_token":"new","expires_in":"1800"})"));
    OAuthUtil util;
    QSignalSpy authorized(&util, &OAuthUtil::authorized);
    util.scheduleRefresh(true);
    QTRY_COMPARE(AccountManagerHelper::getAccessToken(), QString("new"));
    QCOMPARE(mServer->requests().first().body,
             QByteArray("client_id=583920174652-abcdefghijklmnopqrstuvwxyz"
                        "&client_secret=Qm7rT2vXk9LpZ4wHs1NdYb8E"
                        "&refresh_token=old-r&grant_type=refresh_token"));
    QCOMPARE(AccountManagerHelper::getRefreshToken(), QString("old-r"));
    QCOMPARE(AccountManagerHelper::getExpires(), 1800);
    QCOMPARE(authorized.size(), 0);
}

void TestOAuthUtil::oddAnswersChangeNoToken_data()
{
    QTest::addColumn<Server::Behaviour>("behaviour");
    QTest::newRow("page") << Server::html();
    QTest::newRow("empty") << Server::answer("");
    QTest::newRow("refused") << Server::answer(R"({"error":"invalid_grant"})", 400);
    QTest::newRow("tokens in a refusal") << Server::answer(kTokens, 400);
    QTest::newRow("redirect") << Server::redirect("/o/oauth2/elsewhere");
    QTest::newRow("byte-order mark") << Server::answer("\xEF\xBB\xBF" + kTokens);
    QTest::newRow("cut") << Server::cut(kTokens.left(40), kTokens.size());
    QTest::newRow("cut behind the brace") << Server::cut(kTokens, kTokens.size() + 9);
    QTest::newRow("reset") << Server::reset();
    QTest::newRow("bad chunks") << Server::badChunks();
    QTest::newRow("refresh token alone") << Server::answer(R"({"refresh_token":"x"})");
    QTest::newRow("null") << Server::answer(R"({"access_token":null,"refresh_token":{"a":1}})");
    QTest::newRow("array") << Server::answer(R"(["access_token"])");
    QTest::newRow("bomb") << Server::gzipBomb(8);
}

void TestOAuthUtil::oddAnswersChangeNoToken()
{
    QFETCH(Server::Behaviour, behaviour);
    mServer->on("/o/oauth2/token", behaviour);
    Page page;
    OAuthUtil util(&page);
    QSignalSpy authorized(&util, &OAuthUtil::authorized);
    QSignalSpy finished(&page.manager, &QNetworkAccessManager::finished);
    util.exchangeToken("code");
    QTRY_COMPARE(finished.size(), 1);
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("old"));
    QCOMPARE(AccountManagerHelper::getRefreshToken(), QString("old-r"));
    QVERIFY(util.getAccessToken().isEmpty());
    QCOMPARE(authorized.size(), 0);

    mServer->on("/o/oauth2/token", Server::answer(kTokens));
    util.exchangeToken("code");
    QTRY_COMPARE(authorized.size(), 1);
}

void TestOAuthUtil::lifetimes_data()
{
    QTest::addColumn<QByteArray>("member");
    QTest::addColumn<int>("expires");
    QTest::newRow("number") << QByteArray(R"("expires_in":3599)") << 3599;
    QTest::newRow("text") << QByteArray(R"("expires_in":"60")") << 60;
    QTest::newRow("negative") << QByteArray(R"("expires_in":-5)") << 0;
    QTest::newRow("word") << QByteArray(R"("expires_in":"soon")") << 0;
    QTest::newRow("too large") << QByteArray(R"("expires_in":1e300)") << 0;
    QTest::newRow("absent") << QByteArray(R"("other":1)") << 77;
}

void TestOAuthUtil::lifetimes()
{
    QFETCH(QByteArray, member);
    const QByteArray token(4096, 't');
    mServer->on("/o/oauth2/token",
                Server::answer("{\"access_token\":\"" + token + "\"," + member + "}"));
    AccountManagerHelper::setExpires(77);
    OAuthUtil util;
    util.refreshToken();
    QTRY_COMPARE(AccountManagerHelper::getAccessToken(), QString(token));
    QTEST(AccountManagerHelper::getExpires(), "expires");
}

void TestOAuthUtil::onlyTheOwnReplyCounts()
{
    mServer->on("/o/oauth2/token", Server::silence());
    mServer->on("/picture", Server::answer(kTokens));
    Page page;
    OAuthUtil util(&page);
    QSignalSpy authorized(&util, &OAuthUtil::authorized);
    util.exchangeToken("code");
    const std::unique_ptr<QNetworkReply> other(
        page.manager.get(QNetworkRequest(QUrl(mServer->url("/picture")))));
    QTRY_VERIFY(other->isFinished());
    QCOMPARE(authorized.size(), 0);
    QCOMPARE(other->readAll(), kTokens);
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("old"));
}

void TestOAuthUtil::aNewRequestReplacesTheOldOne()
{
    mServer->enqueue(Server::silence());
    mServer->enqueue(Server::answer(kTokens));
    OAuthUtil util;
    QSignalSpy authorized(&util, &OAuthUtil::authorized);
    util.exchangeToken("first");
    QTRY_COMPARE(mServer->requests().size(), 1);
    util.exchangeToken("second");
    QTRY_COMPARE(authorized.size(), 1);
    QCOMPARE(mServer->requests().size(), 2);
}

void TestOAuthUtil::endsWhileItWaits()
{
    mServer->on("/o/oauth2/token", Server::silence());
    auto page = std::make_unique<Page>();
    auto util = std::make_unique<OAuthUtil>(page.get());
    util->exchangeToken("code");
    QTRY_COMPARE(mServer->requests().size(), 1);
    util.reset();
    util = std::make_unique<OAuthUtil>(page.get());
    util->exchangeToken("code");
    page.reset();
    util->exchangeToken("code");
    util->handleTitleChanged("Denied error=late");
}

void TestOAuthUtil::tls()
{
    serve(Server::Tls);
    mServer->on("/o/oauth2/token", Server::answer(kTokens));
    {
        LogCapture log;
        OAuthUtil util;
        util.refreshToken();
        QTRY_COMPARE(AccountManagerHelper::getAccessToken(), QString("new"));
        QVERIFY(log.contains("---OAuthUtil::sslErrorHandler: "));
        QVERIFY(log.anyStartsWith("ssl error: "));
    }
    serve(Server::Tls, true);
    mServer->on("/o/oauth2/token", Server::answer(R"({"access_token":"stolen"})"));
    Page page;
    OAuthUtil util(&page);
    QSignalSpy finished(&page.manager, &QNetworkAccessManager::finished);
    util.refreshToken();
    QTRY_COMPARE(finished.size(), 1);
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("new"));
    QCOMPARE(mServer->requests().size(), 0);
}

void TestOAuthUtil::refreshIsNotScheduled()
{
    QCOMPARE(OAuthUtil::refreshInterval(3600), 3500000);
    QCOMPARE(OAuthUtil::refreshInterval(10), 0);
    QCOMPARE(OAuthUtil::refreshInterval(2000000000), 2147483647);
    AccountManagerHelper::setExpires(100);
    LogCapture log;
    OAuthUtil util;
    util.scheduleRefresh(false);
    QVERIFY(log.contains("get expires_in from helper: 100"));
    QCoreApplication::processEvents();
    QCOMPARE(mServer->connections(), 0);
}

QTEST_GUILESS_MAIN(TestOAuthUtil)
#include "tst_oauthutil.moc"
