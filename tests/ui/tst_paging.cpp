#include "data/packageproperty.h"
#include "ui/paging.h"

#include <QtTest>

using paging::onePage;

class TestPaging : public QObject
{
    Q_OBJECT

private slots:
    void aPageBackOrOn_data();
    void aPageBackOrOn();
    void aCellsRecord_data();
    void aCellsRecord();
    void blocksOfResults();
};

void TestPaging::aPageBackOrOn_data()
{
    QTest::addColumn<bool>("on");
    QTest::addColumn<int>("start");
    QTest::addColumn<int>("arg");
    QTest::addColumn<bool>("exists");
    QTest::addColumn<int>("newStart");

    QTest::newRow("back from the first page") << false << 1 << onePage << false << 1;
    QTest::newRow("back from within it") << false << 8 << onePage << false << 1;
    QTest::newRow("back from the second") << false << 9 << onePage << true << 1;
    QTest::newRow("back to record 12") << false << 41 << 12 << true << 9;
    QTest::newRow("back to the last of a page") << false << 41 << 16 << true << 9;
    QTest::newRow("back to no record") << false << 41 << 0 << false << 1;
    QTest::newRow("on") << true << 1 << onePage << true << 9;
    QTest::newRow("on to the very last record") << true << 9 << onePage << true << 17;
    QTest::newRow("on from the last page") << true << 17 << onePage << false << 1;
    QTest::newRow("on to record 17") << true << 1 << 17 << true << 17;
    QTest::newRow("on to no record") << true << 1 << -2 << false << 1;
}

void TestPaging::aPageBackOrOn()
{
    QFETCH(bool, on);
    QFETCH(int, start);
    QFETCH(int, arg);
    const paging::Page page = on ? paging::pageDown(start, 17, arg) : paging::pageUp(start, arg);
    QTEST(page.exists, "exists");
    QTEST(page.startIndex, "newStart");
}

void TestPaging::aCellsRecord_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<int>("start");
    QTest::addColumn<int>("cell");
    QTest::addColumn<int>("record");

    QTest::newRow("featured") << int(TYPE_FEATURED_PHOTOS) << 9 << 3 << 11;
    QTest::newRow("first search") << int(TYPE_SEARCH_PHOTOS) << 97 << 0 << 96;
    QTest::newRow("further results") << int(TYPE_SEARCH_MORE_PHOTOS) << 109 << 2 << 10;
}

void TestPaging::aCellsRecord()
{
    QFETCH(int, type);
    QFETCH(int, start);
    QFETCH(int, cell);
    QTEST(paging::recordIndex(type, start, cell), "record");
}

void TestPaging::blocksOfResults()
{
    QCOMPARE(paging::neighbourBlock(0, true, 101), 1);
    QCOMPARE(paging::neighbourBlock(0, true, 100), 0);
    QCOMPARE(paging::neighbourBlock(2, false, 300), 1);
    QCOMPARE(paging::neighbourBlock(0, false, 300), 0);
    QCOMPARE(paging::blockStart(2), 201);
}

QTEST_APPLESS_MAIN(TestPaging)
#include "tst_paging.moc"
