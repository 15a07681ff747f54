#pragma once

#include <QFrame>
#include <QList>

class QHBoxLayout;
class QLabel;
class PictureButton;
class QPushButton;

// The panel of a dialog: a title bar, a message and a row of buttons, of which one carries the mark
// of focus. Texts of any length and script stay inside: the panel is three fifths of the screen
// wide and grows with its message up to a limit. Which key moves the mark is the dialog's business;
// the buttons never take the keyboard's focus themselves.
class DialogPanel : public QFrame
{
    Q_OBJECT

public:
    // The style sheets of a button with and without the mark.
    struct ButtonStyles
    {
        QString focused;
        QString normal;
    };

    DialogPanel(const ButtonStyles &styles, QWidget *parent);

    void setTitle(const QString &title);
    void setMessage(const QString &message);
    QFont messageFont() const;
    // The last row of the panel, filled from the left; the first button carries the mark.
    QPushButton *addButton(const QString &text);

    int buttonCount() const { return mButtons.size(); }
    int focusedButton() const { return mFocusedButton; }
    // Moves the mark; an index outside changes nothing.
    void focusButton(int index);

private:
    void setMarked(int index, bool marked);

    ButtonStyles mStyles;
    QLabel *mTitle;
    QLabel *mMessage;
    QHBoxLayout *mButtonRow;
    QList<PictureButton *> mButtons;
    int mFocusedButton = 0;
};

// The title bar of a pop-up, as wide as its layout makes it.
QLabel *makePopupTitle(QWidget *parent);
