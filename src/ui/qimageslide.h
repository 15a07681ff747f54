#pragma once

#include "ui/slidelabel.h"
#include "ui/slideoptions.h"
#include "ui/slidewalk.h"

#include <QTimer>
#include <QWidget>

class SlideMarks;
class SlidePhotos;
class SlideSetting;

// The full-screen player: shows the photos of the list that the home screen holds, one at a time,
// stepped by the remote or played by a timer, in the order that the settings ask for. As the end of
// the records comes near it asks for the next page, whose records join the show.
//
//   timer, keys --> update(): position, next page, arrows
//                     --> showCurrent() --> SlidePhotos --> label
class QImageSlide : public QWidget
{
    Q_OBJECT

public:
    explicit QImageSlide(QWidget *parent = nullptr,
                         playorder::RandomSource random = playorder::systemRandom());
    ~QImageSlide() override;

    static bool mIsShowing; // the player is in use

    // Starts with the record of that index, which becomes the position in the play array. The
    // player may leave at once, when there is nothing to play.
    void startSlideShow(int index);
    void startSlidePlay(int index);

    int position() const { return mWalk.position(); }
    bool isPlaying() const { return mIsPlay; }
    int interval() const { return mPlayTimer.interval(); } // milliseconds
    const PlayArray &playArray() const { return mWalk.playArray(); }
    SlideLabel *label() const { return mLabel; }

public slots:
    void update(bool isUpdateIndex);
    void update() { update(true); }
    // Tells the platform whether a play is running.
    void updatePlayState(bool isPlay);
    void saveSetting();
    void closeSetting();
    // A list of the home screen has come: goes on if it was waited for.
    void takeList();

signals:
    // The page after the one of this record (from 1) is wanted, or the one before.
    void handleSlidePageDown(int diff);
    void handleSlidePageUp(int diff);
    // The player has left; the record to select, from 1.
    void returnImageSlideUpdate(int newIndexValue);
    // The list has gone while it was being shown: it is to be fetched again.
    void recordsLost();
    // The block of search results that begins with the record of this number is to be fetched.
    void blockWanted(int number);
    void signalUpdatePlaybackinfo(int statusupdate, int status, int param3, int param4);

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void initParam(bool isPlay, int index);
    void placeParts();
    void advance();
    void refreshDatas();
    bool holdsOn();
    bool waitsForList(bool isUpdateIndex);
    void takeTurnHeld(const QString &url);
    void showCurrent(SlideLabel::Change change);
    void prefetch();

    bool isKeyAnswered() const;
    void play(bool isPlay);
    void setPlaying(bool isPlay);
    void restartTimer();
    void stepBack();
    void stepOn();
    void openSetting();
    void leave();

    const SlideOptions mOptions;
    SlideWalk mWalk;
    bool mIsPlay = false;
    bool mIsHolding = false; // a turn is over, and the next photo is waited for
    bool mIsListLost = false;
    int mBlockWanted = 0; // its first record; 0: the block that is there
    int mSpeed;           // seconds
    QTimer mPlayTimer;
    SlideLabel *mLabel;
    SlideMarks *mMarks;
    SlidePhotos *mPhotos;
    SlideSetting *mSetting = nullptr;
};
