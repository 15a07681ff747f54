#pragma once

#include "accountmanager/accountfile.h"
#include "accountmanager/accountmanager.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/errordialog.h"
#include "accountmanager/loginpage.h"
#include "common/keyrobot.h"
#include "common/ui/keyboardlayout.h"
#include "common/ui/qpopupform.h"
#include "oauth/oauthwidget.h"
#include "oauth/signincase.h"
#include "res/resources.h"
#include "support/logcapture.h"

#include <QAbstractButton>
#include <QLabel>
#include <QStackedWidget>
#include <QtTest>

#include <memory>

using Helper = AccountManagerHelper;
using Server = MisbehavingServer;

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

// A user, the screen, an account file, and a service that plays a SignInCase.
class SignInTest : public QObject
{
    Q_OBJECT

protected:
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

    void start(const SignInCase &service = {}, const QByteArray &seconds = "20")
    {
        mServer = std::make_unique<Server>();
        service.playOn(mServer.get());
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
    void allow()
    {
        QTRY_VERIFY(LogCapture::contains("documentStringList.at(0)=Anna & Ole"));
        mScreen->press(DEVICE_SELECT_KEY);
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
};
