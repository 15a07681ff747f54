#include "accountmanager/accountmanagerhelper.h"
#include "data/urlcreator.h"
#include "testconfig.h"

#include <QtTest>

class TestUrlCreator : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        AccountManagerHelper::setUserName("ann");
        AccountManagerHelper::setAccessToken("1/tok");
    }

    void buildsEveryAddress()
    {
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
    }

    void refusesIncompleteRequests()
    {
        for (int type : {-1, 0, 2, 3, 5, 6, 7, 9}) {
            PackageProperty property;
            property.mType = type;
            QCOMPARE(UrlCreator::getUrl(property), QString());
        }
    }

private:
    TestConfig mConfig{"[Service]\nFeedBase=http://h%2C1/\n"};
};

QTEST_GUILESS_MAIN(TestUrlCreator)
#include "tst_urlcreator.moc"
