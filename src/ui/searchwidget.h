#pragma once

#include <QWidget>

class QLabel;
class QLineEdit;

// The search bar: a field with the search words and a button that searches for them. It edits
// nothing itself: Select on the field asks the home screen for the on-screen keyboard. The mark of
// focus starts on the field each time the bar gets the focus.
class SearchWidget : public QWidget
{
    Q_OBJECT

public:
    explicit SearchWidget(QWidget *parent = nullptr);

    // The words in the field; the button can be reached while there are any.
    void setText(const QString &text);
    QString text() const;

    // Shows the mark of focus where it is.
    void setFrame();

signals:
    void showInputDialog();
    void startSearch(QString str);

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void focusInEvent(QFocusEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    enum Part { Field = 0, Button = 1 };

    void showButton(bool ready);
    void select();

    QLineEdit *mField;
    QLabel *mButton;
    int mCurrentFocus = Field;
};
