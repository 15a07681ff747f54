#include "accountmanager/accountmanagerhelper.h"
#include "data/feedtranslation.h"
#include "data/htmlentities.h"
#include "data/publishedtime.h"
#include "data/urlcreator.h"
#include "platform/devicestate.h"
#include "support/testconfig.h"

#include <QtTest>

#include <memory>

using OwnedPackage = std::unique_ptr<Package>;

namespace {

// Feeds are written with single quotes here.
QByteArray json(QByteArray text)
{
    return text.replace('\'', '"');
}

PackageProperty listOf(PackageType type, int start = 1)
{
    PackageProperty property;
    property.mType = type;
    property.mStartIndex = start;
    return property;
}

QByteArray feed(const QByteArray &entries, const QByteArray &members = "\"id\":{\"$t\":\"f\"}")
{
    return "{\"version\":\"1.0\",\"feed\":{" + members + ",\"entry\":[" + entries + "]}}";
}

OwnedPackage packageOf(PackageType type, const QByteArray &text)
{
    Package *package = nullptr;
    if (createPackage(listOf(type), text, &package) != NET_SUCCESS)
        qFatal("a known type must give a package");
    return OwnedPackage(package);
}

const QByteArray photoEntry =
    json("{'title':{'$t':'Sea &amp; sky'},"
         "'gphoto$width':{'$t':'4000'},'gphoto$height':{'$t':'3000'},"
         "'content':{'src':'http://h/abc/name.jpg'},"
         "'media$group':{'media$thumbnail':[{'url':'t1'},{'url':'t2'}],"
         "'media$keywords':{'$t':'a, b, , c'}},"
         "'gphoto$albumid':{'$t':'al'},'author':[{'gphoto$user':{'$t':'ann'}},{'gphoto$user':{'$t':"
         "'x'}}],"
         "'published':{'$t':'2012-03-01T10:20:30.000Z'},'summary':{'$t':'s'},"
         "'gphoto$id':{'$t':'5555555555555555555'},'gphoto$commentCount':{'$t':7}}");

} // namespace

// The feeds' addresses, and the records that they become.
class TestRecords : public QObject
{
    Q_OBJECT

private slots:
    void init() { mConfig.write(""); }

    void readsPhotoAndTags()
    {
        const QByteArray total = json("'openSearch$totalResults':{'$t':'321'}");
        const OwnedPackage package = packageOf(FEATURED_PHOTOS_LIST, feed(photoEntry, total));
        QCOMPARE(package->mTotalCount + package->mProperty.mTotalCount, 642);
        QCOMPARE(packageOf(ALBUM_PHOTOS_LIST, feed(photoEntry, total))->mTotalCount, 0);
        const auto *photo = package->record<OrvalaPhoto>(0);
        QVERIFY(photo && !package->record<OrvalaPhoto>(1) && !package->record<Album>(0));
        QCOMPARE(photo->title(), QString("Sea &amp; sky"));
        QCOMPARE(unescapeHtml("&amp;lt;b&gt;&quot;<br />&LT;&amp;amp;"), "<b>\"\n&LT;&amp;");
        QCOMPARE(photo->size(), QSize(4000, 3000));
        QCOMPARE(photo->imageUrl(), QString("http://h/abc/s1180/name.jpg"));
        QCOMPARE(photo->thumbnailUrl(), QString("t2"));
        QCOMPARE(photo->keywords(), QStringList({"a", "b", "c"}));
        QCOMPARE(photo->albumId() + photo->userId() + photo->summary(), QString("alanns"));
        QCOMPARE(photo->published(), QDateTime(QDate(2012, 3, 1), QTime(10, 20, 30)));
        QCOMPARE(photo->photoId(), QString("5555555555555555555"));
        QCOMPARE(photo->commentCount(), 7);
        const QByteArray tags = feed(json("{'title':{'$t':'x, y, '}}"));
        QCOMPARE(packageOf(PHOTO_TAGS_LIST, tags)->record<PhotoTagList>(0)->tagList(),
                 QStringList({"x", "y"}));
    }

    void asksForDisplayWidth()
    {
        const QByteArray rows[][3] = {{"\"600\"", "a/b.jpg", "a/s600/b.jpg"},
                                      {"1181.0", "a/b/c", "a/b/s1180/c"},
                                      {"\"600\"", "name", "name"},
                                      {"1e300", "a/b", "a/s0/b"}};
        for (const auto &[width, source, url] : rows) {
            const OwnedPackage package =
                packageOf(ALBUM_PHOTOS_LIST, feed("{\"gphoto$width\":{\"$t\":" + width +
                                                  "},\"content\":{\"src\":\"" + source + "\"}}"));
            QCOMPARE(package->record<OrvalaPhoto>(0)->imageUrl(), QString(url));
        }
    }

    void readsAlbumWithFeedOwner()
    {
        const QByteArray entry =
            json("{'published':{'$t':'2012-03-01T10:00:00.000Z'},"
                 "'title':{'$t':'T'},'gphoto$numphotos':{'$t':12},'gphoto$id':{'$t':'id'},"
                 "'gphoto$user':{'$t':'bob'},'gphoto$nickname':{'$t':'Bob'},"
                 "'media$group':{'media$content':[{'url':'c1'},{'url':'c2'}],"
                 "'media$thumbnail':[{'url':'t1'},{'url':'t2'}]}}");
        const OwnedPackage package =
            packageOf(ALBUMS_LIST, feed(entry, json("'gphoto$user':{'$t':'owner'}")));
        const auto *album = package->record<Album>(0);
        QVERIFY(album);
        QCOMPARE(album->userId() + album->user() + album->nickname(), QString("ownerbobBob"));
        QCOMPARE(album->contentUrl() + album->thumbnailUrl(), QString("c1t1"));
        QCOMPARE(album->albumId() + album->id() + album->title(), QString("ididT"));
        QCOMPARE(album->numPhotos(), 12);
        QCOMPARE(album->published(), QDateTime(QDate(2012, 3, 1), QTime(10, 0), Qt::UTC));
    }

    void showsCommentsInThePlatformsZone()
    {
        const QByteArray text = feed(json("{'published':{'$t':'2012-03-01T10:00:00.000Z'},"
                                          "'author':[{'gphoto$user':{'$t':'u'},'gphoto$nickname':{'"
                                          "$t':'n'}}],'content':{'$t':'hi'},"
                                          "'gphoto$id':{'$t':'c'},'gphoto$photoid':{'$t':'p'}}"));
        IsSetTimeZone = false;
        OwnedPackage package = packageOf(PHOTO_COMMENTS_LIST, text);
        const QDateTime created(QDate(2012, 3, 1), QTime(10, 0), Qt::UTC);
        QCOMPARE(package->record<Comment>(0)->createdTime(), created);
        QCOMPARE(package->record<Comment>(0)->createdTime().timeSpec(), Qt::LocalTime);

        IsSetTimeZone = true;
        TimeZone = 8;
        package = packageOf(PHOTO_COMMENTS_LIST, text);
        IsSetTimeZone = false;
        const auto *comment = package->record<Comment>(0);
        QCOMPARE(comment->createdTime(), QDateTime(QDate(2012, 3, 1), QTime(18, 0), Qt::UTC));
        QCOMPARE(comment->userId() + comment->nickname() + comment->content(), QString("unhi"));
        QCOMPARE(comment->commentId() + comment->photoId(), QString("cp"));
    }

    // Whatever stands where something else is expected: one record for each entry, with defaults.
    void survivesWrongTypes()
    {
        const QList<QByteArray> values = {"null", "true", "7",  "-1e308",       "\"text\"",
                                          "[]",   "[{}]", "{}", "[[1],[null]]", "{\"$t\":{}}"};
        for (const QByteArray &value : values) {
            const QByteArray entry =
                json("{'title':@,'gphoto$width':@,'content':@,'author':@,'published':@,"
                     "'gphoto$commentCount':@,'gphoto$id':@,'media$group':{'media$thumbnail':@,"
                     "'media$content':@,'media$keywords':@}}")
                    .replace('@', value);
            for (int type = FEATURED_PHOTOS_LIST; type <= SEARCH_MORE_PHOTOS_LIST; ++type) {
                const auto kind = PackageType(type);
                QCOMPARE(packageOf(kind, feed(entry + "," + entry))->count(), 2);
                QVERIFY(packageOf(kind, "{\"feed\":" + value + "}")->count() == 0);
                QVERIFY(packageOf(kind, "{\"feed\":{\"entry\":" + value + "}}")->count() <= 2);
            }
        }
        QCOMPARE(packageOf(ALBUMS_LIST, "<html>")->count(), 0);
        Package *package = nullptr;
        QCOMPARE(createPackage(listOf(INVALID_LIST), QString("{}"), &package), NET_REJECTED);
        QVERIFY(!package);
    }

    void appendsFeaturedAndReplacesSearchPages()
    {
        const QByteArray two = feed(photoEntry + "," + photoEntry);
        for (const auto &[type, expected] : {std::pair{FEATURED_PHOTOS_LIST, 3},
                                             {SEARCH_MORE_PHOTOS_LIST, 2},
                                             {SEARCH_PHOTOS_LIST, 1}}) {
            OwnedPackage package = packageOf(type, feed(photoEntry));
            const auto *shown = package->record<OrvalaPhoto>(0);
            Package *same = package.get();
            QCOMPARE(appendPackage(listOf(type, 9), two, &same), NET_SUCCESS);
            QCOMPARE(package->count(), expected);
            QCOMPARE(shown->title(), QString("Sea &amp; sky")); // a replaced record lives on
        }
    }

    // The digits are split by hand: Qt's own parser must agree on any text.
    void splitsTimesLikeFormattedParsing()
    {
        QStringList texts = {"", "2012-02-30T10:00:00", "2012-03-01T10:00:00.5Z", ".5"};
        QRandomGenerator random(1);
        const QString characters = "0123456789-:T+Z. ";
        for (int i = 0; i < 2000; ++i) {
            QString text = "2012-03-01T10:20:30";
            for (int changes = random.bounded(3); changes >= 0; --changes)
                text[random.bounded(text.size())] = characters[random.bounded(characters.size())];
            texts << text;
        }
        for (const QString &text : qAsConst(texts))
            QCOMPARE(localTimeAsWritten(text),
                     QDateTime::fromString(text.section('.', 0, 0), "yyyy-MM-dd'T'hh:mm:ss"));
    }

    void buildsEveryAddress()
    {
        mConfig.write("[Service]\nFeedBase=http://h%2C1/\n");
        AccountManagerHelper::setAccessToken("1/tok");
        const QString token = "access_token=1/tok&alt=json";
        const QString photo = "user/u%2Fx@h/albumid/%251/photoid/p%20q?kind=";
        const QString words = "all?q=a%2Cb%20%C3%A4%251%26&max-results=100";
        const QPair<int, QString> rows[] = {
            {FEATURED_PHOTOS_LIST, "featured?start-index=9&max-results=8&v=2&prettyprint=true&alt="
                                   "json&strict=true&kind=photo"},
            {ALBUMS_LIST, "user/u%2Fx@h?" + token},
            {ALBUM_PHOTOS_LIST, "user/u%2Fx@h/albumid/%251?" + token},
            {PHOTO_COMMENTS_LIST, photo + "comment&" + token},
            {PHOTO_TAGS_LIST, photo + "tag&" + token},
            {FAVORITE_PEOPLE_LIST, "user/u%2Fx@h/contacts?kind=user&" + token},
            {SEARCH_PHOTOS_LIST, words + "&alt=json"},
            {SEARCH_MORE_PHOTOS_LIST, words + "&start-index=9&alt=json"}};
        PackageProperty property;
        property.mUserId = "u/x@h";
        property.mAlbumId = "%1";
        property.mPhotoId = "p q";
        property.mSearchedStr = QString::fromUtf8("a,b ä%1&");
        property.mStartIndex = 9;
        for (const auto &[type, path] : rows) {
            property.mType = type;
            QCOMPARE(UrlCreator::getUrl(property), "http://h%2C1/data/feed/api/" + path);
        }
        for (int type : {-1, 0, 2, 3, 5, 6, 7, 9})
            QCOMPARE(UrlCreator::getUrl(listOf(PackageType(type))), QString());
    }

private:
    TestConfig mConfig;
};

QTEST_GUILESS_MAIN(TestRecords)
#include "tst_records.moc"
