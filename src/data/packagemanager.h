#pragma once

#include "data/package.h"
#include "network/errorcode.h"

#include <QHash>
#include <QList>
#include <QPointer>
#include <QString>

class Connection;

// Owner of every list that a screen shows. Fetches pages, keeps recent ones for a while, fetches
// the next featured page ahead, and answers on the screen's static call-back.
//
//   screen: getPackage() -> package, or null -> downloadPage(property, callback)
//           callback(property, code): on 0, getPackage() again; otherwise show the failure.
//
// A request for a list that is already under way joins it: only the newest call-back is called, so
// a screen compares the property it gets with the one it now wants. GUI thread only.
class PackageManager
{
public:
    using Callback = void (*)(PackageProperty &property, ErrorCode code);

    // The cached list when it can serve this page, else null. It stays valid until the next call
    // that may evict (any download's end): never keep the pointer over the event loop without
    // asking again.
    static Package *getPackage(PackageProperty &property);
    // What is cached of this list, whether it can serve the page or not; fetches nothing ahead.
    static const Package *cached(const PackageProperty &property);
    // True when a request for this list is running afterwards; false calls nothing.
    static bool downloadPage(PackageProperty &property, Callback callback);
    // Whether the page that failed last was refused because the sign-in has expired; for a
    // call-back to ask.
    static bool isSignInRefused() { return mIsSignInRefused; }
    static void prepareNextDatas(PackageProperty property, int startIndex);

    static void networkCallback(QString url, CallbackType type, int param);
    static void handleDownloadFinished(const QString &url);
    static void handleDownloadError(const QString &url);

    static void addToCache(PackageProperty &property, Package *package, bool appended);
    static void removeCache(PackageProperty &property);
    static bool canBeRemovedByNewlyArrivedPackage(PackageProperty &property, int arrivedType);
    // Forgets every list and ends every request, without calling back; gives the memory back to
    // the system.
    static void clearAll();

    // Called before a list is deleted, so that a screen that shows it lets go of it; null: nobody.
    using RemovalHook = void (*)(const Package *package);
    static void setRemovalHook(RemovalHook hook);

private:
    struct Request
    {
        QPointer<Connection> connection;
        PackageProperty property;
        Callback callback = nullptr;
    };

    static Connection *startRequest(const QString &url);
    static Request takeRequest(const QString &url, const char *where);
    static ErrorCode storeFeed(PackageProperty &property, const QByteArray &feedText);
    static void prepareFollowingPage(const PackageProperty &property, const Package &package);
    static void removeStalePackages(const PackageProperty &arrived, const Package *kept);
    static void removeSurplusPackages(const PackageProperty &arrived, const Package *kept);
    static bool isOther(const PackageProperty &entry, const Package *package);
    static void markAccessed(const PackageProperty &property);
    static void forget(PackageProperty property);
    static void discard(Package *package);

    static RemovalHook mRemovalHook;
    static bool mIsSignInRefused;
    static QHash<QString, Package *> mCachedPackageHash;
    static QHash<QString, QPointer<Connection>> mDownlodingConnectionHash;
    static QHash<QString, PackageProperty> mDownlodingPropertyHash;
    static QHash<QString, Callback> mCallbackFunHash;
    static QList<PackageProperty> mRecentlyAccessPackagePropertyList;
    static QList<PackageProperty> mRecentlyDownloadedPackagePropertyList;
};
