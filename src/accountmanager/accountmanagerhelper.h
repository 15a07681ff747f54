#pragma once

#include <QString>
#include <QStringList>

class DataBase;

// The sign-in state of the program and the only way to the account database. Every request to the
// service takes its access token from here. Whoever touches accounts wraps the work in
// initDataBase() and releaseDataBase(); AccountManagerHelper::Session does it by scope.
class AccountManagerHelper
{
public:
    // Opens the database for a scope.
    class Session
    {
    public:
        Session() { initDataBase(); }
        ~Session() { releaseDataBase(); }
        Session(const Session &) = delete;
        Session &operator=(const Session &) = delete;
    };

    static bool initDataBase();
    static void releaseDataBase();

    // Signs a stored account in with its PIN; false, with the state unchanged, for a wrong PIN;
    // false also when a token is missing or the file cannot be written.
    static bool login(const QString &user, const QString &pin);
    // Forgets the account and the access token, nothing else.
    static bool logout();

    static QString getUserName();
    static QString getLatestLoginAccount();
    static QString getAccessToken();
    static QString getRefreshToken();
    static int getExpires(); // lifetime of the access token, seconds; 0: not known in this run
    static void setAccessToken(const QString &token);
    static void setRefreshToken(const QString &token);
    static void setUserName(const QString &name);
    static void setExpires(int seconds);

    static QString getPassword(const QString &user);
    static bool addAccount(const QString &user, const QString &pin, const QString &token);
    static bool removeAccount(const QString &user);
    static bool updateToken(const QString &user, const QString &token);
    static QStringList getAccounts(bool oauth);
    static QString getDisplayName(const QString &user); // of a stored account
    // Whether the last operation on the open database failed: tells an empty answer from none.
    static bool hasFailed();

private:
    static bool isSignedIn();
    // Takes tokens and name of the account from the database.
    static void readTokens(const QString &user);

    static QString mLatestLoginAccount;
    static QString mCurrentToken;
    static QString mRefreshToken;
    static QString mUserName;
    static int mExpires;
    static DataBase *mDataBase;
};
