#include "data/packagemanager.h"
#include "heldanswers.h"
#include "support/testconfig.h"

#include <QtTest>

namespace {

const QByteArray featuredPath = "/data/feed/api/featured";

struct Answer
{
    PackageProperty property;
    ErrorCode code;
};
QList<Answer> answers, secondAnswers;
void (*reaction)(PackageProperty &); // inside the first call-back

void store(PackageProperty &property, ErrorCode code)
{
    answers.append({property, code});
    if (reaction && answers.size() == 1)
        reaction(property);
}

void storeSecond(PackageProperty &property, ErrorCode code)
{
    secondAnswers.append({property, code});
}

PackageProperty albumsOf(const QString &user)
{
    PackageProperty property;
    property.mType = ALBUMS_LIST;
    property.mUserId = user;
    return property;
}

PackageProperty ofType(PackageType type, int start = 1)
{
    PackageProperty property = albumsOf("u");
    property.mType = type;
    property.mStartIndex = start;
    return property;
}

// Empty entries, of a hundred that the service has.
QByteArray feedOf(int entries)
{
    return "{\"feed\":{\"openSearch$totalResults\":{\"$t\":100},\"entry\":[{}" +
           QByteArray(",{}").repeated(entries - 1) + "]}}";
}

} // namespace

class TestPackageManager : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        mServer = std::make_unique<MisbehavingServer>();
        mHeld = HeldAnswers();
        configure();
        answers.clear();
        secondAnswers.clear();
        reaction = nullptr;
    }
    void cleanup()
    {
        PackageManager::clearAll();
        mServer.reset();
    }

    void joinsRequestsForOneList()
    {
        mServer->on("/data/feed/api/user/u", mHeld.hold());
        PackageProperty property = albumsOf(QString());
        QVERIFY(!PackageManager::downloadPage(property, &store)); // no address
        property = albumsOf("u");
        QVERIFY(!PackageManager::getPackage(property));
        QVERIFY(PackageManager::downloadPage(property, &store));
        QVERIFY(PackageManager::downloadPage(property, &storeSecond));
        QTRY_COMPARE(mHeld.count(), 1);
        mHeld.answerFirst(MisbehavingServer::answer(feedOf(3)));
        QTRY_COMPARE(secondAnswers.size(), 1);
        QCOMPARE(secondAnswers.first().code, NET_SUCCESS);
        QVERIFY(answers.isEmpty() && secondAnswers.first().property.mDownloadTime.isValid());
        QCOMPARE(mServer->requests().size(), 1);
        QCOMPARE(PackageManager::getPackage(property)->count(), 3);

        // Lists whose addresses are the same although their keys differ do not disturb each other.
        mServer->on("/data/feed/api/user/u", MisbehavingServer::answer(feedOf(3)));
        PackageProperty first = property, second = property;
        second.mAlbumId = "left over";
        QVERIFY(PackageManager::downloadPage(first, &store));
        QVERIFY(PackageManager::downloadPage(second, &store));
        QTRY_COMPARE(answers.size(), 2);
        QVERIFY(PackageManager::getPackage(first) && PackageManager::getPackage(second));
    }

    void fetchesFeaturedPagesAhead()
    {
        mServer->on(featuredPath, mHeld.hold());
        PackageProperty first = ofType(FEATURED_PHOTOS_LIST);
        QVERIFY(PackageManager::downloadPage(first, &store));
        QTRY_COMPARE(mHeld.count(), 1);
        mHeld.answerFirst(MisbehavingServer::answer(feedOf(8)));
        QTRY_COMPARE(mHeld.count(), 1); // the second page is on its way by itself
        QVERIFY(mServer->requests().last().path.contains("start-index=9&max-results=8"));
        QCOMPARE(answers.size(), 1);
        QCOMPARE(answers.first().property.mTotalCount, 100);

        PackageProperty second = ofType(FEATURED_PHOTOS_LIST, 9);
        QVERIFY(!PackageManager::getPackage(second));
        QVERIFY(PackageManager::downloadPage(second, &storeSecond));
        QVERIFY(PackageManager::getPackage(first)); // fetches ahead again, and joins
        mHeld.answerFirst(MisbehavingServer::answer(feedOf(8)));
        QTRY_COMPARE(secondAnswers.size(), 1);
        QCOMPARE(PackageManager::getPackage(second)->count(), 16);
        QTRY_COMPARE(mHeld.count(), 1); // start 17, asked for by the hit
        PackageProperty third = ofType(FEATURED_PHOTOS_LIST, 17);
        QVERIFY(!PackageManager::getPackage(third));
    }

    void dropsStaleFirstPagesOnly()
    {
        PackageProperty property = albumsOf("u"), later = property;
        later.mStartIndex = 9;
        configure("PageCacheSeconds=0\n"); // a page is there for a moment at least
        Package *package = packageOf(property);
        PackageManager::addToCache(property, package, false);
        QVERIFY(PackageManager::getPackage(property) && PackageManager::getPackage(later));
        package->mProperty.mDownloadTime = property.mDownloadTime.addSecs(-1);
        QVERIFY(PackageManager::getPackage(later));
        QVERIFY(!PackageManager::getPackage(property) && !PackageManager::getPackage(later));

        configure();
        PackageProperty other = albumsOf("other"), fresh = albumsOf("fresh");
        Package *old = packageOf(other);
        other.mDownloadTime = old->mProperty.mDownloadTime = other.mDownloadTime.addSecs(-61);
        PackageManager::addToCache(other, old, false);
        PackageManager::addToCache(fresh, packageOf(fresh), false); // sweeps what is stale
        QVERIFY(!PackageManager::getPackage(other) && PackageManager::getPackage(fresh));
    }

    void evictsTheOldestButNotForDetails()
    {
        configure("PageCacheNumber=3\n");
        for (const char *user : {"a", "b", "c"}) {
            PackageProperty property = albumsOf(user);
            PackageManager::addToCache(property, packageOf(property), false);
        }
        PackageProperty comments = ofType(PHOTO_COMMENTS_LIST);
        PackageManager::addToCache(comments, packageOf(comments), false);
        QCOMPARE(cachedUsers(), QString("abc"));
        PackageProperty newest = albumsOf("d");
        PackageManager::addToCache(newest, packageOf(newest), false);
        QCOMPARE(cachedUsers(), QString("cd"));
        QVERIFY(PackageManager::getPackage(comments));
    }

    void tellsEachFailureAndMayBeAskedAgain()
    {
        const QPair<MisbehavingServer::Behaviour, ErrorCode> rows[] = {
            {MisbehavingServer::html(404), NET_CONTENT_ERROR},
            {MisbehavingServer::reset(), NET_FAILED},
            {MisbehavingServer::answer(""), NET_NO_DATA},
            {MisbehavingServer::gzipBomb(40), NET_CANCELED},
            {MisbehavingServer::html(), NET_SUCCESS}};
        PackageProperty property = albumsOf("u");
        reaction = [](PackageProperty &failed) { PackageManager::downloadPage(failed, &store); };
        for (const auto &[behaviour, code] : rows) {
            answers.clear();
            mServer->on("/data/feed/api/user/u", behaviour);
            QVERIFY(PackageManager::downloadPage(property, &store));
            QTRY_COMPARE(answers.size(), 2);
            QCOMPARE(answers.first().code, code);
            QCOMPARE(answers.last().code, code);
            QVERIFY(answers.first().property == property);
        }
    }

    void clearsInsideCallbackAndWhileRunning()
    {
        mServer->on(featuredPath, mHeld.hold());
        PackageProperty property = ofType(FEATURED_PHOTOS_LIST);
        reaction = [](PackageProperty &) { PackageManager::clearAll(); };
        QVERIFY(PackageManager::downloadPage(property, &store));
        QTRY_COMPARE(mHeld.count(), 1);
        mHeld.answerFirst(MisbehavingServer::answer(feedOf(8)));
        QTRY_COMPARE(answers.size(), 1);
        QVERIFY(!PackageManager::getPackage(property));

        QVERIFY(PackageManager::downloadPage(property, &storeSecond));
        QTRY_COMPARE(mHeld.count(), 1);
        PackageManager::clearAll();
        QVERIFY(PackageManager::downloadPage(property, &store)); // a request of its own
        QTRY_COMPARE(mHeld.count(), 2);
        QCOMPARE(mServer->requests().size(), 3); // and nothing was fetched ahead
        while (mHeld.count() > 0)
            mHeld.answerFirst(MisbehavingServer::answer(feedOf(8)));
        QTRY_COMPARE(answers.size(), 2);
        QVERIFY(secondAnswers.isEmpty());
    }

private:
    void configure(const QByteArray &limits = QByteArray())
    {
        mConfig.write("[Service]\nFeedBase=" + mServer->url("").toLatin1() + "\n[Max]\n" + limits);
    }
    static Package *packageOf(PackageProperty &property)
    {
        property.mDownloadTime = QDateTime::currentDateTime();
        auto *package = new Package;
        package->mProperty = property;
        return package;
    }
    static QString cachedUsers()
    {
        QString users;
        for (const char *user : {"a", "b", "c", "d"}) {
            PackageProperty property = albumsOf(user);
            if (PackageManager::getPackage(property))
                users += user;
        }
        return users;
    }

    TestConfig mConfig;
    std::unique_ptr<MisbehavingServer> mServer;
    HeldAnswers mHeld;
};

QTEST_GUILESS_MAIN(TestPackageManager)
#include "tst_packagemanager.moc"
