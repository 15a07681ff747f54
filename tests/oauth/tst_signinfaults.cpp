#include "accountmanager/accounttexts.h"
#include "accountmanager/filefaults.h"
#include "oauth/signintest.h"

#include <functional>

namespace {

using Fault = std::function<std::shared_ptr<void>(const AccountFile &)>; // until it is let go

// A statement of another program, whose connection stays open.
Fault statement(const QString &sql)
{
    return [sql](const AccountFile &file) {
        auto other = std::make_shared<OtherConnection>(file.path());
        other->rows(sql);
        return other;
    };
}

} // namespace

Q_DECLARE_METATYPE(Fault)

// What a person sees when the service or the device fails in the middle of a sign-in.
class TestSignInFaults : public SignInTest
{
    Q_OBJECT

    // Without other news the user is told after this time, in seconds.
    const QByteArray mPatience = "1";

    static void store(const QString &mail)
    {
        const Helper::Session session;
        QVERIFY(Helper::addAccount(mail, "7305", "old"));
    }

private slots:
    void unreachable()
    {
        start();
        mScreen.reset();
        mServer->close();
        mServer->closeConnections();
        mScreen = std::make_unique<Screen>();
        mScreen->chooseNew();
        waitForTimeOut();
    }

    // The stored account stays as it is, and the user is told and gets on.
    void badAnswers_data()
    {
        using Step = SignInCase;
        QTest::addColumn<SignInStep>("step");
        QTest::addColumn<Server::Behaviour>("answer");
        const auto row = [](const char *name, SignInStep step, const Server::Behaviour &answer) {
            QTest::newRow(name) << step << answer;
        };
        const QByteArray tokens = R"({"access_token":"x","refresh_token":"y"})";
        // Its title comes, the rest never does.
        row("sign-in page stalls", &Step::signInPage,
            Server::raw("HTTP/1.1 200 OK\r\nContent-Type: text/html\r\nContent-Length: 9000\r\n"
                        "\r\n<title>Sign in</title>",
                        false));
        row("password unanswered", &Step::signInPosted, Server::silence());
        row("password cut off", &Step::signInPosted, Server::reset());
        row("consent unanswered", &Step::consentPosted, Server::silence());
        row("consent cut off", &Step::consentPosted, Server::reset());
        row("tokens as HTML", &Step::tokens, Server::html());
        row("code refused", &Step::tokens, Server::answer(R"({"error":"invalid_grant"})", 400));
        row("no refresh token", &Step::tokens, Server::answer(R"({"access_token":"x"})"));
        row("tokens cut", &Step::tokens, Server::cut(tokens, 900));
        row("tokens behind a mark", &Step::tokens, Server::answer("\xEF\xBB\xBF" + tokens));
        row("tokens elsewhere", &Step::tokens, Server::redirect("/o/oauth2/elsewhere"));
        row("tokens unanswered", &Step::tokens, Server::silence());
    }

    void badAnswers()
    {
        QFETCH(SignInStep, step);
        QFETCH(Server::Behaviour, answer);
        SignInCase service;
        service.*step = answer;
        store(kMail);
        start(service, mPatience);
        mServer->on("/o/oauth2/elsewhere", SignInCase().tokens);
        if (step != &SignInCase::signInPage)
            signIn();
        if (step == &SignInCase::consentPosted || step == &SignInCase::tokens)
            allow();
        waitForTimeOut();
        QCOMPARE(rows(), QStringList(kMail + " 7305 before old before false"));
    }

    // An error in place of the consent page stays on the screen to be read; Return leads back.
    void errorPage()
    {
        SignInCase service;
        service.consentPage = SignInCase::page("<p>Out of order", 500);
        start(service, mPatience);
        signIn();
        QTRY_VERIFY(LogCapture::contains("documentStringList.at(0)=Out of order"));
        QVERIFY(mScreen->isPageShown());
        mScreen->press(DEVICE_SELECT_KEY);
        mScreen->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(mScreen->isAtAccounts());
    }

    // Odd, but enough to sign in with.
    void longTokensThatComeSlowly()
    {
        const QString access(4096, 't');
        const QString answered(R"({"refresh_token":"r%1","access_token":"%1"})");
        SignInCase service;
        service.tokens = Server::drip(answered.arg(access).toUtf8(), 1000, 60);
        Helper::setExpires(77);
        start(service);
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        allow();
        QTRY_COMPARE(finished.size(), 1);
        QCOMPARE(rows(),
                 QStringList(kMail + " 7305 Anna & Ole " + access + " r" + access + " true"));
        QCOMPARE(Helper::getExpires(), 77);
    }

    // The service has agreed, but the device cannot keep it.
    void notStored_data()
    {
        QTest::addColumn<Fault>("fault");
        QTest::addColumn<bool>("isKnown");   // an account is renewed, not added
        QTest::addColumn<bool>("keepsRows"); // the fault itself destroys none
        const Fault readOnly = [](const AccountFile &file) {
            return std::make_shared<ReadOnly>(file);
        };
        const Fault full = [](const AccountFile &) { return std::make_shared<FullDisk>(100); };
        const Fault damaged = [](const AccountFile &file) {
            file.write("", QByteArray(30000, 'x'));
            return nullptr;
        };
        for (const bool isKnown : {false, true}) {
            const auto row = [isKnown](const QByteArray &name, const Fault &fault, bool keepsRows) {
                QTest::newRow(name + (isKnown ? ", renewed" : ", new"))
                    << fault << isKnown << keepsRows;
            };
            row("locked", statement("BEGIN EXCLUSIVE"), true);
            row("read-only", readOnly, true);
            row("full disk", full, true);
            row("damaged", damaged, false);
            row("no table", statement("DROP TABLE orvala1"), false);
        }
    }

    void notStored()
    {
        QFETCH(Fault, fault);
        QFETCH(bool, isKnown);
        QFETCH(bool, keepsRows);
        store(isKnown ? kMail : QString("ole"));
        const QStringList before = rows();
        start();
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        QTRY_VERIFY(LogCapture::contains("documentStringList.at(0)=Anna & Ole"));
        {
            const std::shared_ptr<void> held = fault(*mFile);
            allow();
            QTRY_COMPARE_WITH_TIMEOUT(message(), AccountTexts::text(AccountTexts::NotStored),
                                      15000);
        }
        QCOMPARE(finished.size(), 0);
        mScreen->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(mScreen->isAtAccounts());
        QVERIFY(mScreen->accounts.findChild<LoginPage *>()->hasAccount(isKnown ? kMail : "ole"));
        if (keepsRows)
            QCOMPARE(rows(), before);
    }
};

QTEST_MAIN(TestSignInFaults)
#include "tst_signinfaults.moc"
