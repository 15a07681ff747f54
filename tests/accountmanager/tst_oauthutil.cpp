#include "accountmanager/accountmanagerhelper.h"
#include "oauth/oauthpage.h"
#include "oauth/oauthutil.h"
#include "support/misbehavingserver.h"
#include "support/testconfig.h"

#include <QNetworkAccessManager>
#include <QtTest>

#include <memory>

using Helper = AccountManagerHelper;
using Server = MisbehavingServer;

namespace {

const char kPath[] = "/o/oauth2/token";
const QByteArray kTokens = R"({"access_token":"new","refresh_token":"new-r","expires_in":3600})";
const QByteArray kClient = "client_id=583920174652-abcdefghijklmnopqrstuvwxyz";
const QByteArray kSecret = "&client_secret=Qm7rT2vXk9LpZ4wHs1NdYb8E";
const QByteArray kRedirect = "&redirect_uri=urn:ietf:wg:oauth:2.0:oob";

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

    TestConfig mConfig;
    std::unique_ptr<Server> mServer;

    void serve(Server::Transport transport, const QByteArray &verify = "false")
    {
        mServer = std::make_unique<Server>(transport);
        mConfig.write("[Service]\nOAuthBase=" + mServer->url("/o/oauth2/").toUtf8() +
                      "\nScope=https://album.example/\n[Network]\nVerifyCertificates=" + verify);
    }

private slots:
    void init()
    {
        qRegisterMetaType<QNetworkReply *>();
        Helper::setAccessToken("old");
        Helper::setRefreshToken("old-r");
        serve(Server::Plain);
    }

    void signIn()
    {
        mServer->on(kPath, Server::answer(kTokens));
        Page page;
        OAuthUtil util(&page);
        QSignalSpy timeout(&util, &OAuthUtil::loadingPageTimeout);
        util.startLoadingTimer(0);
        QTRY_VERIFY(!timeout.isEmpty());
        util.startUserAuthorizate();
        QCOMPARE(page.loaded.toEncoded(), mServer->url("/o/oauth2/auth?").toUtf8() + kClient +
                                              kRedirect +
                                              "&scope=https://album.example/&response_type=code");
        QSignalSpy authorized(&util, &OAuthUtil::authorized);
        for (const char *title : {"Sign in", "Success code=4/a=b", "Success code=again"})
            emit page.titleChanged(title);
        QCOMPARE(page.closed, 1);
        QTRY_COMPARE(authorized.size(), 1);
        QCOMPARE(authorized.first().first().toBool(), true);
        QCOMPARE(mServer->requests().size(), 1);
        QCOMPARE(mServer->requests().first().body,
                 "code=4/a=b&" + kClient + kSecret + kRedirect + "&grant_type=authorization_code");
        QCOMPARE(util.getAccessToken(), QString("new"));
        QCOMPARE(Helper::getAccessToken(), QString("new"));
        QCOMPARE(Helper::getRefreshToken(), QString("new-r"));
        QCOMPARE(Helper::getExpires(), 3600);
    }

    void titles()
    {
        // How often the page is closed, the denial told, the code sent.
        const std::tuple<const char *, int, int, int> rows[] = {{"Success code=", 1, 0, 1},
                                                                {"Success code", 1, 0, 0},
                                                                {"Denied error=x", 1, 1, 0},
                                                                {"denied error=x", 0, 0, 0},
                                                                {" Success code=1", 0, 0, 0}};
        for (const auto &[title, closed, denied, posted] : rows) {
            Page page;
            OAuthUtil util(&page);
            util.startUserAuthorizate();
            QSignalSpy authorized(&util, &OAuthUtil::authorized);
            QSignalSpy answered(&page.manager, &QNetworkAccessManager::finished);
            emit page.titleChanged(title);
            QCOMPARE(page.closed, closed);
            QCOMPARE(authorized.size(), denied);
            QTRY_COMPARE(answered.size(), posted);
        }
        QCOMPARE(mServer->requests().size(), 1);
    }

    void refresh_data()
    {
        QTest::addColumn<int>("expires");
        QTest::newRow(R"("expires_in":3599)") << 3599;
        QTest::newRow(R"("expires_in":2000000)") << 2000000;
        QTest::newRow(R"("expires_in":"60")") << 60;
        QTest::newRow(R"("expires_in":-5)") << 0;
        QTest::newRow(R"("expires_in":"soon")") << 0;
        QTest::newRow(R"("expires_in":1e300)") << 0;
        QTest::newRow(R"("other":1)") << 77;
    }

    void refresh()
    {
        const QString token(4096, 't');
        mServer->on(kPath, Server::answer("{\"access_token\":\"" + token.toUtf8() + "\"," +
                                          QTest::currentDataTag() + "}"));
        Helper::setExpires(77);
        OAuthUtil util;
        QSignalSpy authorized(&util, &OAuthUtil::authorized);
        util.scheduleRefresh(true);
        QTRY_COMPARE(Helper::getAccessToken(), token);
        QTEST(Helper::getExpires(), "expires");
        QCOMPARE(mServer->requests().first().body,
                 kClient + kSecret + "&refresh_token=old-r" + "&grant_type=refresh_token");
        QCOMPARE(Helper::getRefreshToken(), QString("old-r"));
        QCOMPARE(authorized.size(), 0);
        QCOMPARE(OAuthUtil::refreshInterval(3600), 3500000);
        QCOMPARE(OAuthUtil::refreshInterval(10), 0);
    }

    void oddAnswersChangeNoToken_data()
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
        QTest::newRow("refresh token alone") << Server::answer(R"({"refresh_token":"x"})");
        QTest::newRow("null") << Server::answer(R"({"access_token":null,"refresh_token":{}})");
        QTest::newRow("bomb") << Server::gzipBomb(8);
    }

    void oddAnswersChangeNoToken()
    {
        QFETCH(Server::Behaviour, behaviour);
        mServer->enqueue(behaviour);
        Page page;
        OAuthUtil util(&page);
        QSignalSpy authorized(&util, &OAuthUtil::authorized);
        QSignalSpy finished(&page.manager, &QNetworkAccessManager::finished);
        util.exchangeToken("code");
        QTRY_COMPARE(finished.size(), 1);
        QCOMPARE(Helper::getAccessToken(), QString("old"));
        QCOMPARE(Helper::getRefreshToken(), QString("old-r"));
        QVERIFY(util.getAccessToken().isEmpty());
        QCOMPARE(authorized.size(), 0);
        mServer->on(kPath, Server::answer(kTokens));
        util.exchangeToken("code");
        QTRY_COMPARE(authorized.size(), 1);
    }

    void onlyTheReplyOfTheLastRequestCounts()
    {
        mServer->enqueue(Server::silence());
        mServer->on("/picture", Server::answer(kTokens));
        Page page;
        OAuthUtil util(&page);
        QSignalSpy authorized(&util, &OAuthUtil::authorized);
        util.exchangeToken("first");
        QTRY_COMPARE(mServer->requests().size(), 1);
        QNetworkReply *other = page.manager.get(QNetworkRequest(QUrl(mServer->url("/picture"))));
        QTRY_VERIFY(other->isFinished());
        QCOMPARE(other->readAll(), kTokens);
        QCOMPARE(Helper::getAccessToken(), QString("old"));
        mServer->on(kPath, Server::answer(kTokens));
        util.exchangeToken("second");
        QTRY_COMPARE(authorized.size(), 1);
    }

    void endsWhileItWaits()
    {
        mServer->on(kPath, Server::silence());
        auto page = std::make_unique<Page>();
        OAuthUtil(page.get()).exchangeToken("code");
        OAuthUtil util(page.get());
        util.exchangeToken("code");
        QTRY_VERIFY(!mServer->requests().isEmpty());
        page.reset();
        util.exchangeToken("code");
        util.handleTitleChanged("Denied error=late");
    }

    void badCertificatesFailWhereTheyAreVerified()
    {
        serve(Server::Tls, "true");
        Page page;
        OAuthUtil util(&page);
        QSignalSpy finished(&page.manager, &QNetworkAccessManager::finished);
        util.refreshToken();
        QTRY_COMPARE(finished.size(), 1);
        QCOMPARE(mServer->requests().size(), 0);
    }
};

QTEST_GUILESS_MAIN(TestOAuthUtil)
#include "tst_oauthutil.moc"
