#pragma once

#include <QMap>
#include <QObject>
#include <QSqlDatabase>
#include <QSqlQuery>
#include <QString>
#include <QStringList>

#include <functional>
#include <memory>

// What is stored of one account when it is added.
struct AccountRecord
{
    QString usermail; // e-mail address; identifies the account
    QString password; // four-digit PIN
    QString token;    // access token
    QString refresh;  // refresh token
    QString login;    // "true" for the account signed in last, else "false"
    QString name;     // display name
};

// The SQLite file of the accounts. Every operation opens the file when it is not open, and returns
// its failure value (false, an empty list or map, a null string) when a statement fails; failures
// are only logged, but for a file that cannot be opened, which the user is told in a message box.
// A file that another program keeps locked counts as a failure after a tenth of a second for each
// statement. One instance at a time: all share one connection.
class DataBase : public QObject
{
    Q_OBJECT

public:
    using Notice = std::function<void()>;

    DataBase();
    ~DataBase() override;

    // True when the connection is open and, in a new file, the tables are there. A new file appears
    // under its name only when it is complete, readable by its owner alone. The user is told of a
    // failure once, until an opening succeeds again; the message box blocks until it is closed.
    bool openDataBase();
    // Makes the tables in the file that is open.
    bool createTable();

    bool insertAccount(const AccountRecord &record);
    bool updateLatestUser(const QString &user);
    bool updateToken(const QString &user, const QString &accessToken, const QString &refreshToken);
    bool removeAccount(const QString &user);
    QStringList getAccounts(bool oauth);
    QMap<QString, QString> getUserInfo(const QString &user); // keys "token", "refresh", "realname"
    QString getLoginUser();
    QString getPwdByUser(const QString &user);
    // Whether the last operation failed: tells an empty answer from none.
    bool hasFailed() const { return mFailed; }

    // What tells the user that the file cannot be opened, in place of the message box; an empty
    // one restores the box. For programs without a screen, and tests.
    static void setOpenFailureNotice(const Notice &notice);

private:
    void connectTo(const QString &file);
    bool openConnection();
    void closeConnection();
    bool createFile(const QString &path);
    bool hasAllTables() const;
    // Opens the file when it is not open and prepares the statement in the shared query; then runs
    // it. Errors are logged behind the complaint.
    bool prepare(const QString &statement, const QString &complaint = QString());
    bool execute(const QString &complaint = QString());
    // Runs the prepared statement and lets go of it.
    bool change();
    QString firstValue();
    bool findAccount(const QString &user);

    QString mDriverName;
    QSqlDatabase mDatabase;
    std::unique_ptr<QSqlQuery> mQuery;
    bool mFailed = false;
};
