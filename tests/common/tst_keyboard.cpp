#include "common/keyrobot.h"
#include "common/ui/qkeyboardinput.h"
#include "network/systemconfig.h"
#include "res/resources.h"

#include <QPushButton>
#include <QSet>
#include <QSignalSpy>
#include <QTest>

class tst_Keyboard : public QObject
{
    Q_OBJECT

    const QString mFamily = "👨‍👩‍👧"; // eight units, one character

    static void addModes()
    {
        QTest::addColumn<bool>("isPassword");
        QTest::newRow("plain") << false;
        QTest::newRow("password") << true;
    }

private slots:
    void initTestCase()
    {
        initResources();
        SystemConfig::mScreen_Width = 1280;
        SystemConfig::mScreen_Height = 720;
    }

    void typingByTheRemoteAlone_data() { addModes(); }
    void typingByTheRemoteAlone()
    {
        QFETCH(bool, isPassword);
        const QString text = isPassword ? "Tr0ub4dor&3 {Zy}\"$" : "größe.tv+photos_2@example.org";
        const int mostPresses = isPassword ? 12 : 8; // for each character
        QWidget form;
        QKeyBoardInput input(&form);
        input.setMultiLine(false);
        input.setInputMode(isPassword);
        QSignalSpy finished(&input, &QKeyBoardInput::inputFinished);
        KeyRobot robot(&form);
        QVERIFY(robot.type(text));
        QCOMPARE(robot.box()->toPlainText(),
                 isPassword ? QString(text.size() - 1, QLatin1Char('*')) + text.right(1) : text);
        QVERIFY(robot.presses() <= mostPresses * text.size());
        robot.press(EnterKey);
        QCOMPARE(finished.size(), 1);
        QCOMPARE(finished.first().first().toString(), text);
        QTRY_COMPARE(robot.box()->toPlainText().count(QLatin1Char('*')),
                     isPassword ? text.size() : 0);
    }

    void everyCharacterCanBeTyped()
    {
        QSet<QString> texts;
        for (int key = 0; key < kKeyCount; ++key) {
            for (int page = 0; page < kPageCount; ++page)
                texts << keyText(KeyboardPage(page), key);
        }
        QString wanted = "0123456789+ ,._@*:;?!#$%&`()-/<=>[]\\^'{}|~\"";
        for (char letter = 'a'; letter <= 'z'; ++letter)
            wanted += QLatin1Char(letter) + QString(QLatin1Char(letter)).toUpper();
        wanted += "äöüßéèàçñøåÄÖÜÉ";
        for (QChar character : wanted)
            QVERIFY2(texts.contains(character), qPrintable(QString(character)));
    }

    // Sideways around the row, up and down to the nearest key there is.
    void arrowsStayOnTheKeyboard()
    {
        for (int key = 0; key < kKeyCount; ++key) {
            QCOMPARE(movedKeyFocus(movedKeyFocus(key, Qt::Key_Left), Qt::Key_Right), key);
            const int up = movedKeyFocus(key, Qt::Key_Up);
            const int down = movedKeyFocus(key, Qt::Key_Down);
            QVERIFY(up >= 0 && up <= key && down >= key && down < kKeyCount);
            QVERIFY(qAbs(movedKeyFocus(up, Qt::Key_Down) - key) <= 1 || up == key);
            QVERIFY(qAbs(movedKeyFocus(down, Qt::Key_Up) - key) <= 1 || down == key);
        }
    }

    void functionKeys()
    {
        QKeyBoardInput input;
        QSignalSpy returned(&input, &QKeyBoardInput::returnClicked);
        KeyRobot robot(&input);
        QVERIFY(robot.type("ac\nd"));
        robot.press(CursorUpKey);
        robot.press(CursorLeftKey);
        robot.press(CursorRightKey);
        robot.press(9); // the cursor stood behind the first letter
        QCOMPARE(input.text(), "a1c\nd");
        robot.press(CursorDownKey);
        robot.press(DeleteKey);
        robot.remote(DEVICE_CLEAR_KEY);
        QCOMPARE(input.text(), "a1c");
        robot.remote(DEVICE_PRE_KEY);
        robot.remote(DEVICE_CLEAR_KEY);
        QCOMPARE(input.text(), "ac");
        input.setMultiLine(false);
        robot.press(NewLineKey);
        QCOMPARE(input.text(), "ac");
        robot.remote(DEVICE_RETURN_KEY);
        QCOMPARE(returned.size(), 1);
    }

    void pagesByTheRemotesShortCuts()
    {
        QKeyBoard keyboard;
        QSignalSpy typed(&keyboard, &QKeyBoard::textTyped);
        for (int key : {int(DEVICE_RED_KEY), int(DEVICE_SELECT_KEY), int(DEVICE_PAGEDOWN_KEY),
                        int(DEVICE_SELECT_KEY), int(DEVICE_PAGEUP_KEY), int(DEVICE_SELECT_KEY)})
            pressKey(&keyboard, key);
        QKeyEvent held(QEvent::KeyPress, DEVICE_SELECT_KEY, Qt::NoModifier, QString(), true);
        QApplication::sendEvent(&keyboard, &held);
        QStringList texts;
        for (const QVariantList &arguments : typed)
            texts << arguments.first().toString();
        QCOMPARE(texts, QStringList({"A", "?", "A"}));
        keyboard.setPage(KeyboardPage::Symbols);
        const auto buttons = keyboard.findChildren<QPushButton *>();
        QCOMPARE(buttons.size(), kKeyCount);
        QCOMPARE(buttons.at(8)->text(), "&&");
    }

    void realKeyboard()
    {
        QKeyBoardInput input;
        QSignalSpy finished(&input, &QKeyBoardInput::inputFinished);
        KeyRobot robot(&input);
        pressKey(robot.box(), Qt::Key_Q, "q");
        pressKey(robot.box(), Qt::Key_Odiaeresis, "ö");
        pressKey(robot.box(), Qt::Key_Backspace, "\b");
        pressKey(robot.box(), Qt::Key_7); // a remote's
        pressKey(robot.box(), Qt::Key_F5);
        robot.remote(DEVICE_SELECT_KEY); // the keyboard's own Enter
        QCOMPARE(finished.size(), 1);
        QCOMPARE(finished.first().first().toString(), "q7");
    }

    // The box is changed by others, while it shows asterisks.
    void changesInTheMiddle_data() { addModes(); }
    void changesInTheMiddle()
    {
        QFETCH(bool, isPassword);
        QKeyBoardInput input;
        input.setInputMode(isPassword);
        input.setText("ab" + mFamily + "*d");
        KeyRobot robot(&input);
        QTextCursor cursor = robot.box()->textCursor();
        cursor.setPosition(1);
        cursor.insertText("*");
        QCOMPARE(input.text(), "a*b" + mFamily + "*d");
        cursor.setPosition(0);
        cursor.setPosition(2, QTextCursor::KeepAnchor);
        robot.box()->setTextCursor(cursor);
        robot.press(9); // replaces the selection
        QCOMPARE(input.text(), "1b" + mFamily + "*d");
        robot.remote(DEVICE_NEXT_KEY);
        robot.remote(DEVICE_NEXT_KEY);
        robot.press(DeleteKey); // the whole family
        QCOMPARE(input.text(), "1b*d");
        robot.box()->setPlainText("new");
        QCOMPARE(input.text(), "new");
        input.setInputMode(false);
        QCOMPARE(robot.box()->toPlainText(), "new");
    }

    void boundsOfTheText()
    {
        QKeyBoardInput input;
        input.setMultiLine(false);
        input.setText(QStringLiteral("a\r\nb\tc") + QString(20000, QLatin1Char('x')));
        QCOMPARE(input.text().size(), 10000);
        QVERIFY(input.text().startsWith("a bcx"));
        KeyRobot robot(&input);
        robot.press(9);
        QCOMPARE(input.text().size(), 10000);
    }
};

QTEST_MAIN(tst_Keyboard)
#include "tst_keyboard.moc"
