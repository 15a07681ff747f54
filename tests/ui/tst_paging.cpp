#include "data/packageproperty.h"
#include "ui/detailpaging.h"
#include "ui/paging.h"

#include <QtTest>

using paging::onePage;

class TestPaging : public QObject
{
    Q_OBJECT

private slots:
    void aPageBackOrOn_data();
    void aPageBackOrOn();
    void recordsAndBlocks();
    void pagesOfThePhotoScreen();
};

void TestPaging::aPageBackOrOn_data()
{
    QTest::addColumn<bool>("on");
    QTest::addColumn<int>("start");
    QTest::addColumn<int>("arg");
    QTest::addColumn<int>("newStart"); // 0: there is no such page

    QTest::newRow("back from within the first page") << false << 8 << onePage << 0;
    QTest::newRow("back from the second") << false << 9 << onePage << 1;
    QTest::newRow("back to the last of a page") << false << 41 << 16 << 9;
    QTest::newRow("back to no record") << false << 41 << 0 << 0;
    QTest::newRow("on") << true << 1 << onePage << 9;
    QTest::newRow("on to the very last record") << true << 9 << onePage << 17;
    QTest::newRow("on from the last page") << true << 17 << onePage << 0;
    QTest::newRow("on to record 17") << true << 1 << 17 << 17;
    QTest::newRow("on to no record") << true << 1 << -2 << 0;
}

void TestPaging::aPageBackOrOn()
{
    QFETCH(bool, on);
    QFETCH(int, start);
    QFETCH(int, arg);
    const paging::Page page = on ? paging::pageDown(start, 17, arg) : paging::pageUp(start, arg);
    QTEST(page.exists ? page.startIndex : 0, "newStart");
}

void TestPaging::recordsAndBlocks()
{
    QCOMPARE(paging::recordIndex(TYPE_FEATURED_PHOTOS, 9, 3), 11);
    QCOMPARE(paging::recordIndex(TYPE_SEARCH_PHOTOS, 97, 0), 96);
    QCOMPARE(paging::recordIndex(TYPE_SEARCH_MORE_PHOTOS, 109, 2), 10);
    QCOMPARE(paging::neighbourBlock(0, true, 101), 1);
    QCOMPARE(paging::neighbourBlock(0, true, 100), 0);
    QCOMPARE(paging::neighbourBlock(2, false, 300), 1);
    QCOMPARE(paging::neighbourBlock(0, false, 300), 0);
}

void TestPaging::pagesOfThePhotoScreen()
{
    QCOMPARE(detailpaging::pageStart(FEATURED_PHOTOS_LIST, 8), 1);
    QCOMPARE(detailpaging::pageStart(ALBUM_PHOTOS_LIST, 103), 97);
    QCOMPARE(detailpaging::pageStart(SEARCH_PHOTOS_LIST, 100), 97);
    QCOMPARE(detailpaging::pageStart(SEARCH_MORE_PHOTOS_LIST, 108), 101);

    QCOMPARE(detailpaging::stripStart(1, 20, 5), 1);
    QCOMPARE(detailpaging::stripStart(10, 20, 5), 8);
    QCOMPARE(detailpaging::stripStart(20, 20, 5), 16);
    QCOMPARE(detailpaging::stripStart(3, 4, 5), 1);
    QCOMPARE(detailpaging::stripStart(3, 0, 5), 1); // the total is not known
    QCOMPARE(detailpaging::stripPlaces(448, 80, 8), 5);
    QCOMPARE(detailpaging::stripPlaces(431, 80, 8), 3);
    QCOMPARE(detailpaging::stripPlaces(10, 80, 8), 1);
}

QTEST_APPLESS_MAIN(TestPaging)
#include "tst_paging.moc"
