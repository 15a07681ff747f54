#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/errordialog.h"
#include "app/mainapplication.h"
#include "base/i18n.h"
#include "common/ui/remotekeys.h"
#include "endtoend/albumservice.h"
#include "endtoend/signinvisit.h"
#include "endtoend/television.h"
#include "platform/ipc.h"
#include "res/resources.h"
#include "ui/upwidget.h"

#include <QTest>
#include <QWebView>

namespace {

struct Person
{
    QString mail, name, password;
};

const Person anna = {"anna@orvala.example", "Anna Lindqvist", "mountains"};
// What a page, a script and an address have their own meaning for.
const Person ben = {"ben@orvala.example", QString::fromUtf8("Ben \u201c<b>\u201d & Co"),
                    QString::fromUtf8("'\"\\<b>%1;\u00e9")};
constexpr int photos = 8;

} // namespace

// Somebody with the remote, the whole program, and the sign-in pages of a real album service.
class TestSignInPages : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        initResources();
        for (int i = 1; i <= photos; ++i)
            QVERIFY(mService.addPhoto(
                QStringLiteral("%1/Sea/%2.jpg").arg(i % 2 ? "anna" : "ben").arg(i), Qt::blue));
        QVERIFY(mService.addUser(anna.mail, anna.name, "anna", anna.password));
        QVERIFY(mService.addUser(ben.mail, ben.name, "ben", ben.password));
    }

    void init()
    {
        QVERIFY(mService.start());
        QVERIFY(mService.waitForPhotos(photos));
        mTv = std::make_unique<Television>();
        mTv->useService(mService.url());
        mTv->set("Accounts/ProtectionCodes", true);
        QVERIFY(mTv->switchOn());
        QCOMPARE(mTv->focus(), I18n::button(8)); // New: there is nothing else to do
    }

    void cleanup()
    {
        mTv.reset();
        mService.kill();
    }

    void aHouseholdSignsInAndOut()
    {
        signInAfterWrongPasswords(anna);
        arriveAtHome(anna);

        signOut();
        QCOMPARE(mTv->accounts(), QStringList(anna.mail));
        QTRY_COMPARE(mTv->focus(), anna.mail);
        mTv->press(DEVICE_SELECT_KEY);
        arriveAtHome(anna);

        signOut();
        QTRY_COMPARE(mTv->focus(), anna.mail);
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY});
        signIn(ben);
        arriveAtHome(ben);

        signOut();
        QCOMPARE(mTv->accounts(), QStringList({ben.mail, anna.mail}));
        QTRY_COMPARE(mTv->focus(), ben.mail);
        mTv->press({DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        QTRY_COMPARE(mTv->focus(), QString("QConfirm"));
        mTv->press(DEVICE_SELECT_KEY); // yes
        QTRY_COMPARE(mTv->accounts(), QStringList(ben.mail));
        QTRY_COMPARE(mTv->focus(), ben.mail);
        mTv->press(DEVICE_SELECT_KEY);
        arriveAtHome(ben);
    }

    void aCodeGuardsAnAccount()
    {
        mTv->press(DEVICE_DOWN_KEY);
        QCOMPARE(mTv->focus(), I18n::login(3));
        mTv->press(DEVICE_SELECT_KEY);
        QVERIFY(mTv->type("anna"));
        enterCode("4711");
        QCOMPARE(mTv->label("tip"), I18n::login(9));
        enterCode("4712");
        QCOMPARE(mTv->label("tip"), I18n::login(10));
        QVERIFY(!mTv->page());
        enterCode("4711");
        SignInVisit visit(mTv.get());
        QVERIFY(visit.isOpen());
        mTv->press(DEVICE_RETURN_KEY); // back to the form, which still knows all
        QTRY_COMPARE(mTv->focus(), I18n::button(3));
        signIn(anna);
        arriveAtHome(anna, "anna", "4711");

        signOut();
        QTRY_COMPARE(mTv->focus(), QString("anna"));
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_COMPARE(mTv->focus(), QString("PinLineEdit"));
        QVERIFY(!mTv->home());
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_COMPARE(mTv->focus(), QString("anna"));
        mTv->press(DEVICE_SELECT_KEY);
        enterCode("4711");
        arriveAtHome(anna, "anna", "4711");
    }

    void whoDeniesLeaves()
    {
        signIn(anna, false);
        QTRY_COMPARE(mTv->focus(), QString("ErrorDialog"));
        QVERIFY(mTv->accounts().isEmpty());
        mTv->press(DEVICE_SELECT_KEY);
        const auto request = mTv->shell().next();
        QVERIFY(request && request->type == netcommon::MSG_REQUEST_EXIT);
    }

private:
    // From New to the answer on the consent page.
    void signIn(const Person &person, bool allows = true)
    {
        SignInVisit visit(mTv.get());
        QVERIFY(visit.open());
        QVERIFY(visit.fill(person.mail, person.password));
        QVERIFY(visit.submit());
        QVERIFY(visit.isAtConsent());
        QVERIFY(visit.answer(allows));
    }

    // Three times, then digits have to be read from a picture as well.
    void signInAfterWrongPasswords(const Person &person)
    {
        SignInVisit visit(mTv.get());
        QVERIFY(visit.open());
        QVERIFY(visit.fill(person.mail, "valleys"));
        QVERIFY(visit.submit());
        for (int i = 0; i < 2; ++i) {
            QVERIFY(visit.text().contains("password is wrong"));
            QVERIFY(!visit.hasPanel());
            mTv->press(DEVICE_DOWN_KEY); // the address is still there
            QVERIFY(mTv->type("valleys"));
            QVERIFY(visit.submit());
        }
        QVERIFY(visit.hasPanel());
        QVERIFY(mTv->type(visit.digits()));
        mTv->press({DEVICE_DOWN_KEY, DEVICE_DOWN_KEY});
        QVERIFY(mTv->type(person.password));
        QVERIFY(visit.submit());
        QVERIFY(visit.isAtConsent());
        QVERIFY(visit.text().startsWith(person.name + '\n'));
        QVERIFY(visit.answer(true));
    }

    void arriveAtHome(const Person &person, const QString &loginId = {},
                      const QString &pin = "7305");
    void signOut()
    {
        QTRY_VERIFY(!mTv->isLoading());
        QVERIFY(mTv->enter(UpWidget::SignOutEntry));
        mTv->press(DEVICE_SELECT_KEY); // yes
        QTRY_VERIFY(!mTv->home());
    }

    // Digit by digit, each when the box before has hidden its own, and then Next.
    void enterCode(const QByteArray &code)
    {
        for (const char digit : code) {
            const QWidget *box = QApplication::focusWidget();
            QCOMPARE(mTv->focus(), QString("PinLineEdit"));
            mTv->press(digit);
            QTRY_VERIFY(QApplication::focusWidget() != box);
        }
        mTv->press(DEVICE_SELECT_KEY);
    }

    AlbumService mService;
    std::unique_ptr<Television> mTv;
};

// The first page is there, and the account that is signed in is stored with the tokens in use.
void TestSignInPages::arriveAtHome(const Person &person, const QString &loginId, const QString &pin)
{
    const QString account = loginId.isEmpty() ? person.mail : loginId;
    QTRY_COMPARE(mTv->captions().size(), photos);
    QVERIFY(!mTv->page());
    const QString token = AccountManagerHelper::getAccessToken();
    QVERIFY(!token.isEmpty());
    const AccountManagerHelper::Session session;
    QCOMPARE(AccountManagerHelper::getLatestLoginAccount(), account);
    QVERIFY(AccountManagerHelper::login(account, pin)); // reads what is stored
    QCOMPARE(AccountManagerHelper::getAccessToken(), token);
    QCOMPARE(AccountManagerHelper::getUserName(), person.name);
}

int main(int argc, char *argv[])
{
    MainApplication application(argc, argv);
    TestSignInPages test;
    return QTest::qExec(&test, argc, argv);
}
#include "tst_signinpages.moc"
