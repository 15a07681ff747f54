#pragma once

#include <QObject>
#include <QTimer>

class QLabel;
class QWidget;

// The marks over the slide show's photo: an arrow at each side to which a key leads, and one of two
// indicators, for playing and for pause. If configured they hide when no key has come for a while.
class SlideMarks : public QObject
{
    Q_OBJECT

public:
    // Seconds without a key after which the marks hide; 0: never. The labels belong to the screen.
    SlideMarks(int seconds, QWidget *screen);

    void place(const QSize &screen);
    void setArrows(bool left, bool right);
    void setPlaying(bool isPlaying);
    // A key has come.
    void wake();

    bool isLeftShown() const;
    bool isRightShown() const;
    bool isPlayShown() const;
    bool isPauseShown() const;

private:
    void refresh();

    QLabel *mLeft;
    QLabel *mRight;
    QLabel *mPlay;
    QLabel *mPause;
    QTimer mQuiet;
    int mSeconds;
    bool mHasLeft = false;
    bool mHasRight = false;
    bool mIsPlaying = false;
    bool mIsAwake = true;
};
