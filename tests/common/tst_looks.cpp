#include "common/ui/picture.h"
#include "common/ui/scale.h"
#include "network/systemconfig.h"
#include "res/resources.h"

#include <QDirIterator>
#include <QGuiApplication>
#include <QRegularExpression>
#include <QScreen>
#include <QTemporaryFile>
#include <QTest>

#include <cmath>

// The pictures and the scale at which they are shown.
class tst_Looks : public QObject
{
    Q_OBJECT

    static QString path(const QString &name) { return QStringLiteral(":/res/%1.png").arg(name); }

    static qreal luminance(const QColor &colour)
    {
        const auto linear = [](qreal part) { return std::pow((part + 0.055) / 1.055, 2.4); };
        return 0.2126 * linear(colour.redF()) + 0.7152 * linear(colour.greenF()) +
               0.0722 * linear(colour.blueF());
    }
    // The least contrast of a colour with what is within the frame of a picture.
    static qreal contrast(const QImage &image, const QColor &colour)
    {
        qreal worst = 21;
        int top = 6;
        while (image.pixelColor(image.width() / 2, top - 6).alpha() < 255)
            ++top;
        for (int y = top; y < image.height() - top; ++y) {
            const qreal one = luminance(image.pixelColor(image.width() / 2, y)) + 0.05;
            const qreal other = luminance(colour) + 0.05;
            worst = qMin(worst, qMax(one, other) / qMin(one, other));
        }
        return worst;
    }

private slots:
    void initTestCase() { initResources(); }

    void everyNameInTheCodeExists()
    {
        const QRegularExpression name(QStringLiteral(":/res/[A-Za-z0-9_]+\\.png"));
        QDirIterator sources(QStringLiteral(ORVALA_SOURCE_DIR "/src"), {QStringLiteral("*.cpp")},
                             QDir::Files, QDirIterator::Subdirectories);
        while (sources.hasNext()) {
            QFile file(sources.next());
            QVERIFY(file.open(QIODevice::ReadOnly));
            auto found = name.globalMatch(QString::fromUtf8(file.readAll()));
            while (found.hasNext())
                QVERIFY2(!QImage(found.next().captured()).isNull(), qPrintable(file.fileName()));
        }
    }

    // The style sheets fix these text colours; the frame of a focused one is told by brightness.
    void textAndFocusStandOut_data()
    {
        QTest::addColumn<QColor>("colour");
        for (const char *name : {"PopUpMenu_Title_Bg", "PopUpMenu_Content_Bg", "Button_Normal",
                                 "Button_Focus", "InputBox_Normal", "InputBox_Focus", "FocusBar",
                                 "KeyBoard_Bg_Normal", "KeyBoard_Bg_Focus", "orvala_background"})
            QTest::newRow(name) << QColor(Qt::white);
        for (const char *name : {"ToastWin_Bg", "TopBarBg_Selected"})
            QTest::newRow(name) << QColor(Qt::black);
        QTest::newRow("TopBarBg_Focus") << QColor("green");
        QTest::newRow("SignOut_Bg") << QColor(7, 99, 170);
    }
    void textAndFocusStandOut()
    {
        QFETCH(QColor, colour);
        const QString name = QString::fromLatin1(QTest::currentDataTag());
        const QImage image(path(name));
        QVERIFY(contrast(image, colour) >= 4.5);
        if (name.contains(QLatin1String("Focus")) && !name.startsWith(QLatin1String("TopBar")))
            QVERIFY(contrast(image, image.pixelColor(1, image.height() / 2)) >= 3);
    }

    void scaleFactors()
    {
        QCOMPARE(scaleFor(1, {3840, 2160}), 1.0);
        QCOMPARE(scaleFor(2.5, {1280, 720}), 2.5);
        QCOMPARE(scaleFor(0, {1920, 1080}), 1.5);
        QCOMPARE(scaleFor(0, {3840, 2160}), 3.0);
        QCOMPARE(scaleFor(0, {1024, 768}), 0.8);
        QCOMPARE(scaleFor(0, {0, 0}), 1.0);
        QCOMPARE(scaleFor(50, {1280, 720}), 8.0);
    }

    void onlyTheKeyScalesTheScreen()
    {
        const QSize plain = qGuiApp->primaryScreen()->size();
        SystemConfig::setConfigFile(QStringLiteral("/nowhere/config.ini"));
        applyScale();
        QCOMPARE(qGuiApp->primaryScreen()->size(), plain);
        QTemporaryFile file;
        QVERIFY(file.open());
        file.write("[Layout]\nScale=1.5\n");
        file.close();
        SystemConfig::setConfigFile(file.fileName());
        applyScale();
        QCOMPARE(qGuiApp->primaryScreen()->size(), (QSizeF(plain) / 1.5).toSize());
        QCOMPARE(SystemConfig::scale(), 1.5);

        const QPixmap logo = loadPicture(path(QStringLiteral("orvala_icon_big")));
        QCOMPARE(logo.devicePixelRatio(), 1.5);
        QCOMPARE(logo.size(), QSize(354, 96));
        QVERIFY(loadPicture(path(QStringLiteral("none"))).isNull());
    }
};

QTEST_MAIN(tst_Looks)
#include "tst_looks.moc"
