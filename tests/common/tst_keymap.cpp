#include "common/ui/keymap.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"
#include "support/logcapture.h"

#include <QLineEdit>
#include <QTest>
#include <QWindow>

class tst_KeyMap : public QObject
{
    Q_OBJECT

    static QKeyEvent press(int key, const QString &text = QString(), quint32 scanCode = 0,
                           Qt::KeyboardModifiers modifiers = Qt::NoModifier)
    {
        return {QEvent::KeyPress, key, modifiers, scanCode, 0, 0, text};
    }

private slots:
    void shippedConfigurations()
    {
        const QHash<int, int> expected = {
            {Qt::Key_Return, DEVICE_SELECT_KEY},    {Qt::Key_Escape, DEVICE_RETURN_KEY},
            {Qt::Key_P, DEVICE_PLAY_KEY},           {Qt::Key_Up, DEVICE_UP_KEY},
            {Qt::Key_MediaPause, DEVICE_PAUSE_KEY}, {Qt::Key_X, Qt::Key_X},
        };
        LogCapture log;
        SystemConfig::setConfigFile(QStringLiteral(ORVALA_SOURCE_DIR "/config/desktop.ini"));
        const KeyMap desktop = KeyMap::fromConfiguration();
        for (auto pair = expected.cbegin(); pair != expected.cend(); ++pair)
            QCOMPARE(desktop.translate(press(pair.key())), pair.value());
        SystemConfig::setConfigFile(QStringLiteral(ORVALA_SOURCE_DIR "/config/device.ini"));
        const KeyMap device = KeyMap::fromConfiguration();
        QCOMPARE(device.translate(press(DEVICE_RETURN_KEY)), int(DEVICE_RETURN_KEY));
        QCOMPARE(device.translate(press(Qt::Key_Back)), int(DEVICE_RETURN_KEY));
        QVERIFY(LogCapture::lines().filter("KeyMap").isEmpty());
        SystemConfig::setConfigFile("/nowhere/config.ini");
        QVERIFY(KeyMap::fromConfiguration().isEmpty());
    }

    void namesAndScanCodes()
    {
        LogCapture log;
        const KeyMap map({{"NoSuchKey", "Select"},
                          {"F5", "NoSuchRemoteKey"},
                          {"scan:many", "Select"},
                          {QString(), "Select"},
                          {"scan:352", "Select"},
                          {"unknown", "Return"},
                          {"Media Stop", " pause "}});
        QCOMPARE(LogCapture::lines().size(), 4);
        QVERIFY(log.contains("KeyMap: unknown key NoSuchKey (for Select)"));
        QCOMPARE(map.translate(press(Qt::Key_F5)), int(Qt::Key_F5));
        QCOMPARE(map.translate(press(Qt::Key_unknown, {}, 352)), int(DEVICE_SELECT_KEY));
        QCOMPARE(map.translate(press(Qt::Key_unknown, {}, 353)), int(DEVICE_RETURN_KEY));
        QCOMPARE(map.translate(press(Qt::Key_MediaStop)), int(DEVICE_PAUSE_KEY));
    }

    void onlyTheKeyChanges()
    {
        const KeyMap map({{"P", "Play"}});
        const QKeyEvent event(QEvent::KeyRelease, Qt::Key_P, Qt::ShiftModifier, "P", true, 2);
        const QKeyEvent mapped = map.translated(event);
        QVERIFY(mapped.key() == DEVICE_PLAY_KEY && mapped.type() == QEvent::KeyRelease);
        QVERIFY(mapped.text() == "P" && mapped.isAutoRepeat());
        QCOMPARE(map.translate(press(Qt::Key_P, {}, 0, Qt::ControlModifier)), int(Qt::Key_P));
        QWindow window;
        QVERIFY(KeyMap::isFromPlatform(&window, &event));
        QVERIFY(!KeyMap::isFromPlatform(this, &event));
    }

    void typingReachesAFieldThatTakesText()
    {
        const KeyMap map({{"Q", "Exit"}, {"Backspace", "Return"}, {"Escape", "Return"}});
        QLineEdit field;
        field.show();
        field.activateWindow();
        QVERIFY(QTest::qWaitForWindowActive(&field));
        const QKeyEvent letter = press(Qt::Key_Q, "q");
        QCOMPARE(map.translate(letter), int(DEVICE_EXIT_KEY));
        KeyMap::setTakesText(&field);
        QCOMPARE(map.translate(letter), int(Qt::Key_Q));
        QCOMPARE(map.translate(press(Qt::Key_Backspace)), int(Qt::Key_Backspace));
        QCOMPARE(map.translate(press(Qt::Key_Escape, "\x1b")), int(DEVICE_RETURN_KEY));
    }
};

QTEST_MAIN(tst_KeyMap)
#include "tst_keymap.moc"
