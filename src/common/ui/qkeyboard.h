#pragma once

#include "common/ui/keyboardlayout.h"

#include <QFrame>
#include <QList>

class KeyButton;
class KeyboardPages;
class QBoxLayout;

// The field of 55 keys, one of which has the focus. The remote's arrow keys move the focus and its
// select key types. Page keys turn to capitals, signs and accents, as Page Up, Page Down and Red do
// from anywhere; a row above the keys tells which page is up. The keys' buttons never take the
// keyboard's focus: whoever has it hands its keys to handleKey().
class QKeyBoard : public QFrame
{
    Q_OBJECT

public:
    explicit QKeyBoard(QWidget *parent = nullptr);

    int focusIndex() const { return mFocusIndex; }
    void setFocusIndex(int index);

    KeyboardPage page() const { return mPage; }
    void setPage(KeyboardPage page);

    // Whether the key for a new line does anything; it is dimmed otherwise.
    void setNewLineEnabled(bool enabled);

    // False, with nothing done, for a key that the keyboard has no use for.
    bool handleKey(QKeyEvent *event);

signals:
    void textTyped(const QString &text);
    // One of the keys from CursorLeftKey on, but for SpaceKey, which types.
    void functionPressed(int key);

protected:
    void keyPressEvent(QKeyEvent *event) override;

private slots:
    void initInvariableStr();
    void updateFocusIndex(QKeyEvent *event);

private:
    void addRow(QBoxLayout *rows, int row);
    KeyButton *makeKey(int index);
    void press(int index);

    KeyboardPages *mPages;
    QList<KeyButton *> mKeys;
    int mFocusIndex = 0;
    KeyboardPage mPage = KeyboardPage::Small;
};
