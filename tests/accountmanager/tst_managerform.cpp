#include "accountmanager/accountfile.h"
#include "accountmanager/accountlist.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/managerwidget.h"
#include "accountmanager/pinlineedit.h"
#include "accountmanager/usernamelineedit.h"
#include "base/i18n.h"
#include "common/keyrobot.h"
#include "common/ui/keyboardlayout.h"
#include "common/ui/qpopupform.h"
#include "res/resources.h"

#include <QLabel>
#include <QPushButton>
#include <QtTest>

#include <memory>

class TestManagerForm : public QObject
{
    Q_OBJECT

    const QString mStored = QString(90, 'm') + "@x.example";
    std::unique_ptr<AccountFile> mFile;
    std::unique_ptr<ManagerWidget> mForm;

    void press(int key) { pressKey(QApplication::focusWidget(), key); }
    QString tip() const { return mForm->findChild<QLabel *>("tip")->text(); }
    QList<PinLineEdit *> boxes() const { return mForm->findChildren<PinLineEdit *>(); }
    QPushButton *button(const QString &text) const
    {
        for (QPushButton *candidate : mForm->findChildren<QPushButton *>()) {
            if (candidate->text() == text)
                return candidate;
        }
        return nullptr;
    }
    void enterLoginId(const QString &text)
    {
        press(DEVICE_SELECT_KEY);
        QPopUpForm *keyboard = mForm->findChild<QPopUpForm *>();
        KeyRobot robot(keyboard);
        QVERIFY(robot.type(text));
        robot.press(EnterKey);
        QVERIFY(!keyboard->isVisible());
    }
    // Digit by digit, each when the one before has turned into "*", then Next.
    void enterPin(const QString &pin)
    {
        for (int i = 0; i < pin.size(); ++i) {
            QCOMPARE(QApplication::focusWidget(), boxes().at(i));
            QVERIFY(!button("Next")->isEnabled());
            press(pin.at(i).unicode());
            QCOMPARE(boxes().at(i)->text(), QString(pin.at(i)));
            QTRY_COMPARE(boxes().at(i)->text(), QString("*"));
        }
        QCOMPARE(QApplication::focusWidget(), button("Next"));
        press(DEVICE_SELECT_KEY);
    }
    void checkStartedOver()
    {
        QCOMPARE(QApplication::focusWidget(), boxes().first());
        for (const PinLineEdit *box : boxes())
            QVERIFY(box->text().isEmpty() && box->digit().isEmpty());
        QVERIFY(!button("Next")->isEnabled());
    }

private slots:
    void initTestCase() { initResources(); }
    void init()
    {
        mFile = std::make_unique<AccountFile>();
        {
            const AccountManagerHelper::Session session;
            AccountManagerHelper::setRefreshToken("r");
            AccountManagerHelper::addAccount("anna", "1234", "t");
            AccountManagerHelper::addAccount(mStored, "1234", "t");
        }
        SystemConfig::mScreen_Width = 1280;
        SystemConfig::mScreen_Height = 720;
        mForm = std::make_unique<ManagerWidget>();
        mForm->resize(900, 500);
        mForm->show();
        QVERIFY(QTest::qWaitForWindowActive(mForm.get()));
    }
    void cleanup() { mForm.reset(); }

    // A stored account proves its PIN first, also when the form was about to sign one in.
    void existingAccount()
    {
        QSignalSpy started(mForm.get(), &ManagerWidget::oauthStarted);
        mForm->setOldUser(true);
        enterLoginId("anna");
        QCOMPARE(tip(), I18n::login(11));
        QVERIFY(!mForm->isOldUser());
        enterPin("1235");
        QCOMPARE(tip(), I18n::login(8));
        checkStartedOver();
        OtherConnection(mFile->path()).rows("ALTER TABLE orvala1 RENAME TO away");
        enterPin("1234"); // proves nothing while the accounts cannot be read
        checkStartedOver();
        QCOMPARE(started.size(), 0);
        OtherConnection(mFile->path()).rows("ALTER TABLE away RENAME TO orvala1");
        enterPin("1234");
        QCOMPARE(started.size(), 1);
    }

    // Typed straight into the field, a stored login ID is known as well when the field is left.
    void typedLoginId()
    {
        QTest::keyClicks(mForm->findChild<UserNameLineEdit *>(), "anna");
        press(DEVICE_DOWN_KEY);
        QCOMPARE(tip(), I18n::login(11));
        QCOMPARE(QApplication::focusWidget(), boxes().first());
        for (PinLineEdit *box : boxes())
            box->setDigit('1');
        QTRY_VERIFY(button("Next")->isEnabled());
        boxes().at(2)->setFocus();
        press(DEVICE_CLEAR_KEY); // three digits are no code
        QVERIFY(!button("Next")->isEnabled());
    }

    void chosenAccount()
    {
        QSignalSpy signedIn(mForm.get(), &ManagerWidget::loginSucessed);
        press(DEVICE_RIGHT_KEY);
        press(DEVICE_SELECT_KEY);
        QVERIFY(mForm->findChild<AccountList *>()->isVisible());
        press(DEVICE_RETURN_KEY); // out of the list, not of the form
        QCOMPARE(QApplication::focusWidget(), button("Local Account"));
        press(DEVICE_SELECT_KEY);
        press(DEVICE_DOWN_KEY);
        press(DEVICE_DOWN_KEY);
        press(DEVICE_SELECT_KEY);
        QVERIFY(mForm->isOldUser());
        QCOMPARE(mForm->findChild<UserNameLineEdit *>()->text(), mStored);
        enterPin("0000");
        QCOMPARE(tip(), I18n::login(8));
        checkStartedOver();
        enterPin("1234");
        QCOMPARE(signedIn.size(), 1);
        QCOMPARE(mForm->name(), mStored);
    }

    void pinBox()
    {
        PinLineEdit *box = boxes().at(1);
        box->setFocus();
        QTest::keyClick(box, 'a');
        QVERIFY(box->text().isEmpty());
        press('1');
        press('2');
        QCOMPARE(box->digit(), QString("2"));
        QTRY_COMPARE(QApplication::focusWidget(), boxes().at(2));
        press(DEVICE_LEFT_KEY);
        press(DEVICE_CLEAR_KEY);
        QVERIFY(box->text().isEmpty() && box->digit().isEmpty());
        press(DEVICE_SELECT_KEY);
        KeyRobot robot(mForm->findChild<QPopUpForm *>());
        QVERIFY(robot.type("7"));
        robot.press(EnterKey);
        QCOMPARE(box->digit(), QString("7"));
    }
};

QTEST_MAIN(TestManagerForm)
#include "tst_managerform.moc"
