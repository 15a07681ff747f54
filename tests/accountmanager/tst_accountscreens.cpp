#include "accountmanager/accountfile.h"
#include "accountmanager/accountitem.h"
#include "accountmanager/accountmanager.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accountswidget.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/loginpage.h"
#include "accountmanager/waitwidget.h"
#include "common/ui/remotekeys.h"
#include "res/resources.h"
#include "support/logcapture.h"

#include <QAbstractButton>
#include <QLabel>
#include <QtTest>

#include <memory>

namespace {

void press(const QList<int> &keys)
{
    for (int key : keys) {
        QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
        if (QApplication::focusWidget())
            QApplication::sendEvent(QApplication::focusWidget(), &event);
    }
}

// What has the focus: an account's address, a button's text, or nothing.
QString focus()
{
    QWidget *widget = QApplication::focusWidget();
    if (const auto *item = qobject_cast<AccountItem *>(widget))
        return item->mail();
    const auto *button = qobject_cast<QAbstractButton *>(widget);
    return button ? button->text() : QString();
}

} // namespace

class TestAccountScreens : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase() { initResources(); }
    void init();
    void cleanup();
    void focusMoves_data();
    void focusMoves();
    void manyAccounts();
    void lastUsedComesFirst();
    void signIn();
    void failedSignIn_data();
    void failedSignIn();
    void newAccount();
    void leaving();
    void unreadableAccounts();
    void focusReturnsWithThePage();
    void rowTexts();

private:
    void store(int accounts, const QString &refreshToken = "r");
    void show();
    QString message() const { return mScreen->findChild<QLabel *>("message")->text(); }

    std::unique_ptr<AccountFile> mFile;
    std::unique_ptr<AccountManager> mScreen;
};

void TestAccountScreens::init()
{
    mFile = std::make_unique<AccountFile>();
}

void TestAccountScreens::cleanup()
{
    mScreen.reset();
    AccountManagerHelper::logout();
}

void TestAccountScreens::store(int accounts, const QString &refreshToken)
{
    const AccountManagerHelper::Session session;
    AccountManagerHelper::setRefreshToken(refreshToken);
    AccountManagerHelper::setUserName("Name");
    for (int i = 0; i < accounts; ++i)
        QVERIFY(AccountManagerHelper::addAccount(QString::number(i), "1234", "token"));
}

void TestAccountScreens::show()
{
    mScreen = std::make_unique<AccountManager>();
    mScreen->resize(1280, 720);
    mScreen->show();
    QVERIFY(QTest::qWaitForWindowActive(mScreen.get()));
}

void TestAccountScreens::focusMoves_data()
{
    const int up = DEVICE_UP_KEY, down = DEVICE_DOWN_KEY;
    const int left = DEVICE_LEFT_KEY, right = DEVICE_RIGHT_KEY;
    QTest::addColumn<int>("accounts");
    QTest::addColumn<QList<int>>("keys");
    QTest::addColumn<QString>("focused");
    QTest::newRow("start") << 3 << QList<int>{} << "0";
    QTest::newRow("down") << 3 << QList<int>{down} << "1";
    QTest::newRow("last row") << 3 << QList<int>{down, down, down} << "2";
    QTest::newRow("first row") << 3 << QList<int>{up, left} << "0";
    QTest::newRow("right") << 3 << QList<int>{right} << "New";
    QTest::newRow("to Exit") << 3 << QList<int>{right, down, down} << "Exit";
    QTest::newRow("back to New") << 3 << QList<int>{right, down, up, up, right} << "New";
    QTest::newRow("back to the row") << 3 << QList<int>{down, right, down, left} << "1";
    QTest::newRow("one account") << 1 << QList<int>{down, right, left} << "0";
    QTest::newRow("none") << 0 << QList<int>{} << "New";
    QTest::newRow("none, all keys")
        << 0 << QList<int>{left, up, right, DEVICE_PAGEDOWN_KEY} << "New";
    QTest::newRow("none, Exit") << 0 << QList<int>{down} << "Exit";
}

void TestAccountScreens::focusMoves()
{
    QFETCH(int, accounts);
    QFETCH(QList<int>, keys);
    store(accounts);
    show();
    press(keys);
    QTEST(focus(), "focused");
}

void TestAccountScreens::manyAccounts()
{
    store(50);
    show();
    const auto *list = mScreen->findChild<AccountsWidget *>();
    const QRect view = list->viewport()->rect();
    for (int key : {DEVICE_PAGEDOWN_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_PAGEUP_KEY}) {
        press({key});
        QWidget *row = QApplication::focusWidget();
        QVERIFY(view.contains(QRect(row->mapTo(list->viewport(), QPoint()), row->size())));
    }
    // A press goes as far as the page shows rows, and the rows are shown whole.
    QCOMPARE(list->viewport()->childAt(5, view.bottom() - 1)->parentWidget(), list->widget());
    QCOMPARE(focus(), list->currentAccount());
    for (int i = 0; i < 12; ++i)
        press({DEVICE_PAGEDOWN_KEY});
    QCOMPARE(focus(), QString("9")); // the last in the order of the file

    // A failure reads the list again and leaves the reader where he was.
    OtherConnection(mFile->path()).rows("UPDATE orvala1 SET token=''");
    press({DEVICE_SELECT_KEY});
    QCOMPARE(focus(), QString("9"));
    QVERIFY(!QApplication::focusWidget()->visibleRegion().isEmpty());
}

void TestAccountScreens::lastUsedComesFirst()
{
    store(3);
    {
        const AccountManagerHelper::Session session;
        QVERIFY(AccountManagerHelper::login("2", "1234"));
    }
    show();
    QCOMPARE(focus(), QString("2"));
    press({DEVICE_DOWN_KEY});
    QCOMPARE(focus(), QString("0"));
    const auto *page = mScreen->findChild<LoginPage *>();
    QVERIFY(page->hasAccount("1"));
    QVERIFY(!page->hasAccount("3"));
}

void TestAccountScreens::signIn()
{
    store(2);
    show();
    QSignalSpy shown(mScreen.get(), &AccountManager::showNewWidget);
    QSignalSpy finished(mScreen.get(), &AccountManager::loginFinished);
    press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
    QCOMPARE(finished.size(), 1);
    QCOMPARE(shown.size(), 1);
    const QPointer<WaitWidget> wait =
        qobject_cast<WaitWidget *>(shown.first().first().value<QWidget *>());
    QVERIFY(wait);
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("token"));
    QCOMPARE(OtherConnection(mFile->path()).rows("SELECT usermail FROM orvala1 WHERE login='true'"),
             QStringList("1"));

    // The main widget makes it one of its pages; it still ends with the account screen.
    wait->setParent(nullptr);
    LogCapture log;
    QKeyEvent back(QEvent::KeyPress, DEVICE_RETURN_KEY, Qt::NoModifier);
    QApplication::sendEvent(wait, &back);
    QVERIFY(log.contains("Return key has been Pressed"));
    mScreen.reset();
    QTRY_VERIFY(!wait);
}

void TestAccountScreens::failedSignIn_data()
{
    QTest::addColumn<QString>("fault");
    QTest::addColumn<int>("text");
    QTest::addColumn<int>("rows");
    QTest::newRow("row gone") << "DELETE FROM orvala1 WHERE usermail='0'"
                              << int(AccountTexts::AccountGone) << 1;
    QTest::newRow("no token") << "UPDATE orvala1 SET token=NULL" << int(AccountTexts::SignInFailed)
                              << 2;
    QTest::newRow("no refresh token")
        << "UPDATE orvala1 SET refresh=''" << int(AccountTexts::SignInFailed) << 2;
    QTest::newRow("locked") << "BEGIN EXCLUSIVE" << int(AccountTexts::SignInFailed) << 2;
    QTest::newRow("no table") << "DROP TABLE orvala1" << int(AccountTexts::SignInFailed) << 2;
}

void TestAccountScreens::failedSignIn()
{
    QFETCH(QString, fault);
    QFETCH(int, text);
    store(2);
    show();
    QSignalSpy finished(mScreen.get(), &AccountManager::loginFinished);
    {
        const OtherConnection other(mFile->path());
        other.rows(fault);
        press({DEVICE_SELECT_KEY});
    }
    QCOMPARE(finished.size(), 0);
    QCOMPARE(message(), AccountTexts::text(text));
    QTEST(mScreen->findChild<AccountsWidget *>()->count(), "rows");
    QVERIFY(mScreen->findChild<LoginPage *>()->hasAccount(focus()));
    press({DEVICE_RIGHT_KEY});
    QCOMPARE(focus(), QString("New"));
    QVERIFY(message().isEmpty());
}

void TestAccountScreens::newAccount()
{
    show();
    LogCapture log;
    press({DEVICE_SELECT_KEY});
    QVERIFY(log.contains("has foucus New, emit oauthStarted()"));
    QVERIFY(log.contains("enter AccountManager::startAuthorize()"));
    QCOMPARE(message(), QString("Please register on PC and try again later."));
    QCOMPARE(focus(), QString("New"));
}

void TestAccountScreens::leaving()
{
    store(1);
    show();
    for (const QList<int> &way : {QList<int>{DEVICE_RETURN_KEY},
                                  QList<int>{DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY},
                                  QList<int>{DEVICE_RETURN_KEY}}) {
        LogCapture log;
        press(way);
        QCOMPARE(log.lines().count("Return key has been Pressed"), 1);
    }
}

void TestAccountScreens::unreadableAccounts()
{
    mFile->write("", "this is no database, and longer than a header of one hundred bytes is: " +
                         QByteArray(100, 'x'));
    show();
    QCOMPARE(focus(), QString("New"));
    QCOMPARE(mScreen->findChild<QLabel *>("hint")->text(),
             AccountTexts::text(AccountTexts::AccountsUnreadable));
}

void TestAccountScreens::focusReturnsWithThePage()
{
    store(3);
    show();
    press({DEVICE_DOWN_KEY});
    mScreen->hide();
    QWidget other;
    other.show();
    QVERIFY(QTest::qWaitForWindowActive(&other));
    mScreen->show();
    mScreen->activateWindow();
    QTRY_COMPARE(focus(), QString("1"));
}

void TestAccountScreens::rowTexts()
{
    QCOMPARE(AccountItem::initialOf("anna"), QString("A"));
    QCOMPARE(AccountItem::initialOf("  \u00fcnal"), QString("\u00dc"));
    QCOMPARE(AccountItem::initialOf("\U0001F600 smile"), QString("\U0001F600"));
    QCOMPARE(AccountItem::initialOf(" \n"), QString("?"));
    QCOMPARE(AccountItem::colourOf("a@b"), AccountItem::colourOf("a@b"));

    // Texts of any length and kind are drawn as they are, inside the row.
    const QString nested = QString("<table><tr><td>").repeated(5000);
    AccountItem item(nested, nested + "\n\u202e");
    item.resize(500, AccountItem::rowHeight);
    const QImage image = item.grab().toImage();
    AccountItem empty("", "");
    empty.resize(item.size());
    QVERIFY(image != empty.grab().toImage());
}

QTEST_MAIN(TestAccountScreens)
#include "tst_accountscreens.moc"
