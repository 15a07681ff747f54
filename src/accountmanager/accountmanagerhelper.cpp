#include "accountmanager/accountmanagerhelper.h"

#include "accountmanager/database.h"
#include "base/log.h"

QString AccountManagerHelper::mLatestLoginAccount;
QString AccountManagerHelper::mCurrentToken;
QString AccountManagerHelper::mRefreshToken;
QString AccountManagerHelper::mUserName;
int AccountManagerHelper::mExpires = 0;
DataBase *AccountManagerHelper::mDataBase = nullptr;

bool AccountManagerHelper::initDataBase()
{
    if (!mDataBase)
        mDataBase = new DataBase;
    return true;
}

void AccountManagerHelper::releaseDataBase()
{
    delete mDataBase;
    mDataBase = nullptr;
}

bool AccountManagerHelper::isSignedIn()
{
    return !mLatestLoginAccount.isEmpty() && !mCurrentToken.isEmpty();
}

bool AccountManagerHelper::login(const QString &user, const QString &pin)
{
    logLine("AccountManagerHelper::login:", user, " ", pin);
    const QString stored = getPassword(user);
    logLine("get pwd from database:", stored);
    if (stored != pin) {
        logLine("The password is incorrect!! should be:", stored);
        return false;
    }
    readTokens(user);
    if (mCurrentToken.isEmpty() || mRefreshToken.isEmpty())
        return false;
    if (!mDataBase || !mDataBase->updateLatestUser(user)) {
        logLine("Update latest login user fail!!");
        return false;
    }
    mLatestLoginAccount = user;
    return true;
}

void AccountManagerHelper::readTokens(const QString &user)
{
    const auto info = mDataBase ? mDataBase->getUserInfo(user) : QMap<QString, QString>();
    mCurrentToken = info.value(QStringLiteral("token"));
    mRefreshToken = info.value(QStringLiteral("refresh"));
    mUserName = info.value(QStringLiteral("realname"));
    logLine("get mCurrentToken from database:", mCurrentToken);
    logLine("get mRefreshToken from database:", mRefreshToken);
    logLine("get mUserName from database:", mUserName);
}

bool AccountManagerHelper::logout()
{
    // The refresh token and the name stay: the next login overwrites them.
    mLatestLoginAccount.clear();
    mCurrentToken.clear();
    return true;
}

QString AccountManagerHelper::getUserName()
{
    if (!mUserName.isEmpty() || !isSignedIn())
        return mUserName;
    const bool own = !mDataBase;
    if (own)
        initDataBase();
    mUserName = mDataBase->getUserInfo(mLatestLoginAccount).value(QStringLiteral("realname"));
    if (own)
        releaseDataBase();
    return mUserName;
}

QString AccountManagerHelper::getLatestLoginAccount()
{
    if (mDataBase)
        mLatestLoginAccount = mDataBase->getLoginUser();
    return mLatestLoginAccount;
}

QString AccountManagerHelper::getAccessToken()
{
    if (!isSignedIn())
        logLine(" Before get this access Token, you must provide a user");
    return mCurrentToken;
}

QString AccountManagerHelper::getRefreshToken()
{
    if (mRefreshToken.isEmpty() && isSignedIn() && mDataBase) {
        const auto info = mDataBase->getUserInfo(mLatestLoginAccount);
        // A failed read gives no tokens, which is no reason to drop the one in use.
        if (!info.isEmpty()) {
            mCurrentToken = info.value(QStringLiteral("token"));
            mRefreshToken = info.value(QStringLiteral("refresh"));
        }
    }
    return mRefreshToken;
}

int AccountManagerHelper::getExpires()
{
    return mExpires;
}

void AccountManagerHelper::setAccessToken(const QString &token)
{
    mCurrentToken = token;
}

void AccountManagerHelper::setRefreshToken(const QString &token)
{
    mRefreshToken = token;
}

void AccountManagerHelper::setUserName(const QString &name)
{
    mUserName = name;
}

void AccountManagerHelper::setExpires(int seconds)
{
    mExpires = seconds;
}

QString AccountManagerHelper::getPassword(const QString &user)
{
    return mDataBase ? mDataBase->getPwdByUser(user) : QString();
}

bool AccountManagerHelper::addAccount(const QString &user, const QString &pin, const QString &token)
{
    return mDataBase && mDataBase->insertAccount(
                            {user, pin, token, mRefreshToken, QStringLiteral("false"), mUserName});
}

bool AccountManagerHelper::removeAccount(const QString &user)
{
    return mDataBase && mDataBase->removeAccount(user);
}

bool AccountManagerHelper::updateToken(const QString &user, const QString &token)
{
    return mDataBase && mDataBase->updateToken(user, token, mRefreshToken);
}

QStringList AccountManagerHelper::getAccounts(bool oauth)
{
    return mDataBase ? mDataBase->getAccounts(oauth) : QStringList();
}

QString AccountManagerHelper::getDisplayName(const QString &user)
{
    return mDataBase ? mDataBase->getUserInfo(user).value(QStringLiteral("realname")) : QString();
}

bool AccountManagerHelper::hasFailed()
{
    return !mDataBase || mDataBase->hasFailed();
}
