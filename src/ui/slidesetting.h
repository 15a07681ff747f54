#pragma once

#include <QList>
#include <QWidget>

class QFrame;
class QPushButton;
class SettingItem;

// The panel over the slide show in which the user picks the order of the photos and the time that
// each one stays. It covers its parent and takes every key while it is open. What is chosen holds
// for the rest of the run once the player has stored it.
class SlideSetting : public QWidget
{
    Q_OBJECT

public:
    static int SlideMode;  // playorder::Mode
    static int SlideSpeed; // seconds for each photo

    explicit SlideSetting(QWidget *parent = nullptr);

    // Shows what is stored; an edit that was cancelled is forgotten.
    void load();
    int mode() const;
    int speed() const;

signals:
    void clickConfirm();
    void clickCancel();

protected:
    bool eventFilter(QObject *watched, QEvent *event) override;
    void keyPressEvent(QKeyEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    enum Part : int { ModeRow, SpeedRow, OkButton, CancelButton };

    void buildRows(QFrame *content);
    QPushButton *makeButton(const QString &text);
    void moveFocus(int key);
    void select();

    SettingItem *mModeRow = nullptr;
    SettingItem *mSpeedRow = nullptr;
    QList<QWidget *> mParts; // in the order of their indexes
    int mFocusIndex = OkButton;
};
