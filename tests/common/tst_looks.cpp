#include "common/ui/picture.h"
#include "common/ui/scale.h"
#include "common/ui/screenbackground.h"
#include "res/resources.h"
#include "support/testconfig.h"

#include <QDirIterator>
#include <QGuiApplication>
#include <QRegularExpression>
#include <QScreen>
#include <QTest>

// The pictures and the scale at which they are shown.
class tst_Looks : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase() { initResources(); }

    void everyNameInTheCodeExists()
    {
        const QRegularExpression name(":/res/[A-Za-z0-9_]+\\.png");
        QDirIterator sources(QStringLiteral(ORVALA_SOURCE_DIR "/src"), {"*.cpp"}, QDir::Files,
                             QDirIterator::Subdirectories);
        while (sources.hasNext()) {
            QFile file(sources.next());
            QVERIFY(file.open(QIODevice::ReadOnly));
            auto found = name.globalMatch(QString::fromUtf8(file.readAll()));
            while (found.hasNext())
                QVERIFY2(!QImage(found.next().captured()).isNull(), qPrintable(file.fileName()));
        }
    }

    void backgroundAtAnySize_data()
    {
        QTest::addColumn<QSize>("size");
        QTest::newRow("dot") << QSize(1, 1);
        QTest::newRow("smaller") << QSize(70, 41);
        QTest::newRow("screen") << QSize(1281, 719);
    }

    void backgroundAtAnySize()
    {
        QFETCH(QSize, size);
        const QImage shown = screenBackground(size).toImage();
        QCOMPARE(shown.size(), size);
        const QImage expected =
            QImage(":/res/orvala_background.png").scaled(size, Qt::IgnoreAspectRatio);
        for (int y = 0; y < size.height(); ++y) {
            for (int x = 0; x < size.width(); ++x) {
                const QColor found = shown.pixelColor(x, y), wanted = expected.pixelColor(x, y);
                QVERIFY(qAbs(found.red() - wanted.red()) < 3);
                QVERIFY(qAbs(found.green() - wanted.green()) < 3);
                QVERIFY(qAbs(found.blue() - wanted.blue()) < 3);
            }
        }
    }

    void scaleFactors()
    {
        QCOMPARE(scaleFor(2.5, {3840, 2160}), 2.5);
        QCOMPARE(scaleFor(0, {1920, 1080}), 1.5);
        QCOMPARE(scaleFor(0, {1024, 768}), 0.8);
        QCOMPARE(scaleFor(0, {0, 0}), 1.0);
        QCOMPARE(scaleFor(50, {1280, 720}), 8.0);
    }

    void onlyTheKeyScalesTheScreen()
    {
        const QSize plain = qGuiApp->primaryScreen()->size();
        SystemConfig::setConfigFile("/nowhere/config.ini");
        applyScale();
        QCOMPARE(qGuiApp->primaryScreen()->size(), plain);
        const TestConfig config("[Layout]\nScale=1.5\n");
        applyScale();
        QCOMPARE(qGuiApp->primaryScreen()->size(), (QSizeF(plain) / 1.5).toSize());
        QCOMPARE(SystemConfig::scale(), 1.5);

        const QPixmap logo = loadPicture(":/res/orvala_icon_big.png");
        QCOMPARE(logo.devicePixelRatio(), 1.5);
        QCOMPARE(logo.size(), QSize(354, 96));
        QVERIFY(loadPicture(":/res/none.png").isNull());
    }
};

QTEST_MAIN(tst_Looks)
#include "tst_looks.moc"
