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

// The step of a sign-in that goes wrong, and what is answered then.
struct BadStep : SignInCase
{
    enum Step { SignInPage, SignInPosted, ConsentPage, ConsentPosted, Tokens };

    BadStep(Step wrong, const Server::Behaviour &bad)
        : step(wrong)
        , answer(bad)
    {
    }

    Server::Behaviour signInPage() override { return at(SignInPage, SignInCase::signInPage()); }
    Server::Behaviour signInPosted() override
    {
        return at(SignInPosted, SignInCase::signInPosted());
    }
    Server::Behaviour consentPage() override { return at(ConsentPage, SignInCase::consentPage()); }
    Server::Behaviour consentPosted() override
    {
        return at(ConsentPosted, SignInCase::consentPosted());
    }
    Server::Behaviour tokens() override { return at(Tokens, SignInCase::tokens()); }

    Server::Behaviour at(Step here, const Server::Behaviour &good) const
    {
        return step == here ? answer : good;
    }

    Step step;
    Server::Behaviour answer;
};

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
        SignInCase service;
        start(&service);
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
        using Step = BadStep::Step;
        QTest::addColumn<int>("step");
        QTest::addColumn<Server::Behaviour>("answer");
        const auto row = [](const char *name, Step step, const Server::Behaviour &answer) {
            QTest::newRow(name) << int(step) << answer;
        };
        const QByteArray tokens = R"({"access_token":"x","refresh_token":"y"})";
        // Its title comes, the rest never does.
        row("sign-in page stalls", Step::SignInPage,
            Server::raw("HTTP/1.1 200 OK\r\nContent-Type: text/html\r\nContent-Length: 9000\r\n"
                        "\r\n<title>Sign in</title>",
                        false));
        row("password unanswered", Step::SignInPosted, Server::silence());
        row("password cut off", Step::SignInPosted, Server::reset());
        row("consent unanswered", Step::ConsentPosted, Server::silence());
        row("consent cut off", Step::ConsentPosted, Server::reset());
        row("tokens as HTML", Step::Tokens, Server::html());
        row("code refused", Step::Tokens, Server::answer(R"({"error":"invalid_grant"})", 400));
        row("no refresh token", Step::Tokens, Server::answer(R"({"access_token":"x"})"));
        row("tokens cut", Step::Tokens, Server::cut(tokens, 900));
        row("tokens behind a mark", Step::Tokens, Server::answer("\xEF\xBB\xBF" + tokens));
        row("tokens elsewhere", Step::Tokens, Server::redirect("/o/oauth2/elsewhere"));
        row("tokens unanswered", Step::Tokens, Server::silence());
    }

    void badAnswers()
    {
        QFETCH(int, step);
        QFETCH(Server::Behaviour, answer);
        BadStep service(BadStep::Step(step), answer);
        store(kMail);
        start(&service, mPatience);
        mServer->on("/o/oauth2/elsewhere", service.SignInCase::tokens());
        if (step > BadStep::SignInPage)
            signIn();
        if (step > BadStep::SignInPosted)
            allow();
        waitForTimeOut();
        QCOMPARE(rows(), QStringList(kMail + " 7305 before old before false"));
    }

    // An error in place of the consent page stays on the screen to be read; Return leads back.
    void errorPage()
    {
        BadStep service(BadStep::ConsentPage, SignInCase::page("<p>Out of order", 500));
        start(&service, mPatience);
        signIn();
        QTRY_VERIFY(LogCapture::contains("documentStringList.at(0)=Out of order"));
        QVERIFY(mScreen->isPageShown());
        mScreen->press(DEVICE_SELECT_KEY);
        mScreen->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(mScreen->isAtAccounts());
    }

    // Odd, but enough to sign in with.
    void oddTokens_data()
    {
        QTest::addColumn<QString>("access");
        QTest::addColumn<QString>("lifetime");
        QTest::addColumn<bool>("slowly");
        QTest::addColumn<int>("expires");
        const QString small = "at", large(4096, 't');
        QTest::newRow("4 kB") << large << QString(",\"expires_in\":3600") << false << 3600;
        QTest::newRow("negative") << small << QString(",\"expires_in\":-5") << false << 0;
        QTest::newRow("text") << small << QString(",\"expires_in\":\"60\"") << false << 60;
        QTest::newRow("absent") << small << QString() << false << 77;
        QTest::newRow("slow") << small << QString(",\"expires_in\":9") << true << 9;
    }

    void oddTokens()
    {
        QFETCH(QString, access);
        QFETCH(QString, lifetime);
        QFETCH(bool, slowly);
        const QString answered(R"({"refresh_token":"r%1","access_token":"%1"%2})");
        const QByteArray body = answered.arg(access, lifetime).toUtf8();
        BadStep service(BadStep::Tokens, slowly ? Server::drip(body, 8, 60) : Server::answer(body));
        Helper::setExpires(77);
        start(&service);
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        allow();
        QTRY_COMPARE(finished.size(), 1);
        QCOMPARE(rows(),
                 QStringList(kMail + " 7305 Anna & Ole " + access + " r" + access + " true"));
        QTEST(Helper::getExpires(), "expires");
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
        SignInCase service;
        start(&service);
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
