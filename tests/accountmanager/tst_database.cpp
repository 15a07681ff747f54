#include "accountmanager/accountfile.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accounttables.h"
#include "accountmanager/database.h"
#include "support/logcapture.h"

#include <QMessageBox>
#include <QPushButton>
#include <QTimer>
#include <QtTest>

#include <csignal>
#include <memory>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

const AccountRecord kAnna = {"anna@example.org", "7305", "token-a", "refresh-a", "false", "Anna"};
const AccountRecord kBen = {"ben@example.org", "1234", "token-b", "refresh-b", "false", "Ben"};

// No file of this process grows beyond the limit: what a full disk does.
class FullDisk
{
public:
    explicit FullDisk(rlim_t bytes)
    {
        std::signal(SIGXFSZ, SIG_IGN);
        getrlimit(RLIMIT_FSIZE, &mBefore);
        const rlimit limit = {bytes, mBefore.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FullDisk() { setrlimit(RLIMIT_FSIZE, &mBefore); }

private:
    rlimit mBefore = {};
};

// Takes the right to write from the folder and the file, also when the tests run as root.
class ReadOnly
{
public:
    explicit ReadOnly(const AccountFile &file)
        : mFolder(QFile::encodeName(file.folder()))
        , mUser(geteuid())
    {
        ::chmod(file.path().toLocal8Bit().constData(), 0444);
        ::chmod(mFolder.constData(), 0555);
        if (mUser == 0 && seteuid(65534) != 0)
            qFatal("cannot change the user");
    }
    ~ReadOnly()
    {
        if (seteuid(mUser) != 0)
            qFatal("cannot change the user back");
        ::chmod(mFolder.constData(), 0700);
    }

private:
    QByteArray mFolder;
    uid_t mUser;
};

} // namespace

class TestDatabase : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void firstStart();
    void leftoversAreReplaced();
    void existingFileIsLeftAlone();
    void accountsAreKept();
    void oddTexts();
    void brokenFiles_data();
    void brokenFiles();
    void unwritableFileKeepsItsAccounts_data();
    void unwritableFileKeepsItsAccounts();
    void fullDiskAtFirstStart();
    void failedOpenIsToldOncePerEpisode();
    void messageBox();
    void signIn();
    void refusedSignIn();
    void stateFillsItself();
    void withoutAnInstance();

private:
    std::unique_ptr<AccountFile> mFile;
    int mNotices = 0;
};

void TestDatabase::init()
{
    mFile = std::make_unique<AccountFile>();
    mNotices = 0;
    DataBase::setOpenFailureNotice([this] { ++mNotices; });
}

void TestDatabase::cleanup()
{
    AccountManagerHelper::releaseDataBase();
    AccountManagerHelper::logout();
    AccountManagerHelper::setRefreshToken(QString());
    AccountManagerHelper::setUserName(QString());
}

void TestDatabase::firstStart()
{
    LogCapture log;
    DataBase database;
    QVERIFY(!mFile->exists());
    QVERIFY(database.openDataBase());
    const QStringList expected = {
        "The database socialAccountInfo.db is not exist!!!", "Start to create table Account...",
        "Create database successfully.", "The database connection has been created!!"};
    QCOMPARE(log.lines().mid(log.lines().size() - 4), expected);
    QCOMPARE(mFile->files(), QStringList("accounts.db"));
    QCOMPARE(QFile::permissions(mFile->path()) & QFile::Permissions(0x0077), QFile::Permissions());
    const QStringList names = OtherConnection(mFile->path())
                                  .rows("SELECT name FROM sqlite_master WHERE type='table' "
                                        "ORDER BY rowid");
    QCOMPARE(names.size(), 9);
    QCOMPARE(names.first(), QString("accounts"));
    QCOMPARE(names.at(3), QString("orvala"));
    QCOMPARE(names.at(7), QString("orvala1"));
    QVERIFY(QSqlDatabase::contains("socialconnection"));
    QCOMPARE(database.getAccounts(true), QStringList());
    QVERIFY(database.getLoginUser().isNull());
}

void TestDatabase::leftoversAreReplaced()
{
    mFile->write(".new", "half a file");
    mFile->write(".new-journal", "and its journal");
    // The journal of a file that is gone: SQLite would play it into the new file.
    {
        const OtherConnection other(mFile->path());
        other.rows("CREATE TABLE t (a)");
        other.rows("PRAGMA journal_mode=PERSIST");
        other.rows("INSERT INTO t VALUES (randomblob(9000))");
        other.rows("BEGIN");
        other.rows("DELETE FROM t");
        other.rows("PRAGMA cache_spill=1");
        QFile::copy(mFile->path() + "-journal", mFile->path() + ".kept");
    }
    QFile::remove(mFile->path());
    QFile::remove(mFile->path() + "-journal");
    QVERIFY(QFile::rename(mFile->path() + ".kept", mFile->path() + "-journal"));

    DataBase database;
    QVERIFY(database.insertAccount(kAnna));
    QCOMPARE(database.getAccounts(false), QStringList(kAnna.usermail));
    QCOMPARE(mFile->files(), QStringList("accounts.db"));
}

void TestDatabase::existingFileIsLeftAlone()
{
    OtherConnection(mFile->path()).rows("CREATE TABLE something (a)");
    LogCapture log;
    DataBase database;
    QVERIFY(database.openDataBase());
    QVERIFY(log.contains("this database file is exist"));
    QVERIFY(!log.contains("Start to create table Account..."));
    QCOMPARE(OtherConnection(mFile->path()).rows("SELECT name FROM sqlite_master"),
             QStringList("something"));
}

void TestDatabase::accountsAreKept()
{
    {
        DataBase database;
        QVERIFY(database.insertAccount(kAnna));
        QVERIFY(database.insertAccount(kBen));
        AccountRecord again = kAnna;
        again.token = "other";
        QVERIFY(!database.insertAccount(again));
        QVERIFY(database.updateLatestUser(kBen.usermail));
        QVERIFY(database.updateLatestUser(kAnna.usermail));
        QVERIFY(database.updateToken(kBen.usermail, "token-2", "refresh-2"));
    }
    DataBase database;
    QCOMPARE(database.getAccounts(false), QStringList({kAnna.usermail, kBen.usermail}));
    QCOMPARE(database.getLoginUser(), kAnna.usermail);
    QCOMPARE(database.getPwdByUser(kBen.usermail), kBen.password);
    const QMap<QString, QString> anna = {
        {"token", "token-a"}, {"refresh", "refresh-a"}, {"realname", "Anna"}};
    QCOMPARE(database.getUserInfo(kAnna.usermail), anna);
    QCOMPARE(database.getUserInfo(kBen.usermail).value("token"), QString("token-2"));
    QCOMPARE(database.getUserInfo(kBen.usermail).value("refresh"), QString("refresh-2"));
    QVERIFY(database.getPwdByUser("nobody").isNull());
    QVERIFY(database.getUserInfo("nobody").isEmpty());

    QVERIFY(database.updateLatestUser("nobody"));
    QVERIFY(database.getLoginUser().isNull());
    QVERIFY(database.removeAccount(kAnna.usermail));
    QCOMPARE(database.getAccounts(false), QStringList(kBen.usermail));
}

void TestDatabase::oddTexts()
{
    const QString mail = QString("o'\";--\\%1 \u00fc\U0001F600@").arg("%2C") + QString(100, 'x');
    const QString token(4096, 't');
    DataBase database;
    QVERIFY(database.insertAccount({mail, "0000", token, QString(), "false", "<b>\n"}));
    QCOMPARE(database.getAccounts(false), QStringList(mail));
    QCOMPARE(database.getUserInfo(mail).value("token"), token);
    QCOMPARE(database.getUserInfo(mail).value("realname"), QString("<b>\n"));
    QVERIFY(database.getUserInfo(mail).value("refresh").isEmpty());
}

void TestDatabase::brokenFiles_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::newRow("empty") << QByteArray();
    QTest::newRow("no database") << QByteArray(5000, 'x');
    QTest::newRow("cut header") << QByteArray("SQLite format 3\0\x10", 17);
}

void TestDatabase::brokenFiles()
{
    QFETCH(QByteArray, content);
    mFile->write("", content);
    LogCapture log;
    DataBase database;
    QVERIFY(!database.insertAccount(kAnna));
    QVERIFY(log.anyStartsWith("mQuery.exec error"));
    QVERIFY(!database.updateLatestUser("a"));
    QVERIFY(!database.updateToken("a", "b", "c"));
    QVERIFY(!database.removeAccount("a"));
    QVERIFY(database.getAccounts(true).isEmpty());
    QVERIFY(database.getUserInfo("a").isEmpty());
    QVERIFY(database.getLoginUser().isNull());
    QVERIFY(database.getPwdByUser("a").isNull());
    QFile file(mFile->path());
    QVERIFY(file.open(QIODevice::ReadOnly));
    QCOMPARE(file.readAll(), content);
}

void TestDatabase::unwritableFileKeepsItsAccounts_data()
{
    QTest::addColumn<QString>("reason");
    for (const char *reason : {"read-only", "locked", "full disk"})
        QTest::newRow(reason) << reason;
}

void TestDatabase::unwritableFileKeepsItsAccounts()
{
    QFETCH(QString, reason);
    {
        DataBase database;
        QVERIFY(database.insertAccount(kAnna));
    }
    {
        std::unique_ptr<ReadOnly> readOnly;
        std::unique_ptr<OtherConnection> lock;
        std::unique_ptr<FullDisk> full;
        if (reason == "read-only") {
            readOnly = std::make_unique<ReadOnly>(*mFile);
        } else if (reason == "locked") {
            lock = std::make_unique<OtherConnection>(mFile->path());
            lock->rows("BEGIN EXCLUSIVE");
        } else {
            full = std::make_unique<FullDisk>(100);
        }
        const AccountManagerHelper::Session session;
        AccountManagerHelper::setRefreshToken("r");
        QVERIFY(!AccountManagerHelper::addAccount("new", "7305", "t"));
        QVERIFY(!AccountManagerHelper::updateToken(kAnna.usermail, "new"));
        QVERIFY(!AccountManagerHelper::removeAccount(kAnna.usermail));
        QVERIFY(!AccountManagerHelper::login(kAnna.usermail, kAnna.password));
    }
    DataBase database;
    QCOMPARE(database.getAccounts(false), QStringList(kAnna.usermail));
    QCOMPARE(database.getUserInfo(kAnna.usermail).value("token"), kAnna.token);
}

void TestDatabase::fullDiskAtFirstStart()
{
    {
        const FullDisk full(20000);
        DataBase database;
        QVERIFY(!database.openDataBase());
        QVERIFY(!database.insertAccount(kAnna));
        QCOMPARE(mFile->files(), QStringList());
    }
    DataBase database;
    QVERIFY(database.insertAccount(kAnna));
}

void TestDatabase::failedOpenIsToldOncePerEpisode()
{
    const QString good = mFile->path();
    mFile->use(mFile->folder() + "/missing/accounts.db");
    for (int i = 0; i < 3; ++i) {
        DataBase database;
        QVERIFY(!database.openDataBase());
        QVERIFY(!database.insertAccount(kAnna));
        QVERIFY(database.getAccounts(true).isEmpty());
    }
    QCOMPARE(mNotices, 1);
    mFile->use(good);
    QVERIFY(DataBase().insertAccount(kAnna));
    mFile->use(mFile->folder());
    QVERIFY(DataBase().getLoginUser().isNull());
    QCOMPARE(mNotices, 2);
}

void TestDatabase::messageBox()
{
    DataBase::setOpenFailureNotice({});
    mFile->use(mFile->folder() + "/missing/accounts.db");
    const AccountManagerHelper::Session session;
    int boxes = 0;
    QTimer::singleShot(0, this, [&boxes] {
        const auto *box = qobject_cast<QMessageBox *>(QApplication::activeModalWidget());
        QVERIFY(box);
        ++boxes;
        QCOMPARE(box->windowTitle(), QString("Cannot open database"));
        QVERIFY(box->text().contains("connection./nThis example"));
        QCOMPARE(box->standardButtons(), QMessageBox::Cancel);
        // Neither another operation nor the end of the instance may harm the one that waits.
        QVERIFY(AccountManagerHelper::getAccounts(true).isEmpty());
        QCOMPARE(QApplication::activeModalWidget(), box);
        AccountManagerHelper::releaseDataBase();
        for (const QEvent::Type type : {QEvent::KeyPress, QEvent::KeyRelease}) {
            QKeyEvent select(type, Qt::Key_Select, Qt::NoModifier);
            QApplication::sendEvent(box->button(QMessageBox::Cancel), &select);
        }
    });
    QVERIFY(!AccountManagerHelper::addAccount("a", "7305", "t"));
    QCOMPARE(boxes, 1);
}

void TestDatabase::signIn()
{
    const AccountManagerHelper::Session session;
    AccountManagerHelper::setRefreshToken("refresh");
    AccountManagerHelper::setUserName("Anna");
    QVERIFY(AccountManagerHelper::addAccount("anna", "7305", "token"));
    QVERIFY(AccountManagerHelper::addAccount("ben", "7305", "token-b"));
    AccountManagerHelper::setRefreshToken("");
    AccountManagerHelper::setUserName("");
    QVERIFY(AccountManagerHelper::login("anna", "7305"));
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("token"));
    QCOMPARE(AccountManagerHelper::getRefreshToken(), QString("refresh"));
    QCOMPARE(AccountManagerHelper::getUserName(), QString("Anna"));
    QVERIFY(AccountManagerHelper::login("ben", "7305"));
    QCOMPARE(AccountManagerHelper::getLatestLoginAccount(), QString("ben"));

    LogCapture log;
    QVERIFY(AccountManagerHelper::logout());
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString());
    QVERIFY(log.contains(" Before get this access Token, you must provide a user"));
    QCOMPARE(AccountManagerHelper::getUserName(), QString("Anna"));
    QCOMPARE(OtherConnection(mFile->path()).rows("SELECT login FROM orvala1 ORDER BY usermail"),
             QStringList({"false", "true"}));
}

void TestDatabase::refusedSignIn()
{
    const AccountManagerHelper::Session session;
    AccountManagerHelper::setRefreshToken("r");
    QVERIFY(AccountManagerHelper::addAccount("anna", "7305", "token"));
    AccountManagerHelper::setRefreshToken("");
    QVERIFY(AccountManagerHelper::addAccount("no refresh", "7305", "token"));
    AccountManagerHelper::setAccessToken("before");

    LogCapture log;
    QVERIFY(!AccountManagerHelper::login("anna", "7306"));
    QVERIFY(log.contains("The password is incorrect!! should be:7305"));
    QVERIFY(!AccountManagerHelper::login("nobody", "7305"));
    QCOMPARE(AccountManagerHelper::getAccessToken(), QString("before"));
    QVERIFY(AccountManagerHelper::getRefreshToken().isEmpty());
    QVERIFY(!AccountManagerHelper::login("no refresh", "7305"));
    QVERIFY(AccountManagerHelper::getLatestLoginAccount().isNull());
}

void TestDatabase::stateFillsItself()
{
    {
        const AccountManagerHelper::Session session;
        AccountManagerHelper::setRefreshToken("refresh");
        AccountManagerHelper::setUserName("Anna");
        QVERIFY(AccountManagerHelper::addAccount("anna", "7305", "token"));
        QVERIFY(AccountManagerHelper::login("anna", "7305"));
    }
    AccountManagerHelper::setUserName("");
    QCOMPARE(AccountManagerHelper::getUserName(), QString("Anna"));
    AccountManagerHelper::setRefreshToken("");
    QVERIFY(AccountManagerHelper::getRefreshToken().isEmpty());
    const AccountManagerHelper::Session session;
    QCOMPARE(AccountManagerHelper::getRefreshToken(), QString("refresh"));
}

void TestDatabase::withoutAnInstance()
{
    QVERIFY(!AccountManagerHelper::login("a", "7305"));
    QVERIFY(!AccountManagerHelper::addAccount("a", "7305", "t"));
    QVERIFY(!AccountManagerHelper::updateToken("a", "t"));
    QVERIFY(!AccountManagerHelper::removeAccount("a"));
    QVERIFY(AccountManagerHelper::getAccounts(true).isEmpty());
    QVERIFY(AccountManagerHelper::getPassword("a").isNull());
    QVERIFY(!mFile->exists());
}

QTEST_MAIN(TestDatabase)
#include "tst_database.moc"
