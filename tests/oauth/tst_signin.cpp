#include "accountmanager/accountfile.h"
#include "accountmanager/accountmanager.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/errordialog.h"
#include "accountmanager/loginpage.h"
#include "base/i18n.h"
#include "common/keyrobot.h"
#include "common/ui/keyboardlayout.h"
#include "common/ui/qpopupform.h"
#include "oauth/oauthwidget.h"
#include "oauth/signincase.h"
#include "oauth/signinplugin.h"
#include "res/resources.h"
#include "support/logcapture.h"

#include <QAbstractButton>
#include <QLabel>
#include <QStackedWidget>
#include <QtTest>

#include <memory>

using Helper = AccountManagerHelper;
using Server = MisbehavingServer;

namespace {

const QString kMail = QStringLiteral("anna@home.example");

// The main window as far as the sign-in sees it, with a user who holds the remote.
class Screen : public QStackedWidget
{
public:
    Screen()
    {
        resize(1280, 720);
        connect(&accounts, &AccountManager::showNewWidget, this, [this](QWidget *page) {
            if (indexOf(page) < 0)
                addWidget(page);
            setCurrentWidget(page);
        });
        addWidget(&accounts);
        show();
        QApplication::setActiveWindow(this);
    }
    ~Screen() override { removeWidget(&accounts); }

    void chooseNew()
    {
        for (QAbstractButton *button : accounts.findChildren<QAbstractButton *>()) {
            if (button->text() == QLatin1String("New")) {
                button->setFocus();
                press(DEVICE_SELECT_KEY);
            }
        }
    }
    OAuthWidget *wizard() { return findChild<OAuthWidget *>(); }
    bool isAtAccounts() { return currentWidget() == &accounts && !wizard(); }
    bool isPageShown() const
    {
        const QWidget *focus = QApplication::focusWidget();
        return focus && focus->inherits("OAuthView") && focus->isVisible();
    }
    void press(int key)
    {
        if (QWidget *focus = QApplication::focusWidget())
            pressKey(focus, key);
    }
    void type(const QString &text)
    {
        press(DEVICE_SELECT_KEY);
        auto *form = findChild<QPopUpForm *>();
        QVERIFY(form);
        KeyRobot robot(form);
        QVERIFY(robot.type(text));
        robot.press(EnterKey);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }

    AccountManager accounts{this};
};

} // namespace

class TestSignIn : public QObject
{
    Q_OBJECT

    std::unique_ptr<AccountFile> mFile;
    std::unique_ptr<Server> mServer;
    std::unique_ptr<Screen> mScreen;
    std::unique_ptr<LogCapture> mLog;

    void configure(const QByteArray &seconds)
    {
        QSettings config(mFile->folder() + "/config.ini", QSettings::IniFormat);
        config.setValue("Service/OAuthBase", mServer->url("/o/oauth2/"));
        config.setValue("Service/SignInPage", mServer->url("/ServiceLogin"));
        config.setValue("Service/Scope", "https://album.example/");
        config.setValue("Network/SignInSeconds", seconds);
        config.sync();
        SystemConfig::setConfigFile(config.fileName());
    }

    void start(SignInCase *service, const QByteArray &seconds = "20")
    {
        mServer = std::make_unique<Server>();
        service->playOn(mServer.get());
        configure(seconds);
        mScreen = std::make_unique<Screen>();
        mScreen->chooseNew();
    }
    void signIn()
    {
        QTRY_VERIFY(mScreen->isPageShown());
        mScreen->type(kMail);
        mScreen->press(DEVICE_RIGHT_KEY);
        mScreen->type("s3'\\\"</script>");
        mScreen->press(DEVICE_DOWN_KEY);
        mScreen->press(DEVICE_SELECT_KEY);
    }
    void answer(bool allow)
    {
        QTRY_VERIFY(LogCapture::contains("documentStringList.at(0)=Anna & Ole"));
        if (!allow)
            mScreen->press(DEVICE_RIGHT_KEY);
        mScreen->press(DEVICE_SELECT_KEY);
    }
    QByteArray bodyOf(const QByteArray &path) const
    {
        for (const Server::Request &request : mServer->requests()) {
            if (request.path == path && request.method == "POST")
                return request.body;
        }
        return QByteArray();
    }
    QStringList rows() const
    {
        return OtherConnection(mFile->path())
            .rows("SELECT usermail||' '||password||' '||name||' '||token||' '||refresh||' '||login"
                  " FROM orvala1");
    }
    QString message() const { return mScreen->wizard()->findChild<QLabel *>("message")->text(); }
    void waitForTimeOut()
    {
        QTRY_VERIFY_WITH_TIMEOUT(mScreen->isAtAccounts(), 20000);
        QVERIFY(mScreen->findChild<ErrorDialog *>());
        mScreen->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(!mScreen->findChild<ErrorDialog *>());
        QCOMPARE(LogCapture::lines().count("Return key has been Pressed"), 0);
    }

private slots:
    void initTestCase() { initResources(); }
    void init()
    {
        mFile = std::make_unique<AccountFile>();
        mLog = std::make_unique<LogCapture>();
        for (const auto set :
             {Helper::setAccessToken, Helper::setRefreshToken, Helper::setUserName})
            set("before");
    }
    void cleanup()
    {
        mScreen.reset();
        mServer.reset();
        mLog.reset();
    }

    void allowed()
    {
        SignInCase service;
        start(&service);
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        answer(true);
        QTRY_COMPARE(finished.size(), 1);
        QCOMPARE(bodyOf("/ServiceLogin"),
                 QByteArray("mail=anna%40home.example&pw=s3%27%5C%22%3C%2Fscript%3E"));
        QVERIFY(bodyOf("/o/oauth2/token").startsWith("code=4/ab&client_id="));
        QCOMPARE(rows(), QStringList(kMail + " 7305 Anna & Ole at rt true"));
        QCOMPARE(Helper::getAccessToken(), QString("at"));
        QCOMPARE(Helper::getExpires(), 3600);
    }

    void allowedAgain()
    {
        {
            const Helper::Session session;
            Helper::addAccount(kMail, "7305", "old");
            Helper::addAccount("ole", "7305", "old");
            Helper::login("ole", "7305");
        }
        SignInCase service;
        start(&service);
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        answer(true);
        QTRY_COMPARE(finished.size(), 1);
        QCOMPARE(rows(), QStringList({kMail + " 7305 before at rt true",
                                      "ole 7305 before old before false"}));
    }

    void denied()
    {
        SignInCase service;
        start(&service);
        signIn();
        answer(false);
        QTRY_VERIFY(mScreen->findChild<ErrorDialog *>());
        QCOMPARE(mScreen->currentWidget(), &mScreen->accounts);
        QCOMPARE(Helper::getAccessToken(), QString("before"));
        mScreen->press(DEVICE_SELECT_KEY);
        QVERIFY(LogCapture::contains("Return key has been Pressed")); // the program is asked to end
    }

    // Return leads back from every step, to a list on which New works again.
    void canceled_data()
    {
        struct NeverLoads : SignInCase
        {
            Server::Behaviour authorisation() override { return Server::silence(); }
        };
        struct Empty : SignInCase
        {
            Server::Behaviour signInPage() override { return page(""); }
        };
        struct Foreign : SignInCase
        {
            Server::Behaviour authorisation() override { return page("<p>Out of order", 500); }
        };
        struct Huge : SignInCase
        {
            Server::Behaviour signInPage() override
            {
                return page("<form>" + QByteArray("<input type=text>").repeated(200));
            }
        };
        struct Dialogs : SignInCase
        {
            Server::Behaviour signInPage() override
            {
                return page("<script>alert(1);confirm(2);prompt(3);print();open('/x');"
                            "location='file:///etc/passwd'</script><input type=text>");
            }
        };
        QTest::addColumn<std::shared_ptr<SignInCase>>("service");
        QTest::addColumn<bool>("shows");
        const auto row = [](const char *name, SignInCase *service, bool shows) {
            QTest::newRow(name) << std::shared_ptr<SignInCase>(service) << shows;
        };
        row("never loads", new NeverLoads, false);
        row("empty page", new Empty, true);
        row("another page", new Foreign, true);
        row("200 fields", new Huge, true);
        row("dialogs and files", new Dialogs, true);
        row("expected page", new SignInCase, true);
    }

    void canceled()
    {
        QFETCH(std::shared_ptr<SignInCase>, service);
        QFETCH(bool, shows);
        start(service.get());
        if (shows)
            QTRY_VERIFY(mScreen->isPageShown());
        else // the ring turns and the program waits
            QTRY_COMPARE(mServer->requests().size(), 1);
        for (int key : {DEVICE_DOWN_KEY, DEVICE_UP_KEY, DEVICE_RETURN_KEY})
            mScreen->press(key);
        QTRY_VERIFY(mScreen->isAtAccounts());
        QVERIFY(LogCapture::contains("handleAthorizeCancel invoked!"));
        const auto *button = qobject_cast<QAbstractButton *>(QApplication::focusWidget());
        QCOMPARE(button ? button->text() : QString(), QString("New"));
        SignInCase good;
        good.playOn(mServer.get());
        mScreen->chooseNew();
        QTRY_VERIFY(mScreen->isPageShown());
        mScreen->press(DEVICE_SELECT_KEY);
        QVERIFY(mScreen->findChild<QPopUpForm *>());
        mScreen->press(DEVICE_RETURN_KEY); // leaves the keyboard
        QVERIFY(mScreen->isPageShown());
        mScreen->press(DEVICE_RETURN_KEY); // leaves the page
        QTRY_VERIFY(mScreen->isAtAccounts());
    }

    // The rest of the page never comes, although its title did.
    void stalled()
    {
        struct Stalled : SignInCase
        {
            Server::Behaviour signInPage() override
            {
                return Server::raw("HTTP/1.1 200 OK\r\nContent-Type: text/html\r\n"
                                   "Content-Length: 9000\r\n\r\n<title>Sign in</title>",
                                   false);
            }
        } service;
        start(&service, "1");
        waitForTimeOut();
    }

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

    // What the token request may get; the stored account stays as it is and the user gets on.
    void badTokens_data()
    {
        QTest::addColumn<Server::Behaviour>("tokens");
        QTest::newRow("HTML") << Server::html();
        QTest::newRow("refused") << Server::answer(R"({"error":"invalid_grant"})", 400);
        QTest::newRow("no refresh token") << Server::answer(R"({"access_token":"x"})");
        QTest::newRow("cut") << Server::cut(R"({"access_token":"x","refresh_token":"y"})", 900);
        QTest::newRow("silence") << Server::silence();
    }

    void badTokens()
    {
        struct BadTokens : SignInCase
        {
            Server::Behaviour answer;
            Server::Behaviour tokens() override { return answer; }
        } service;
        QFETCH(Server::Behaviour, tokens);
        service.answer = tokens;
        {
            const Helper::Session session;
            Helper::addAccount(kMail, "7305", "old");
        }
        start(&service, "2");
        signIn();
        answer(true);
        waitForTimeOut();
        QCOMPARE(rows(), QStringList(kMail + " 7305 before old before false"));
    }

    void notStored_data()
    {
        QTest::addColumn<QString>("fault");
        QTest::newRow("locked") << "BEGIN EXCLUSIVE";
        QTest::newRow("no table") << "DROP TABLE orvala1";
        QTest::newRow("full") << "CREATE TRIGGER full BEFORE INSERT ON orvala1 BEGIN SELECT "
                                 "RAISE(ABORT, 'database or disk is full'); END";
    }

    void notStored()
    {
        QFETCH(QString, fault);
        {
            const Helper::Session session;
            Helper::addAccount("ole", "7305", "old");
        }
        SignInCase service;
        start(&service);
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        const OtherConnection other(mFile->path());
        other.rows(fault);
        answer(true);
        QTRY_COMPARE_WITH_TIMEOUT(message(), AccountTexts::text(AccountTexts::NotStored), 15000);
        QCOMPARE(finished.size(), 0);
        other.rows("ROLLBACK");
        mScreen->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(mScreen->isAtAccounts());
        QVERIFY(mScreen->accounts.findChild<LoginPage *>()->hasAccount("ole"));
    }

    void noPlugin()
    {
        SignInPlugin::setFile(mFile->path());
        SignInCase service;
        start(&service);
        SignInPlugin::setFile(QString());
        QVERIFY(mScreen->isAtAccounts());
        QCOMPARE(mScreen->accounts.findChild<QLabel *>("message")->text(),
                 AccountTexts::text(AccountTexts::SignInUnavailable));
    }
};

QTEST_MAIN(TestSignIn)
#include "tst_signin.moc"
