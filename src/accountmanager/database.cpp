#include "accountmanager/database.h"

#include "accountmanager/accounttables.h"
#include "accountmanager/databasefile.h"
#include "base/log.h"
#include "network/systemconfig.h"

#include <QApplication>
#include <QFileInfo>
#include <QMessageBox>
#include <QPointer>
#include <QSqlError>
#include <QVariant>

namespace {

const QString kConnectionName = QStringLiteral("socialconnection");
const QString kSelectAccounts = QStringLiteral("SELECT usermail FROM orvala1");
const QString kExecError = QStringLiteral("mQuery.exec error");

DataBase::Notice mOpenFailureNotice;
// Every operation tries to open the file again: without this the boxes would nest, or never end.
bool mOpenFailureTold = false;

void showMessageBox()
{
    if (!qobject_cast<QApplication *>(QCoreApplication::instance()))
        return;
    QMessageBox::critical(
        nullptr, QStringLiteral("Cannot open database"),
        QStringLiteral("Unable to establish a database connection./nThis example needs SQLite "
                       "support. Please read the Qt SQL driver documentation for information how "
                       "to build it./n/nClick Cancel to exit."),
        QMessageBox::Cancel);
}

void tellOpenFailure()
{
    if (mOpenFailureTold)
        return;
    mOpenFailureTold = true;
    mOpenFailureNotice ? mOpenFailureNotice() : showMessageBox();
}

} // namespace

void DataBase::setOpenFailureNotice(const Notice &notice)
{
    mOpenFailureNotice = notice;
    mOpenFailureTold = false;
}

DataBase::DataBase()
{
    logLine("Available drivers:");
    const QStringList drivers = QSqlDatabase::drivers();
    for (const QString &driver : drivers) {
        logLine("\t", driver);
        if (driver == QLatin1String("QSQLITE"))
            mDriverName = driver;
    }
}

DataBase::~DataBase()
{
    closeConnection();
}

void DataBase::connectTo(const QString &file)
{
    // Taken without opening it: that would make an empty file under the name it had before.
    mDatabase = QSqlDatabase::contains(kConnectionName)
                    ? QSqlDatabase::database(kConnectionName, false)
                    : QSqlDatabase::addDatabase(mDriverName, kConnectionName);
    mDatabase.setDatabaseName(file);
    mDatabase.setConnectOptions(QStringLiteral("QSQLITE_BUSY_TIMEOUT=100"));
}

bool DataBase::openConnection()
{
    if (!mDatabase.open())
        return false;
    mQuery = std::make_unique<QSqlQuery>(mDatabase);
    return true;
}

void DataBase::closeConnection()
{
    mQuery.reset();
    if (mDatabase.isOpen())
        mDatabase.close();
}

bool DataBase::openDataBase()
{
    closeConnection();
    const QString path = SystemConfig::databasePath();
    const bool exists = QFileInfo(path).isFile();
    if (exists)
        logLine("this database file is exist");
    else if (!createFile(path))
        return false;
    connectTo(path);
    if (!openConnection()) {
        tellOpenFailure();
        return false;
    }
    mOpenFailureTold = false;
    logLine("The database connection has been created!!");
    return true;
}

bool DataBase::createFile(const QString &path)
{
    connectTo(databasefile::buildPath(path));
    if (!databasefile::startBuilding(path) || !openConnection()) {
        tellOpenFailure();
        return false;
    }
    logLine("The database socialAccountInfo.db is not exist!!!");
    // Nothing depends on the file before it is moved into place, which syncs it as a whole.
    mQuery->exec(QStringLiteral("PRAGMA synchronous=OFF"));
    const bool complete = createTable() && hasAllTables();
    closeConnection();
    if (!complete) {
        databasefile::discard(path);
        return false;
    }
    if (!databasefile::publish(path)) {
        tellOpenFailure();
        return false;
    }
    return true;
}

bool DataBase::createTable()
{
    logLine("Start to create table Account...");
    if (!mQuery)
        return false;
    for (const char *statement : accounttables::statements)
        mQuery->exec(QLatin1String(statement));
    if (mQuery->lastError().isValid()) {
        logLine(mQuery->lastError().text());
        return false;
    }
    logLine("Create database successfully.");
    return true;
}

bool DataBase::hasAllTables() const
{
    return mDatabase.tables().size() == static_cast<int>(accounttables::statements.size());
}

bool DataBase::prepare(const QString &statement, const QString &complaint)
{
    const QPointer<DataBase> self(this);
    mFailed = true;
    if (!mDatabase.isOpen())
        openDataBase();
    // The message box of a failed opening delivers events, and one may end this instance.
    if (!self || !mQuery) {
        logLine(complaint, "Driver not loaded");
        return false;
    }
    mQuery->clear();
    mFailed = !mQuery->prepare(statement);
    if (mFailed)
        logLine(complaint, mQuery->lastError().text());
    return !mFailed;
}

bool DataBase::execute(const QString &complaint)
{
    if (mQuery->exec())
        return true;
    mFailed = true;
    logLine(complaint, mQuery->lastError().text());
    mQuery->clear();
    return false;
}

bool DataBase::change()
{
    const bool changed = execute();
    mQuery->clear();
    return changed;
}

QString DataBase::firstValue()
{
    if (!execute())
        return QString();
    QString value = mQuery->next() ? mQuery->value(0).toString() : QString();
    mQuery->clear();
    return value;
}

bool DataBase::findAccount(const QString &user)
{
    if (!prepare(kSelectAccounts, kExecError) || !execute(kExecError))
        return false;
    bool found = false;
    while (!found && mQuery->next())
        found = mQuery->value(0).toString() == user;
    mQuery->clear();
    return found;
}

bool DataBase::insertAccount(const AccountRecord &record)
{
    logLine("start to insert data");
    const QPointer<DataBase> self(this);
    findAccount(record.usermail);
    // Attempted in every case: the primary key refuses a second row for an account.
    const QString statement = QStringLiteral("INSERT INTO [orvala1] VALUES(?,?,?,?,?,?)");
    if (!self || !prepare(statement, statement + QLatin1Char(' ')))
        return false;
    for (const QString &value : {record.usermail, record.password, record.name, record.token,
                                 record.refresh, record.login})
        mQuery->addBindValue(QVariantList{value});
    mFailed = !mQuery->execBatch();
    if (mFailed)
        logLine(mQuery->lastQuery(), " ", mQuery->lastError().text());
    mQuery->clear();
    return !mFailed;
}

bool DataBase::updateLatestUser(const QString &user)
{
    logLine("updateLatestUser start to update data");
    if (!prepare(QStringLiteral("UPDATE orvala1 SET login='false' WHERE login='true'")) ||
        !change())
        return false;
    if (!prepare(QStringLiteral("UPDATE orvala1 SET login='true' WHERE usermail=:name")))
        return false;
    mQuery->bindValue(QStringLiteral(":name"), user);
    return change();
}

bool DataBase::updateToken(const QString &user, const QString &accessToken,
                           const QString &refreshToken)
{
    logLine("updateToken start to update token for user:", user);
    if (!prepare(QStringLiteral(
            "UPDATE orvala1 SET token=:accesstoken, refresh=:refresh WHERE usermail=:name")))
        return false;
    mQuery->bindValue(QStringLiteral(":accesstoken"), accessToken);
    mQuery->bindValue(QStringLiteral(":refresh"), refreshToken);
    mQuery->bindValue(QStringLiteral(":name"), user);
    return change();
}

bool DataBase::removeAccount(const QString &user)
{
    logLine("removeAccount start to remove account for user:", user);
    if (!prepare(QStringLiteral("DELETE from orvala1 WHERE usermail=:name")))
        return false;
    mQuery->bindValue(QStringLiteral(":name"), user);
    return change();
}

QStringList DataBase::getAccounts(bool oauth)
{
    logLine("getAccounts start to select data, oauth=", oauth);
    QStringList accounts;
    if (!prepare(kSelectAccounts, kExecError) || !execute(kExecError))
        return accounts;
    while (mQuery->next())
        accounts << mQuery->value(0).toString();
    mQuery->clear();
    return accounts;
}

QMap<QString, QString> DataBase::getUserInfo(const QString &user)
{
    logLine("getUserInfo start to select data");
    if (!prepare(QStringLiteral("SELECT token, refresh, name FROM orvala1 WHERE usermail=:user"),
                 kExecError))
        return {};
    mQuery->bindValue(QStringLiteral(":user"), user);
    QMap<QString, QString> info;
    if (!execute(kExecError))
        return info;
    if (mQuery->next()) {
        info[QStringLiteral("token")] = mQuery->value(0).toString();
        info[QStringLiteral("refresh")] = mQuery->value(1).toString();
        info[QStringLiteral("realname")] = mQuery->value(2).toString();
    }
    mQuery->clear();
    return info;
}

QString DataBase::getLoginUser()
{
    logLine("getLoginUser start to select data");
    if (!prepare(QStringLiteral("SELECT usermail FROM orvala1 WHERE login='true'")))
        return QString();
    return firstValue();
}

QString DataBase::getPwdByUser(const QString &user)
{
    logLine("getPwdByUser start to select data");
    if (!prepare(QStringLiteral("SELECT password FROM orvala1 WHERE usermail=:name")))
        return QString();
    mQuery->bindValue(QStringLiteral(":name"), user);
    return firstValue();
}
