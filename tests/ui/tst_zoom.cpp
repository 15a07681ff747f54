#include "data/packageproperty.h"
#include "ui/detailpaging.h"
#include "ui/zoom.h"

#include <QtTest>

class TestZoom : public QObject
{
    Q_OBJECT

private slots:
    void factorsCoverTheView_data();
    void factorsCoverTheView();
    void panStopsAtTheEdges_data();
    void panStopsAtTheEdges();
    void widthsToAskFor_data();
    void widthsToAskFor();
    void addresses();
    void pageStarts_data();
    void pageStarts();
    void stripStarts_data();
    void stripStarts();
};

void TestZoom::factorsCoverTheView_data()
{
    QTest::addColumn<QSize>("photo");
    QTest::addColumn<QVector<qreal>>("factors");
    QTest::newRow("landscape") << QSize(4000, 3000) << QVector<qreal>{2, 4};
    QTest::newRow("panorama") << QSize(16000, 500) << QVector<qreal>{2, 4, 8, 16};
    QTest::newRow("tall") << QSize(500, 4000) << QVector<qreal>{2, 4, 8, 16};
    QTest::newRow("hardly more than doubled") << QSize(9000, 1000) << QVector<qreal>{2, 4.5};
    QTest::newRow("a line") << QSize(100000, 1) << QVector<qreal>{2, 4, 8, 16, 32, 64};
    QTest::newRow("a dot") << QSize(1, 1) << QVector<qreal>{2, 4};
    QTest::newRow("none") << QSize(0, 0) << QVector<qreal>{2, 4};
}

void TestZoom::factorsCoverTheView()
{
    QFETCH(QSize, photo);
    const QSizeF view(1000, 500);
    QTEST(zoom::factors(zoom::fittedSize(photo, view), view), "factors");
}

void TestZoom::panStopsAtTheEdges_data()
{
    QTest::addColumn<QPointF>("centre");
    QTest::addColumn<QPoint>("direction");
    QTest::addColumn<QSizeF>("drawn");
    QTest::addColumn<QPointF>("moved");
    const QPointF middle(0.5, 0.5);
    QTest::newRow("a third of the view")
        << middle << QPoint(1, 0) << QSizeF(3000, 1500) << QPointF(0.5 + 1.0 / 9, 0.5);
    QTest::newRow("right edge") << QPointF(0.8, 0.5) << QPoint(1, 0) << QSizeF(2000, 1000)
                                << QPointF(0.75, 0.5);
    QTest::newRow("top edge") << QPointF(0.5, 0.3) << QPoint(0, -1) << QSizeF(2000, 1000)
                              << QPointF(0.5, 0.25);
    QTest::newRow("nothing hidden above") << middle << QPoint(0, 1) << QSizeF(4000, 100) << middle;
    QTest::newRow("nothing at all") << middle << QPoint(1, 1) << QSizeF(0, 0) << middle;
}

void TestZoom::panStopsAtTheEdges()
{
    QFETCH(QPointF, centre);
    QFETCH(QPoint, direction);
    QFETCH(QSizeF, drawn);
    const QSizeF view(1000, 500);
    const QPointF moved = zoom::panned(centre, direction, drawn, view);
    QTEST(moved, "moved");
    const QRectF placed = zoom::placement(moved, drawn, view);
    QVERIFY(drawn.width() <= view.width() || placed.left() <= 0);
    QVERIFY(drawn.width() <= view.width() || placed.right() >= view.width());
}

void TestZoom::widthsToAskFor_data()
{
    QTest::addColumn<QSize>("photo");
    QTest::addColumn<qreal>("drawn");
    QTest::addColumn<int>("megabytes");
    QTest::addColumn<int>("width");
    QTest::newRow("as drawn") << QSize(6000, 4000) << 3000.0 << 96 << 3000;
    QTest::newRow("no more than there is") << QSize(1302, 953) << 3000.0 << 96 << 1302;
    QTest::newRow("no more than fits") << QSize(8000, 8000) << 8000.0 << 4 << 1000;
    QTest::newRow("panorama") << QSize(20000, 800) << 12000.0 << 100 << 12000;
    QTest::newRow("no size") << QSize(0, 0) << 3000.0 << 96 << 0;
}

void TestZoom::widthsToAskFor()
{
    QFETCH(QSize, photo);
    QFETCH(qreal, drawn);
    QFETCH(int, megabytes);
    QTEST(zoom::sourceWidth(photo, drawn, qint64(megabytes) * 1000000), "width");
}

void TestZoom::addresses()
{
    const QString url = "https://host/s12/photos/s1152/s3.jpg";
    QCOMPARE(zoom::addressForWidth(url, 3000), QString("https://host/s12/photos/s3000/s3.jpg"));
    QCOMPARE(zoom::addressForWidth(url, 0), url);
    for (const char *other : {"https://host/photos/a.jpg", "https://host/s12/x/a.jpg", ""})
        QCOMPARE(zoom::addressForWidth(other, 3000), QString(other));
}

void TestZoom::pageStarts_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<int>("number");
    QTest::addColumn<int>("start");
    QTest::newRow("first") << int(FEATURED_PHOTOS_LIST) << 1 << 1;
    QTest::newRow("last of a page") << int(FEATURED_PHOTOS_LIST) << 8 << 1;
    QTest::newRow("next page") << int(ALBUM_PHOTOS_LIST) << 9 << 9;
    QTest::newRow("beyond a hundred") << int(ALBUM_PHOTOS_LIST) << 103 << 97;
    QTest::newRow("end of a block") << int(SEARCH_PHOTOS_LIST) << 100 << 97;
    QTest::newRow("next block") << int(SEARCH_MORE_PHOTOS_LIST) << 108 << 101;
}

void TestZoom::pageStarts()
{
    QFETCH(int, type);
    QFETCH(int, number);
    QTEST(detailpaging::pageStart(type, number), "start");
}

void TestZoom::stripStarts_data()
{
    QTest::addColumn<int>("number");
    QTest::addColumn<int>("total");
    QTest::addColumn<int>("start");
    QTest::newRow("first") << 1 << 20 << 1;
    QTest::newRow("middle") << 10 << 20 << 8;
    QTest::newRow("last") << 20 << 20 << 16;
    QTest::newRow("short list") << 3 << 4 << 1;
    QTest::newRow("total not known") << 3 << 0 << 1;
}

void TestZoom::stripStarts()
{
    QFETCH(int, number);
    QFETCH(int, total);
    QTEST(detailpaging::stripStart(number, total, 5), "start");
    QCOMPARE(detailpaging::stripPlaces(448, 80, 8), 5);
    QCOMPARE(detailpaging::stripPlaces(431, 80, 8), 3);
    QCOMPARE(detailpaging::stripPlaces(10, 80, 8), 1);
}

QTEST_APPLESS_MAIN(TestZoom)
#include "tst_zoom.moc"
