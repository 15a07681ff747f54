#pragma once

#include "common/ui/maskedtext.h"

#include <QBasicTimer>
#include <QWidget>

class QKeyBoard;
class QPlainTextEdit;

// A text box above the on-screen keyboard. The box holds the cursor and the keyboard's focus: the
// remote's keys drive the on-screen keyboard from there, and a real keyboard types into the box.
// In password mode the box shows "*" for each character, the one typed last for a moment excepted.
// Besides the keys on the screen: Clear deletes, Previous and Next move the cursor.
class QKeyBoardInput : public QWidget
{
    Q_OBJECT

public:
    explicit QKeyBoardInput(QWidget *parent = nullptr);

    QString text() const { return mRealText.text(); }
    // The text to start with; the cursor goes to its end.
    void setText(const QString &text);
    // Password mode.
    void setInputMode(bool isPassword);
    // Whether the text may have more than one line; it may, until told otherwise.
    void setMultiLine(bool multiLine);

    bool eventFilter(QObject *watched, QEvent *event) override;

signals:
    void inputFinished(QString text); // "Enter" was pressed
    void returnClicked();             // Return was pressed: the text is not wanted

public slots:
    void handleTextChanged();

protected:
    void paintEvent(QPaintEvent *event) override;
    void keyPressEvent(QKeyEvent *event) override;
    void timerEvent(QTimerEvent *event) override;

private:
    // Places in the real text.
    struct Range
    {
        int start;
        int end;
    };
    void buildBox();
    void build();
    bool handleKey(QKeyEvent *event);
    bool handleTyping(QKeyEvent *event);
    void handleFunction(int key);

    Range selection() const;
    void insert(const QString &text);
    void erase(int step);
    void moveCursor(int step);
    void replace(Range range, const QString &text);
    void edit(Range range, const QString &text);
    void takeOver(int place, int removed, int added);
    void display(int cursor);
    QString allowed(const QString &text, int room) const;

    QPlainTextEdit *mBox;
    QKeyBoard *mKeyBoard;
    MaskedText mRealText;
    int mCursor = 0;            // behind what was edited last, in the real text
    bool mIsDisplaying = false; // the box changes because the real text did
    bool mMultiLine = true;
    QBasicTimer mHideTimer;
};
