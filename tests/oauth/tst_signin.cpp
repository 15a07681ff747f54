#include "accountmanager/managerwidget.h"
#include "oauth/signintest.h"

class TestSignIn : public SignInTest
{
    Q_OBJECT

private slots:
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
        {
            const Helper::Session session;
            Helper::addAccount(kMail, "1234", "old");
        }
        QSettings(mFile->folder() + "/config.ini", QSettings::IniFormat)
            .setValue("Accounts/ProtectionCodes", offered);
        start();
        QSignalSpy finished(&mScreen->accounts, &AccountManager::loginFinished);
        signIn();
        allow();
        QTRY_COMPARE(rows(), QStringList(kMail + " 1234 before at rt false"));
        QCOMPARE(finished.size(), 0);
        const auto *form = mScreen->accounts.findChild<ManagerWidget *>();
        QCOMPARE(form && form->isVisible() && form->isOldUser(), offered);
        if (!offered)
            QVERIFY(message().isEmpty());
        mScreen->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(mScreen->isAtAccounts());
    }

    // Return leads back from every step, to a list on which New works again.
    void canceled_data()
    {
        QTest::addColumn<SignInStep>("step");
        QTest::addColumn<Server::Behaviour>("answer");
        QTest::addColumn<bool>("shows");
        const auto row = [](const char *name, const Server::Behaviour &answer) {
            QTest::newRow(name) << &SignInCase::signInPage << answer << true;
        };
        QTest::newRow("never loads") << &SignInCase::authorisation << Server::silence() << false;
        row("empty page", SignInCase::page(""));
        row("200 fields",
            SignInCase::page("<form>" + QByteArray("<input type=text>").repeated(200)));
        row("dialogs and files",
            SignInCase::page("<script>alert(1);confirm(2);prompt(3);print();open('/x');"
                             "location='file:///etc/passwd'</script><input type=text>"));
        row("expected page", SignInCase().signInPage);
    }

    void canceled()
    {
        QFETCH(SignInStep, step);
        QFETCH(Server::Behaviour, answer);
        QFETCH(bool, shows);
        SignInCase service;
        service.*step = answer;
        start(service);
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
        SignInCase().playOn(mServer.get());
        mScreen->chooseNew();
        QTRY_VERIFY(mScreen->isPageShown());
        mScreen->press(DEVICE_SELECT_KEY);
        QVERIFY(mScreen->findChild<QPopUpForm *>());
        mScreen->press(DEVICE_RETURN_KEY); // leaves the keyboard
        QVERIFY(mScreen->isPageShown());
        mScreen->press(DEVICE_RETURN_KEY); // leaves the page
        QTRY_VERIFY(mScreen->isAtAccounts());
    }
};

QTEST_MAIN(TestSignIn)
#include "tst_signin.moc"
