#pragma once

#include "common/ui/qkeyboard.h"
#include "common/ui/remotekeys.h"

#include <QApplication>
#include <QKeyEvent>
#include <QPlainTextEdit>

inline void pressKey(QWidget *widget, int key, const QString &text = QString())
{
    QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier, text);
    QApplication::sendEvent(widget, &press);
}

// Types on the on-screen keyboard below a widget by the remote's keys alone, sent to the text box
// as its focus widget, on the shortest way from key to key.
class KeyRobot
{
public:
    explicit KeyRobot(QWidget *form)
        : mKeyboard(form->findChild<QKeyBoard *>())
        , mBox(form->findChild<QPlainTextEdit *>())
    {
    }

    QPlainTextEdit *box() const { return mBox; }
    int presses() const { return mPresses; }

    // One press of a key of the remote.
    void remote(int key)
    {
        ++mPresses;
        pressKey(mBox, key);
    }

    // Goes to the key of that number and presses it.
    void press(int index)
    {
        for (int arrow : wayTo(index))
            remote(arrow);
        remote(DEVICE_SELECT_KEY);
    }

    // False for a text with a character that no page has.
    bool type(const QString &text)
    {
        for (uint character : text.toUcs4()) {
            if (!typeCharacter(QString::fromUcs4(&character, 1)))
                return false;
        }
        return true;
    }

private:
    bool typeCharacter(const QString &character)
    {
        if (character == QLatin1String("\n")) {
            press(NewLineKey);
            return true;
        }
        for (int turns = 0; turns < kPageCount; ++turns) {
            const KeyboardPage page = turnedPage(mKeyboard->page(), turns);
            const int key = keyOf(page, character);
            if (key < 0)
                continue;
            while (mKeyboard->page() != page)
                press(LettersKey + int(page) / 2);
            press(key);
            return true;
        }
        return false;
    }

    static int keyOf(KeyboardPage page, const QString &character)
    {
        for (int i = 0; i < kKeyCount; ++i) {
            if (keyText(page, i) == character)
                return i;
        }
        return -1;
    }

    QList<int> wayTo(int target) const
    {
        QList<int> open{mKeyboard->focusIndex()};
        QHash<int, QList<int>> ways{{open.first(), {}}};
        while (!ways.contains(target)) {
            const int from = open.takeFirst();
            for (int arrow : {Qt::Key_Left, Qt::Key_Right, Qt::Key_Up, Qt::Key_Down}) {
                const int to = movedKeyFocus(from, arrow);
                if (ways.contains(to))
                    continue;
                ways[to] = ways.value(from) + QList<int>{arrow};
                open << to;
            }
        }
        return ways.value(target);
    }

    QKeyBoard *mKeyboard;
    QPlainTextEdit *mBox;
    int mPresses = 0;
};
