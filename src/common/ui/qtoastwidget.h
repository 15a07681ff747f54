#pragma once

#include <QBasicTimer>
#include <QWidget>

class QLabel;

// A short message across the middle of its parent, which goes by itself. It takes neither the focus
// nor any key.
class QToastWidget : public QWidget
{
    Q_OBJECT

public:
    explicit QToastWidget(QWidget *parent = nullptr);

    // Shows the text for a while, in place of one that is still shown.
    void showText(const QString &text, int milliseconds = 3000);
    QString text() const;

    bool eventFilter(QObject *watched, QEvent *event) override;

signals:
    void finished(); // its time is over and it is hidden

protected:
    void timerEvent(QTimerEvent *event) override;

private:
    void place();

    QLabel *mLabel;
    QBasicTimer mTimer;
};
