#pragma once

#include <QMap>
#include <QObject>
#include <QSqlDatabase>
#include <QSqlQuery>
#include <QString>
#include <QStringList>

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
class DataBase : public QObject
{
    Q_OBJECT

public:
    DataBase();
    ~DataBase() override;

    // True when the connection is open and, in a new file, the tables are there. A new file appears
    // under its name only when it is complete, readable by its owner alone.
    bool openDataBase();
    bool createTable();

    bool insertAccount(const AccountRecord &record);
    bool updateLatestUser(const QString &user);
    bool updateToken(const QString &user, const QString &accessToken, const QString &refreshToken);
    bool removeAccount(const QString &user);
    QStringList getAccounts(bool oauth);
    QMap<QString, QString> getUserInfo(const QString &user); // keys "token", "refresh", "realname"
    QString getLoginUser();
    QString getPwdByUser(const QString &user);

private:
    QString mDriverName;
    QSqlDatabase mDatabase;
    std::unique_ptr<QSqlQuery> mQuery;
};
