#include "accountmanager/accountfile.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/database.h"

#include <QMessageBox>
#include <QPushButton>
#include <QTimer>
#include <QtTest>

#include <csignal>
#include <memory>
#include <sys/resource.h>
#include <unistd.h>

using Helper = AccountManagerHelper;

namespace {

const AccountRecord kAnna = {"anna", "7305", "token-a", "refresh-a", "false", "Anna"};
const AccountRecord kBen = {"ben", "1234", "token-b", "refresh-b", "false", "Ben"};

// A full disk: no file of this process grows beyond the limit.
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

// A read-only file system, also for tests that run as root.
class ReadOnly
{
public:
    explicit ReadOnly(const AccountFile &file)
        : mFolder(file.folder())
    {
        QFile::setPermissions(file.path(), QFile::Permissions(0x4444));
        QFile::setPermissions(mFolder, QFile::Permissions(0x5555));
        if (mUser == 0 && seteuid(65534) != 0)
            qFatal("cannot change the user");
    }
    ~ReadOnly()
    {
        if (seteuid(mUser) != 0)
            qFatal("cannot change the user back");
        QFile::setPermissions(mFolder, QFile::Permissions(0x7700));
    }

private:
    QString mFolder;
    uid_t mUser = geteuid();
};

} // namespace

class TestDatabase : public QObject
{
    Q_OBJECT

    std::unique_ptr<AccountFile> mFile;
    int mNotices = 0;

private slots:
    void init()
    {
        mFile = std::make_unique<AccountFile>();
        mNotices = 0;
        DataBase::setOpenFailureNotice([this] { ++mNotices; });
    }

    void firstStart()
    {
        DataBase database;
        QVERIFY(database.openDataBase());
        QCOMPARE(mFile->files(), QStringList("accounts.db"));
        QVERIFY(!(QFile::permissions(mFile->path()) & QFile::Permissions(0x0077)));
        const OtherConnection other(mFile->path());
        const QStringList tables = other.rows("SELECT name FROM sqlite_master WHERE type='table'");
        QCOMPARE(tables.size(), 9);
        QCOMPARE(QStringList({tables[0], tables[3], tables[7]}),
                 QStringList({"accounts", "orvala", "orvala1"}));
        QCOMPARE(database.getAccounts(true), QStringList());
        QVERIFY(database.getLoginUser().isNull());
    }

    void leftoversAreReplaced()
    {
        mFile->write(".new", "half a file");
        mFile->write(".new-journal", "and its journal");
        {
            // The journal of a file that is gone: SQLite would play it into the new file.
            const OtherConnection other(mFile->path());
            other.rows("CREATE TABLE t (a)");
            other.rows("INSERT INTO t VALUES (1)");
            other.rows("BEGIN");
            other.rows("DELETE FROM t");
            QVERIFY(QFile::copy(mFile->path() + "-journal", mFile->path() + ".kept"));
        }
        QVERIFY(QFile::remove(mFile->path()));
        QVERIFY(QFile::rename(mFile->path() + ".kept", mFile->path() + "-journal"));
        DataBase database;
        QVERIFY(database.insertAccount(kAnna));
        QCOMPARE(database.getAccounts(false), QStringList(kAnna.usermail));
        QCOMPARE(mFile->files(), QStringList("accounts.db"));
    }

    void accountsAreKept()
    {
        const QString odd = "o'\";--\\%1<b>\u00fc\U0001F600@" + QString(100, 'x');
        {
            DataBase database;
            QVERIFY(database.insertAccount(kAnna));
            QVERIFY(database.insertAccount(kBen));
            QVERIFY(database.insertAccount({odd, "1", QString(4096, 't'), "", "false", odd}));
            QVERIFY(!database.insertAccount({kAnna.usermail, "1", "2", "3", "false", "4"}));
            QVERIFY(database.updateLatestUser(kBen.usermail));
            QVERIFY(database.updateLatestUser(kAnna.usermail));
            QVERIFY(database.updateToken(kBen.usermail, "token-2", "refresh-2"));
        }
        DataBase database;
        QCOMPARE(database.getAccounts(false).size(), 3);
        QCOMPARE(database.getLoginUser(), kAnna.usermail);
        QCOMPARE(database.getPwdByUser(kBen.usermail), kBen.password);
        using Info = QMap<QString, QString>;
        QCOMPARE(database.getUserInfo("anna"),
                 Info({{"token", "token-a"}, {"refresh", "refresh-a"}, {"realname", "Anna"}}));
        QCOMPARE(database.getUserInfo("ben"),
                 Info({{"token", "token-2"}, {"refresh", "refresh-2"}, {"realname", "Ben"}}));
        QCOMPARE(database.getUserInfo(odd).value("token").size(), 4096);
        QCOMPARE(database.getUserInfo(odd).value("realname"), odd);
        QVERIFY(database.getPwdByUser("nobody").isNull());
        QVERIFY(database.getUserInfo("nobody").isEmpty());
        QVERIFY(database.updateLatestUser("nobody"));
        QVERIFY(database.getLoginUser().isNull());
        QVERIFY(database.removeAccount("anna"));
        QVERIFY(database.getPwdByUser("anna").isNull());
    }

    void brokenFiles()
    {
        const QByteArrayList contents = {"", QByteArray(5000, 'x'), "SQLite format 3"};
        for (const QByteArray &content : contents) {
            mFile->write("", content);
            DataBase database;
            QVERIFY(!database.insertAccount(kAnna));
            QVERIFY(!database.updateLatestUser("a") && !database.updateToken("a", "b", "c") &&
                    !database.removeAccount("a"));
            QVERIFY(database.getAccounts(true).isEmpty() && database.getUserInfo("a").isEmpty());
            QVERIFY(database.getLoginUser().isNull() && database.getPwdByUser("a").isNull());
            QFile file(mFile->path());
            QVERIFY(file.open(QIODevice::ReadOnly));
            QCOMPARE(file.readAll(), content);
        }
    }

    void unwritableFileKeepsItsAccounts()
    {
        QVERIFY(DataBase().insertAccount(kAnna));
        for (const QString reason : {"read-only", "locked", "full disk"}) {
            const auto readOnly =
                reason == "read-only" ? std::make_unique<ReadOnly>(*mFile) : nullptr;
            const auto full = reason == "full disk" ? std::make_unique<FullDisk>(100) : nullptr;
            const OtherConnection other(mFile->path());
            other.rows(reason == "locked" ? "BEGIN EXCLUSIVE" : "SELECT 1");
            const Helper::Session session;
            QVERIFY(!Helper::addAccount("new", "7305", "t"));
            QVERIFY(!Helper::updateToken(kAnna.usermail, "new"));
            QVERIFY(!Helper::removeAccount(kAnna.usermail));
            QVERIFY(!Helper::login(kAnna.usermail, kAnna.password));
        }
        QCOMPARE(DataBase().getUserInfo(kAnna.usermail).value("token"), kAnna.token);
    }

    void fullDiskAtFirstStart()
    {
        {
            const FullDisk full(20000);
            QVERIFY(!DataBase().insertAccount(kAnna));
            QCOMPARE(mFile->files(), QStringList());
        }
        QVERIFY(DataBase().insertAccount(kAnna));
    }

    void failedOpenIsToldOncePerEpisode()
    {
        const QString good = mFile->path();
        mFile->use(mFile->folder() + "/missing/accounts.db");
        for (int i = 0; i < 3; ++i) {
            DataBase database;
            QVERIFY(!database.openDataBase());
            QVERIFY(!database.insertAccount(kAnna));
        }
        QCOMPARE(mNotices, 1);
        mFile->use(good);
        QVERIFY(DataBase().insertAccount(kAnna));
        mFile->use(mFile->folder());
        QVERIFY(DataBase().getLoginUser().isNull());
        QCOMPARE(mNotices, 2);
    }

    void messageBox()
    {
        DataBase::setOpenFailureNotice({});
        mFile->use(mFile->folder() + "/missing/accounts.db");
        const Helper::Session session;
        int boxes = 0;
        QTimer::singleShot(0, this, [&boxes] {
            const auto *box = qobject_cast<QMessageBox *>(QApplication::activeModalWidget());
            QVERIFY(box);
            ++boxes;
            QCOMPARE(box->windowTitle(), QString("Cannot open database"));
            QVERIFY(box->text().contains("connection./nThis example"));
            // Neither another operation nor the end of the instance may harm the one that waits.
            QVERIFY(Helper::getAccounts(true).isEmpty());
            QCOMPARE(QApplication::activeModalWidget(), box);
            Helper::releaseDataBase();
            box->button(QMessageBox::Cancel)->click();
        });
        QVERIFY(!Helper::addAccount("a", "7305", "t"));
        QCOMPARE(boxes, 1);
    }

    void signIn()
    {
        QVERIFY(!Helper::login("anna", "7305")); // there is no instance yet
        {
            const Helper::Session session;
            Helper::setUserName("Anna");
            Helper::setRefreshToken("refresh");
            QVERIFY(Helper::addAccount("anna", "7305", "token"));
            Helper::setAccessToken("before");
            QVERIFY(!Helper::login("anna", "7306") && !Helper::login("nobody", "7305"));
            QCOMPARE(Helper::getAccessToken(), QString("before"));
            QVERIFY(Helper::getLatestLoginAccount().isNull());
            QVERIFY(Helper::login("anna", "7305"));
            QCOMPARE(Helper::getAccessToken(), QString("token"));
            QCOMPARE(Helper::getLatestLoginAccount(), QString("anna"));
        }
        Helper::setUserName("");
        QCOMPARE(Helper::getUserName(), QString("Anna")); // opens and closes by itself
        Helper::setRefreshToken("");
        {
            const Helper::Session session;
            QCOMPARE(Helper::getRefreshToken(), QString("refresh"));
        }
        QVERIFY(Helper::logout());
        QCOMPARE(Helper::getAccessToken(), QString());
        QCOMPARE(Helper::getUserName(), QString("Anna"));
        QCOMPARE(DataBase().getLoginUser(), QString("anna"));
    }
};

QTEST_MAIN(TestDatabase)
#include "tst_database.moc"
