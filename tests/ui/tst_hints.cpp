#include "base/i18n.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"

#include <QtTest>

// The small widgets around the screens.
class TestHints : public QObject
{
    Q_OBJECT

private slots:
    void theIndicatorTicksOnlyWhenSeen();
    void theIndicatorTurns();
    void hintsFollowTheState();
};

void TestHints::theIndicatorTicksOnlyWhenSeen()
{
    QProgressIndicator indicator;
    indicator.startAnimation();
    QVERIFY(indicator.isAnimated());
    QVERIFY(!indicator.isTicking());
    indicator.show();
    QVERIFY(indicator.isTicking());
    indicator.hide();
    QVERIFY(!indicator.isTicking());
    indicator.show();
    indicator.setAnimationDelay(1000);
    QVERIFY(indicator.isTicking());
    indicator.stopAnimation();
    QVERIFY(!indicator.isTicking());
}

void TestHints::theIndicatorTurns()
{
    QProgressIndicator indicator;
    indicator.resize(96, 96);
    indicator.setAnimationDelay(1);
    indicator.show();
    const QImage stopped = indicator.grab().toImage();
    indicator.startAnimation();
    const QImage first = indicator.grab().toImage();
    QVERIFY(first != stopped);
    QTRY_VERIFY(indicator.grab().toImage() != first);
    indicator.setDisplayedWhenStopped(true);
    indicator.stopAnimation();
    QVERIFY(indicator.grab().toImage() != stopped);
}

void TestHints::hintsFollowTheState()
{
    ShortcutBar bar;
    bar.addEntry(DEVICE_PAGEUP_KEY, I18n::shortCut(0));
    bar.addEntry(DEVICE_PAGEDOWN_KEY, I18n::shortCut(1));
    bar.addEntry(DEVICE_CLEAR_KEY, "<b>no picture</b>");
    QVERIFY(bar.isShown(DEVICE_PAGEUP_KEY));
    QCOMPARE(bar.text(DEVICE_PAGEDOWN_KEY), QString("Page Down"));
    bar.showOnly({DEVICE_PAGEDOWN_KEY, DEVICE_RED_KEY});
    QVERIFY(!bar.isShown(DEVICE_PAGEUP_KEY));
    QVERIFY(bar.isShown(DEVICE_PAGEDOWN_KEY));
    QVERIFY(!bar.isShown(DEVICE_RED_KEY));
    bar.setShown(DEVICE_PAGEUP_KEY, true);
    QVERIFY(bar.isShown(DEVICE_PAGEUP_KEY));
    bar.setText(DEVICE_PAGEUP_KEY, "Back");
    QCOMPARE(bar.text(DEVICE_PAGEUP_KEY), QString("Back"));
}

QTEST_MAIN(TestHints)
#include "tst_hints.moc"
