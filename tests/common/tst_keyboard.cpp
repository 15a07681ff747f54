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

    static QString emoji()
    {
        return QStringLiteral(u"👨‍👩‍👧");
    } // eight units, one character

private slots:
    void initTestCase()
    {
        initResources();
        SystemConfig::mScreen_Width = 1280;
        SystemConfig::mScreen_Height = 720;
    }

    void typingByTheRemoteAlone_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<bool>("isPassword");
        QTest::addColumn<int>("mostPresses"); // for each character
        QTest::newRow("address") << QStringLiteral("größe.tv+photos_2@example.org") << false << 8;
        QTest::newRow("password") << QStringLiteral("Tr0ub4dor&3 {Zy}\"$") << true << 12;
    }

    void typingByTheRemoteAlone()
    {
        QFETCH(QString, text);
        QFETCH(bool, isPassword);
        QFETCH(int, mostPresses);
        QWidget form;
        QKeyBoardInput input(&form);
        input.setMultiLine(false);
        input.setInputMode(isPassword);
        QSignalSpy finished(&input, &QKeyBoardInput::inputFinished);
        KeyRobot robot(&form);
        QVERIFY(robot.type(text));
        QCOMPARE(robot.box()->toPlainText(),
                 isPassword ? QString(text.size() - 1, QLatin1Char('*')) + text.right(1) : text);
        QVERIFY2(robot.presses() <= mostPresses * text.size(),
                 qPrintable(QString::number(robot.presses())));
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
        QString wanted = QStringLiteral("0123456789+ ,._@*:;?!#$%&`()-/<=>[]\\^'{}|~\"");
        for (char letter = 'a'; letter <= 'z'; ++letter)
            wanted += QLatin1Char(letter) + QString(QLatin1Char(letter)).toUpper();
        wanted += QStringLiteral(u"äöüßéèàçñøåÄÖÜÉ");
        for (QChar character : wanted)
            QVERIFY2(texts.contains(character), qPrintable(QString(character)));
        for (const char *text : {":)", ":(", ":D", "www.", ".com"})
            QVERIFY2(texts.contains(QString::fromLatin1(text)), text);
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
        QVERIFY(robot.type(QStringLiteral("ac\nd")));
        robot.press(CursorUpKey);
        robot.press(CursorLeftKey);
        robot.press(CursorRightKey);
        robot.press(9); // the cursor stood behind the first letter
        QCOMPARE(input.text(), QStringLiteral("a1c\nd"));
        robot.press(CursorDownKey);
        robot.press(DeleteKey);
        robot.remote(DEVICE_CLEAR_KEY);
        QCOMPARE(input.text(), QStringLiteral("a1c"));
        robot.remote(DEVICE_PRE_KEY);
        robot.remote(DEVICE_CLEAR_KEY);
        QCOMPARE(input.text(), QStringLiteral("ac"));
        input.setMultiLine(false);
        robot.press(NewLineKey);
        QCOMPARE(input.text(), QStringLiteral("ac"));
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
        QCOMPARE(typed.size(), 3);
        QCOMPARE(typed.at(0).first().toString(), QStringLiteral("A"));
        QCOMPARE(typed.at(1).first().toString(), QStringLiteral("?"));
        QCOMPARE(typed.at(2).first().toString(), QStringLiteral("A"));
        keyboard.setPage(KeyboardPage::Symbols);
        const auto buttons = keyboard.findChildren<QPushButton *>();
        QCOMPARE(buttons.size(), kKeyCount);
        QCOMPARE(buttons.at(8)->text(), QStringLiteral("&&"));
    }

    void realKeyboard()
    {
        QKeyBoardInput input;
        QSignalSpy finished(&input, &QKeyBoardInput::inputFinished);
        KeyRobot robot(&input);
        pressKey(robot.box(), Qt::Key_Q, QStringLiteral("q"));
        pressKey(robot.box(), Qt::Key_Odiaeresis, QStringLiteral(u"ö"));
        pressKey(robot.box(), Qt::Key_Backspace, QStringLiteral("\b"));
        pressKey(robot.box(), Qt::Key_7); // a remote's
        pressKey(robot.box(), Qt::Key_F5);
        robot.remote(DEVICE_SELECT_KEY); // the keyboard's own Enter
        QCOMPARE(finished.size(), 1);
        QCOMPARE(finished.first().first().toString(), QStringLiteral("q7"));
    }

    // The box is changed by others, while it shows asterisks.
    void changesInTheMiddle_data()
    {
        QTest::addColumn<bool>("isPassword");
        QTest::newRow("plain") << false;
        QTest::newRow("password") << true;
    }

    void changesInTheMiddle()
    {
        QFETCH(bool, isPassword);
        QKeyBoardInput input;
        input.setInputMode(isPassword);
        input.setText(QStringLiteral("ab") + emoji() + QStringLiteral("*d"));
        KeyRobot robot(&input);
        QTextCursor cursor = robot.box()->textCursor();
        cursor.setPosition(1);
        cursor.insertText(QStringLiteral("*"));
        QCOMPARE(input.text(), QStringLiteral("a*b") + emoji() + QStringLiteral("*d"));
        cursor.setPosition(0);
        cursor.setPosition(2, QTextCursor::KeepAnchor);
        robot.box()->setTextCursor(cursor);
        robot.press(9); // replaces the selection
        QCOMPARE(input.text(), QStringLiteral("1b") + emoji() + QStringLiteral("*d"));
        robot.remote(DEVICE_NEXT_KEY);
        robot.remote(DEVICE_NEXT_KEY);
        robot.press(DeleteKey); // the whole family
        QCOMPARE(input.text(), QStringLiteral("1b*d"));
        robot.box()->setPlainText(QStringLiteral("new"));
        QCOMPARE(input.text(), QStringLiteral("new"));
        input.setInputMode(false);
        QCOMPARE(robot.box()->toPlainText(), QStringLiteral("new"));
    }

    void boundsOfTheText()
    {
        QKeyBoardInput input;
        input.setMultiLine(false);
        input.setText(QStringLiteral("a\r\nb\tc") + QString(20000, QLatin1Char('x')));
        QCOMPARE(input.text().size(), 10000);
        QVERIFY(input.text().startsWith(QStringLiteral("a bcx")));
        KeyRobot robot(&input);
        robot.press(9);
        QCOMPARE(input.text().size(), 10000);
    }
};

QTEST_MAIN(tst_Keyboard)
#include "tst_keyboard.moc"
