#include "base/i18n.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"
#include "data/testconfig.h"
#include "res/resources.h"
#include "ui/titleicon.h"
#include "ui/upwidget.h"

#include <QtTest>

// The small widgets around the screens.
class TestHints : public QObject
{
    Q_OBJECT

private slots:
    void theIndicatorTicksOnlyWhenSeen();
    void theIndicatorTurns();
    void hintsFollowTheState();
    void theMenusMark();
    void theMenusMarkIsNotColourAlone();
    void longNamesAreCut();

private:
    TestConfig mConfig;
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
    bar.showOnly({DEVICE_PAGEDOWN_KEY, DEVICE_RED_KEY});
    QVERIFY(!bar.isShown(DEVICE_PAGEUP_KEY));
    QVERIFY(bar.isShown(DEVICE_PAGEDOWN_KEY));
    QVERIFY(!bar.isShown(DEVICE_RED_KEY));
    bar.setShown(DEVICE_PAGEUP_KEY, true);
    QVERIFY(bar.isShown(DEVICE_PAGEUP_KEY));
}

void TestHints::theMenusMark()
{
    UpWidget menu;
    const auto press = [&menu](int key, int times) {
        for (int i = 0; i < times; ++i)
            QTest::sendKeyEvent(QTest::Press, &menu, Qt::Key(key), QString(), {});
        return menu.focusIndex();
    };
    QCOMPARE(press(DEVICE_LEFT_KEY, 1), 0);
    QCOMPARE(press(DEVICE_RIGHT_KEY, 6), 4);
    QCOMPARE(press(DEVICE_LEFT_KEY, 3), 1);
    press(DEVICE_SELECT_KEY, 1);
    QCOMPARE(press(DEVICE_RIGHT_KEY, 1), 2);
    // Whoever comes back finds the mark on the entry whose list is shown.
    QFocusEvent out(QEvent::FocusOut), in(QEvent::FocusIn);
    QCoreApplication::sendEvent(&menu, &out);
    QCoreApplication::sendEvent(&menu, &in);
    QCOMPARE(menu.focusIndex(), 1);
    press(DEVICE_RIGHT_KEY, 3);
    press(DEVICE_SELECT_KEY, 1);
    menu.cancelSignOut();
    QCOMPARE(menu.selectedIndex(), 1);
    QCOMPARE(menu.focusIndex(), 1);
}

void TestHints::theMenusMarkIsNotColourAlone()
{
    initResources();
    for (bool signOut : {false, true}) {
        TitleIcon entry("Home", signOut);
        const auto grey = [&entry](TitleIcon::Look look) {
            entry.setLook(look);
            return entry.grab().toImage().convertToFormat(QImage::Format_Grayscale8);
        };
        const QImage plain = grey(TitleIcon::Look::Normal);
        const QImage marked = grey(TitleIcon::Look::Focused);
        int changed = 0;
        for (int i = 0; i < plain.width() * plain.height(); ++i) {
            const QPoint place(i % plain.width(), i / plain.width());
            changed += qAbs(qGray(plain.pixel(place)) - qGray(marked.pixel(place))) > 60;
        }
        QVERIFY(changed > plain.width() * plain.height() / 20);
    }
}

void TestHints::longNamesAreCut()
{
    UpWidget menu;
    menu.setUserName("<b>Al</b>\nB");
    QCOMPARE(menu.shownUserName(), QString("<b>Al</b> B"));
    menu.setUserName(QString(100000, 'W'));
    QVERIFY(menu.shownUserName().size() < 40);
}

QTEST_MAIN(TestHints)
#include "tst_hints.moc"
