#include "app/fontsetup.h"

#include <QGlyphRun>
#include <QRawFont>
#include <QTextLayout>
#include <QtTest>

class TestFonts : public QObject
{
    Q_OBJECT

    static QList<QGlyphRun> glyphs(const QString &text)
    {
        QTextLayout layout(text, QFont(QStringLiteral("Inter")));
        layout.beginLayout();
        layout.createLine();
        layout.endLayout();
        return layout.glyphRuns();
    }

public:
    static void initMain()
    {
        FontSetup fonts;
        fonts.finish();
    }

private slots:
    // Captions come in any of them.
    void everyScriptHasAFont_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("family");
        const auto row = [](const char *name, const char *text, const char *family = "") {
            QTest::newRow(name) << QString::fromUtf8(text) << family;
        };
        row("Latin", "Żółć Größe Đặng", "Inter");
        row("Greek and Cyrillic", "Ελληνικά Привет", "Inter");
        row("right to left", "שלום عالم");
        row("South and South-East Asia", "नमस्ते தமிழ் বাংলা สวัสดี ខ្មែរ");
        row("Chinese and Japanese", "你好世界かな");
        row("Korean", "한국어");
        row("Caucasus and Ethiopia", "ქართული Հայերեն አማርኛ");
        row("smileys", "😀🌼🐶", "Noto Color Emoji");
    }

    void everyScriptHasAFont()
    {
        QFETCH(QString, text);
        QFETCH(QString, family);
        for (const QGlyphRun &run : glyphs(text)) {
            QVERIFY2(!run.glyphIndexes().contains(0), qPrintable(run.rawFont().familyName()));
            if (!family.isEmpty())
                QCOMPARE(run.rawFont().familyName(), family);
        }
    }
};

QTEST_MAIN(TestFonts)
#include "tst_fonts.moc"
