#include "ui/zoom.h"

#include <QtTest>

namespace {

const QSizeF kView(1000, 500);

QVector<qreal> factorsOf(int width, int height)
{
    return zoom::factors(zoom::fittedSize(QSize(width, height), kView), kView);
}

} // namespace

class TestZoom : public QObject
{
    Q_OBJECT

private slots:
    void factorsCoverTheView();
    void panStopsAtTheEdges();
    void picturesToAskFor();
    void proportions();
};

void TestZoom::factorsCoverTheView()
{
    using Factors = QVector<qreal>;
    QCOMPARE(factorsOf(4000, 3000), Factors({2, 4}));
    QCOMPARE(factorsOf(16000, 500), Factors({2, 4, 8, 16}));
    QCOMPARE(factorsOf(500, 4000), Factors({2, 4, 8, 16}));
    QCOMPARE(factorsOf(9000, 1000), Factors({2, 4.5}));
    QCOMPARE(factorsOf(100000, 1), Factors({2, 4, 8, 16, 32, 64}));
    QCOMPARE(factorsOf(0, 0), Factors({2, 4}));
}

void TestZoom::panStopsAtTheEdges()
{
    const auto panned = [](const QPointF &centre, const QPoint &direction, const QSizeF &drawn) {
        return zoom::panned(centre, direction, drawn, kView);
    };
    const QPointF middle(0.5, 0.5);
    QCOMPARE(panned(middle, {1, 0}, {3000, 1500}), QPointF(0.5 + 1.0 / 9, 0.5)); // a third
    QCOMPARE(panned({0.8, 0.5}, {1, 0}, {2000, 1000}), QPointF(0.75, 0.5));
    QCOMPARE(panned({0.5, 0.3}, {0, -1}, {2000, 1000}), QPointF(0.5, 0.25));
    QCOMPARE(panned(middle, {0, 1}, {4000, 100}), middle); // nothing is hidden above
    QCOMPARE(panned(middle, {1, 1}, {0, 0}), middle);
    QCOMPARE(zoom::placement({0.75, 0.5}, {2000, 1000}, kView), QRectF(-1000, -250, 2000, 1000));
}

void TestZoom::picturesToAskFor()
{
    constexpr qint64 megabyte = 1000000;
    QCOMPARE(zoom::sourceWidth({6000, 4000}, 3000, 96 * megabyte), 3000);
    QCOMPARE(zoom::sourceWidth({1302, 953}, 3000, 96 * megabyte), 1302); // there is no more
    QCOMPARE(zoom::sourceWidth({8000, 8000}, 8000, 4 * megabyte), 1000); // no more fits
    QCOMPARE(zoom::sourceWidth({0, 0}, 3000, 96 * megabyte), 0);

    const QString url = "https://host/s12/photos/s1152/s3.jpg";
    QCOMPARE(zoom::addressForWidth(url, 3000), QString("https://host/s12/photos/s3000/s3.jpg"));
    QCOMPARE(zoom::addressForWidth(url, 0), url);
    for (const char *other : {"https://host/photos/a.jpg", "https://host/s12/x/a.jpg", ""})
        QCOMPARE(zoom::addressForWidth(other, 3000), QString(other));
}

void TestZoom::proportions()
{
    QVERIFY(zoom::areAlike({4000, 3000}, {1180, 885}));
    QVERIFY(zoom::areAlike({20000, 40}, {1180, 2})); // rounded
    QVERIFY(!zoom::areAlike({4000, 3000}, {885, 1180}));
    QVERIFY(!zoom::areAlike({4000, 3000}, {885, 885}));
    QVERIFY(!zoom::areAlike({0, 0}, {885, 885}));
}

QTEST_APPLESS_MAIN(TestZoom)
#include "tst_zoom.moc"
