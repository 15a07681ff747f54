#include "accountmanager/accountfile.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/managerwidget.h"
#include "base/i18n.h"
#include "common/ui/qpopupform.h"
#include "common/ui/remotekeys.h"
#include "endtoend/relay.h"
#include "endtoend/remotecase.h"
#include "endtoend/signinvisit.h"
#include "oauth/oauthwidget.h"

#include <QLabel>
#include <QWebView>

namespace {

using Server = MisbehavingServer;
using Behaviour = Server::Behaviour;

const char signInPath[] = "/ServiceLogin";
const char consentPath[] = "/o/oauth2/auth";
const char approvePath[] = "/o/oauth2/approve";
const char tokenPath[] = "/o/oauth2/token";
const QString password = QStringLiteral("mountains");

Behaviour page(const QByteArray &html, int status = 200)
{
    return Server::answer(html, status, {{"Content-Type", "text/html"}});
}

} // namespace

// What somebody sees when the service or the device fails in the middle of a sign-in: the whole
// program, behind a relay that spoils some of the service's answers.
class TestBadSignIn : public RemoteCase
{
    Q_OBJECT

    std::unique_ptr<Server> mRelay;

    void start(const QString &account = anna, const QString &pin = "7305")
    {
        {
            const AccountManagerHelper::Session session;
            AccountManagerHelper::setRefreshToken("old-r");
            QVERIFY(AccountManagerHelper::addAccount(account, pin, "old"));
        }
        QVERIFY(mTv->switchOn());
    }
    // From the account list as far as so many of the service's pages lead, up to the last press.
    void go(int pages)
    {
        SignInVisit visit(mTv.get());
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY});
        QCOMPARE(mTv->focus(), I18n::button(8)); // New
        if (pages == 0)
            return;
        QVERIFY(visit.open());
        QVERIFY(visit.fill(anna, password));
        if (pages == 1)
            mTv->press(DEVICE_DOWN_KEY);
        else
            QVERIFY(visit.submit() && visit.isAtConsent());
    }
    static void addAnswerColumns()
    {
        QTest::addColumn<int>("pages"); // that go well
        QTest::addColumn<QByteArray>("path");
        QTest::addColumn<Behaviour>("answer");
    }
    static void row(const char *name, int pages, const char *path, const Behaviour &answer)
    {
        QTest::newRow(name) << pages << QByteArray(path) << answer;
    }
    QStringList rows() const
    {
        return OtherConnection(SystemConfig::databasePath())
            .rows("SELECT usermail||' '||password||' '||token||' '||refresh||' '||login FROM "
                  "orvala1");
    }
    QString message() const
    {
        return mTv->shown<OAuthWidget>()->findChild<QLabel *>("message")->text();
    }

private slots:
    void initTestCase()
    {
        QVERIFY(mService.addPhoto("anna/Sea/Wave.jpg", Qt::blue));
        QVERIFY(mService.addUser(anna, "Anna & Ole", "anna", password));
        QVERIFY(mService.start());
    }
    void init()
    {
        mRelay = std::make_unique<Server>(Server::Tls);
        mRelay->otherwise(forwardTo(mService.port()));
        mTv = std::make_unique<Television>();
        mTv->useService(mRelay->url({}));
    }
    void cleanup()
    {
        mTv.reset();
        mRelay.reset();
    }

    // The stored account stays as it is, and the user is told and gets on.
    void badAnswers_data()
    {
        addAnswerColumns();
        row("nobody there", 0, "", {});
        // Its title comes, the rest never does.
        row("sign-in page stalls", 0, signInPath,
            Server::raw("HTTP/1.1 200 OK\r\nContent-Type: text/html\r\n"
                        "Content-Length: 9000\r\n\r\n<title>Sign in</title>",
                        false));
        row("password unanswered", 1, signInPath, Server::silence());
        row("password cut off", 1, signInPath, Server::reset());
        row("consent unanswered", 2, approvePath, Server::silence());
        row("consent cut off", 2, approvePath, Server::reset());
        row("code refused", 2, tokenPath, Server::answer(R"({"error":"invalid_grant"})", 400));
        row("no refresh token", 2, tokenPath, Server::answer(R"({"access_token":"x"})"));
        row("tokens unanswered", 2, tokenPath, Server::silence());
    }

    void badAnswers()
    {
        QFETCH(int, pages);
        QFETCH(QByteArray, path);
        QFETCH(Behaviour, answer);
        start();
        go(pages);
        mTv->set("Network/SignInSeconds", 1);
        if (answer)
            mRelay->on(path, answer);
        else
            mRelay->close();
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_COMPARE_WITH_TIMEOUT(mTv->focus(), QString("ErrorDialog"), 20000);
        mTv->press(DEVICE_RETURN_KEY); // leaves the message, not the program
        QTRY_COMPARE(mTv->focus(), I18n::button(8));
        QCOMPARE(rows(), QStringList(anna + " 7305 old old-r false"));
    }

    // Return leads back from whatever page comes, to a list on which New works again.
    void canceled_data()
    {
        addAnswerColumns();
        row("", 0, consentPath, Server::silence());
        row("Closed", 0, signInPath, page("<p>Closed"));
        row("Hello", 0, signInPath,
            page("Hello<script>alert(1);confirm(2);prompt(3);print();open('/x');"
                 "location='file:///etc/passwd'</script><input type=text>"));
        row("Out of order", 1, consentPath, page("<p>Out of order", 500)); // and stays to be read
    }

    void canceled()
    {
        QFETCH(int, pages);
        QFETCH(QByteArray, path);
        QFETCH(Behaviour, answer);
        start();
        go(pages);
        mRelay->on(path, answer);
        mTv->press(DEVICE_SELECT_KEY);
        SignInVisit visit(mTv.get());
        QTRY_COMPARE(visit.text(), QTest::currentDataTag());
        mTv->press({DEVICE_DOWN_KEY, DEVICE_UP_KEY, DEVICE_RETURN_KEY});
        QTRY_COMPARE(mTv->focus(), I18n::button(8));
        mRelay->on(path, forwardTo(mService.port()));
        QVERIFY(visit.open());
        mTv->press(DEVICE_SELECT_KEY);
        QVERIFY(mTv->shown<QPopUpForm>());
        mTv->press(DEVICE_RETURN_KEY); // leaves the keyboard
        QCOMPARE(mTv->focus(), QString("OAuthView"));
        mTv->press(DEVICE_RETURN_KEY); // leaves the page
        QTRY_COMPARE(mTv->focus(), I18n::button(8));
    }

    // The service has agreed, but the device cannot keep it.
    void notStored_data()
    {
        QTest::addColumn<QString>("fault"); // another program's statement
        QTest::addColumn<QString>("account");
        for (const QString fault : {"BEGIN EXCLUSIVE", "DROP TABLE orvala1"}) {
            for (const QString &account : {anna, ben}) // renewed, or another one is added
                QTest::addRow("%s, %s", qPrintable(fault), qPrintable(account)) << fault << account;
        }
    }

    void notStored()
    {
        QFETCH(QString, fault);
        QFETCH(QString, account);
        start(account);
        const QStringList before = rows();
        go(2);
        {
            const OtherConnection other(SystemConfig::databasePath());
            other.rows(fault);
            mTv->press(DEVICE_SELECT_KEY);
            QTRY_COMPARE_WITH_TIMEOUT(message(), AccountTexts::text(AccountTexts::NotStored),
                                      15000);
        }
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_COMPARE(mTv->focus(), I18n::button(8));
        QCOMPARE(mTv->accounts(), QStringList(account));
        QCOMPARE(rows(), fault.startsWith("DROP") ? QStringList() : before);
    }

    // An account with a code of its own gets the new tokens and is asked for the code, or, where
    // codes are not offered, stays signed out without a word.
    void anotherCode_data()
    {
        QTest::addColumn<bool>("offered");
        QTest::newRow("offered") << true;
        QTest::newRow("not offered") << false;
    }

    void anotherCode()
    {
        QFETCH(bool, offered);
        mTv->set("Accounts/ProtectionCodes", offered);
        start(anna, "1234");
        go(2);
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(!rows().first().contains("old"));
        QVERIFY(rows().first().startsWith(anna + " 1234 ") && rows().first().endsWith(" false"));
        QVERIFY(!mTv->home());
        QTRY_COMPARE(bool(mTv->shown<ManagerWidget>()), offered);
        if (offered)
            QVERIFY(mTv->shown<ManagerWidget>()->isOldUser());
        else
            QVERIFY(message().isEmpty());
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_COMPARE(mTv->focus(), I18n::button(8));
    }
};

int main(int argc, char *argv[])
{
    TestBadSignIn test;
    return RemoteCase::run(test, argc, argv);
}
#include "tst_badsignin.moc"
