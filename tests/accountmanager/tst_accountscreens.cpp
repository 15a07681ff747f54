#include "accountmanager/accountfile.h"
#include "accountmanager/accountitem.h"
#include "accountmanager/accountmanager.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accountswidget.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/loginpage.h"
#include "common/keyrobot.h"
#include "oauth/signinplugin.h"
#include "res/resources.h"
#include "support/logcapture.h"

#include <QAbstractButton>
#include <QLabel>
#include <QScrollBar>
#include <QtTest>

#include <memory>

using Keys = QList<int>;

namespace {

void press(const Keys &keys)
{
    for (int key : keys)
        pressKey(QApplication::focusWidget(), key);
}

// What has the focus: an account's address, with a dash behind it for its button, or the text of
// another button.
QString focus()
{
    const QWidget *parent = QApplication::focusWidget()->parentWidget();
    if (const auto *row = qobject_cast<const AccountItem *>(parent))
        return row->mail() + '-';
    if (const auto *item = qobject_cast<AccountItem *>(QApplication::focusWidget()))
        return item->mail();
    const auto *button = qobject_cast<QAbstractButton *>(QApplication::focusWidget());
    return button ? button->text() : QString();
}

} // namespace

class TestAccountScreens : public QObject
{
    Q_OBJECT

    std::unique_ptr<AccountFile> mFile;
    std::unique_ptr<AccountManager> mScreen;

    // Stores accounts "0", "1", ..., the one with that number used last, and shows the screen.
    void show(int accounts, int last = 0)
    {
        {
            const AccountManagerHelper::Session session;
            AccountManagerHelper::setRefreshToken("r");
            AccountManagerHelper::setUserName("Name");
            for (int i = 0; i < accounts; ++i)
                AccountManagerHelper::addAccount(QString::number(i), "1234", "token");
            AccountManagerHelper::login(QString::number(last), "1234");
            AccountManagerHelper::logout();
        }
        mScreen = std::make_unique<AccountManager>();
        mScreen->resize(1280, 720);
        mScreen->show();
        QVERIFY(QTest::qWaitForWindowActive(mScreen.get()));
    }
    QString label(const QString &name) const { return mScreen->findChild<QLabel *>(name)->text(); }

private slots:
    void initTestCase() { initResources(); }
    void init() { mFile = std::make_unique<AccountFile>(); }
    void cleanup() { mScreen.reset(); }

    void focusMoves_data()
    {
        const int up = DEVICE_UP_KEY, down = DEVICE_DOWN_KEY;
        const int left = DEVICE_LEFT_KEY, right = DEVICE_RIGHT_KEY;
        QTest::addColumn<int>("accounts");
        QTest::addColumn<Keys>("keys");
        QTest::addColumn<QString>("focused");
        QTest::newRow("start, last used") << 3 << Keys{} << "2";
        QTest::newRow("last row") << 3 << Keys{down, down, down} << "1";
        QTest::newRow("first row") << 3 << Keys{up, left} << "2";
        QTest::newRow("next Delete") << 3 << Keys{right, down} << "0-";
        QTest::newRow("from Delete") << 3 << Keys{right, down, left} << "0";
        QTest::newRow("to Exit") << 3 << Keys{right, right, down, down} << "Exit";
        QTest::newRow("back to New") << 3 << Keys{right, right, down, up, up, right} << "New";
        QTest::newRow("back to the row") << 3 << Keys{down, right, right, down, left, left} << "0";
        QTest::newRow("one account") << 1 << Keys{down, right, right, left} << "0-";
        QTest::newRow("none") << 0 << Keys{left, up, right, DEVICE_PAGEDOWN_KEY} << "New";
        QTest::newRow("none, Exit") << 0 << Keys{down} << "Exit";
    }

    void focusMoves()
    {
        QFETCH(int, accounts);
        QFETCH(Keys, keys);
        show(accounts, accounts - 1);
        press(keys);
        QTEST(focus(), "focused");
        QCOMPARE(mScreen->findChild<LoginPage *>()->hasAccount("2"), accounts == 3);
        // The page comes back with the focus where it was.
        const QString before = focus();
        mScreen->hide();
        mScreen->show();
        QApplication::setActiveWindow(mScreen.get());
        QCOMPARE(focus(), before);
    }

    void manyAccounts()
    {
        show(50);
        const auto *list = mScreen->findChild<AccountsWidget *>();
        const auto wholeRowIsSeen = [list] {
            QWidget *row = QApplication::focusWidget();
            const QRect place(row->mapTo(list->viewport(), QPoint()), row->size());
            return list->viewport()->rect().contains(place);
        };
        list->verticalScrollBar()->setValue(30); // as before it gets its size
        mScreen->resize(1280, 700);
        QTRY_VERIFY(wholeRowIsSeen());
        for (int key : {DEVICE_PAGEDOWN_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_PAGEUP_KEY}) {
            press({key});
            QVERIFY(wholeRowIsSeen());
        }
        for (int i = 0; i < 12; ++i)
            press({DEVICE_PAGEDOWN_KEY});
        QCOMPARE(focus(), QString("9")); // the last in the order of the file
        // A failure reads the list again and leaves the reader where he was.
        OtherConnection(mFile->path()).rows("UPDATE orvala1 SET token=''");
        press({DEVICE_SELECT_KEY});
        QCOMPARE(focus(), QString("9"));
        QVERIFY(wholeRowIsSeen());
    }

    void failedSignIn_data()
    {
        QTest::addColumn<QString>("fault");
        QTest::newRow("row gone") << "DELETE FROM orvala1 WHERE login='true'";
        QTest::newRow("no token") << "UPDATE orvala1 SET token=NULL";
        QTest::newRow("no refresh") << "UPDATE orvala1 SET refresh=''";
        QTest::newRow("locked") << "BEGIN EXCLUSIVE";
        QTest::newRow("no table") << "DROP TABLE orvala1";
    }

    void failedSignIn()
    {
        QFETCH(QString, fault);
        const int text =
            fault.startsWith("DELETE") ? AccountTexts::AccountGone : AccountTexts::SignInFailed;
        show(2);
        QSignalSpy finished(mScreen.get(), &AccountManager::loginFinished);
        const OtherConnection other(mFile->path());
        other.rows(fault);
        press({DEVICE_SELECT_KEY});
        QCOMPARE(finished.size(), 0);
        QCOMPARE(label("message"), AccountTexts::text(text));
        QCOMPARE(focus(), QString(text == AccountTexts::AccountGone ? "1" : "0"));
        press({DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY});
        QCOMPARE(focus(), QString("New"));
        QVERIFY(label("message").isEmpty());
    }

    // Deleting asks first; the next account takes the place of the one that is gone.
    void deleting_data()
    {
        const int right = DEVICE_RIGHT_KEY, select = DEVICE_SELECT_KEY;
        QTest::addColumn<int>("accounts");
        QTest::addColumn<Keys>("keys");
        QTest::addColumn<QStringList>("left");
        QTest::addColumn<QString>("focused");
        const QStringList all{"0", "1", "2"};
        QTest::newRow("yes") << 3 << Keys{right, select, select} << QStringList{"1", "2"} << "1";
        QTest::newRow("no") << 3 << Keys{right, select, right, select} << all << "0-";
        QTest::newRow("Return") << 3 << Keys{right, select, DEVICE_RETURN_KEY} << all << "0-";
        QTest::newRow("last row") << 3
                                  << Keys{DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, right, select, select}
                                  << QStringList{"0", "1"} << "1";
        QTest::newRow("only one") << 1 << Keys{right, select, select} << QStringList() << "New";
    }

    void deleting()
    {
        QFETCH(int, accounts);
        QFETCH(Keys, keys);
        show(accounts);
        LogCapture log;
        press(keys);
        QTEST(OtherConnection(mFile->path()).rows("SELECT usermail FROM orvala1"), "left");
        QTEST(focus(), "focused");
        QVERIFY(!log.contains("Return key has been Pressed"));
    }

    void deletingFails()
    {
        show(2);
        const OtherConnection other(mFile->path());
        other.rows(
            "CREATE TRIGGER t BEFORE DELETE ON orvala1 BEGIN SELECT RAISE(ABORT, 'no'); END");
        press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY, DEVICE_SELECT_KEY});
        QCOMPARE(label("message"), AccountTexts::text(AccountTexts::NotDeleted));
        QCOMPARE(focus(), QString("0"));
    }

    // Where codes are not offered, an account with a code of its own is not asked for it.
    void codesAreNotOffered()
    {
        show(1);
        OtherConnection(mFile->path()).rows("UPDATE orvala1 SET password='1234'");
        QSignalSpy finished(mScreen.get(), &AccountManager::loginFinished);
        press({DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY});
        QCOMPARE(focus(), QString("Exit"));
        press({DEVICE_LEFT_KEY, DEVICE_LEFT_KEY, DEVICE_SELECT_KEY});
        QCOMPARE(finished.size(), 1);
    }

    void noSignInPages()
    {
        show(0);
        SignInPlugin::setFile(mFile->path());
        press({DEVICE_SELECT_KEY});
        QCOMPARE(label("message"), AccountTexts::text(AccountTexts::SignInUnavailable));
    }

    void unreadableAccounts()
    {
        mFile->write("", QByteArray(200, 'x'));
        show(0);
        QCOMPARE(label("hint"), AccountTexts::text(AccountTexts::AccountsUnreadable));
        QCOMPARE(focus(), QString("New"));
        QVERIFY(QFile::remove(mFile->path()));
        press({DEVICE_UP_KEY});
        QCOMPARE(label("hint"), AccountTexts::text(AccountTexts::NoAccounts));
    }

    void rowTexts()
    {
        QCOMPARE(AccountItem::initialOf("  \u00fcnal"), QString("\u00dc"));
        QCOMPARE(AccountItem::initialOf("\U0001F600 smile"), QString("\U0001F600"));
        QCOMPARE(AccountItem::initialOf(" \n"), QString("?"));
        AccountItem item(QString("<table><tr><td>").repeated(5000), "<img src=x>\n\u202e");
        QVERIFY(!item.grab().isNull());
    }
};

QTEST_MAIN(TestAccountScreens)
#include "tst_accountscreens.moc"
