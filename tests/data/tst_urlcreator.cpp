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

    void buildsEveryAddress_data()
    {
        QTest::addColumn<int>("type");
        QTest::addColumn<QString>("path");
        const QString token = "access_token=1/tok&alt=json";
        QTest::newRow("featured")
            << int(FEATURED_PHOTOS_LIST)
            << "featured?start-index=9&max-results=8&v=2&prettyprint=true&alt="
               "json&strict=true&kind=photo";
        QTest::newRow("albums") << int(ALBUMS_LIST) << "user/u%2Fx@h?" + token;
        QTest::newRow("album") << int(ALBUM_PHOTOS_LIST) << "user/u%2Fx@h/albumid/%251?" + token;
        QTest::newRow("comments") << int(PHOTO_COMMENTS_LIST)
                                  << "user/u%2Fx@h/albumid/%251/photoid/p%20q?kind=comment&" +
                                         token;
        QTest::newRow("tags") << int(PHOTO_TAGS_LIST)
                              << "user/u%2Fx@h/albumid/%251/photoid/p%20q?kind=tag&" + token;
        QTest::newRow("people") << int(FAVORITE_PEOPLE_LIST)
                                << "user/u%2Fx@h/contacts?kind=user&" + token;
        const QString words = "all?q=a%2Cb%20%C3%A4%251%26&max-results=100";
        QTest::newRow("search") << int(SEARCH_PHOTOS_LIST) << words + "&alt=json";
        QTest::newRow("more") << int(SEARCH_MORE_PHOTOS_LIST) << words + "&start-index=9&alt=json";
    }
    void buildsEveryAddress()
    {
        QFETCH(int, type);
        PackageProperty property;
        property.mType = type;
        property.mUserId = "u/x@h";
        property.mAlbumId = "%1";
        property.mPhotoId = "p q";
        property.mSearchedStr = QString::fromUtf8("a,b ä%1&");
        property.mStartIndex = 9;
        const QString start = SystemConfig::feedBase() + "/data/feed/api/";
        QFETCH(QString, path);
        QCOMPARE(UrlCreator::getUrl(property), start + path);
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
