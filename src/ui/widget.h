#pragma once

#include <QWidget>

class HomeWidget;
class QImageSlide;
class QStackedLayout;

// The personal page: what is shown from sign-in to sign-out. Stacks the home screen and the slide
// show's player, and hands from one to the other.
//
//   home screen -- slideShow, slidePlay --> player
//   player -- page wanted --> home screen -- records --> player
//   player -- returnImageSlideUpdate --> home screen, with that record selected
class Widget : public QWidget
{
    Q_OBJECT

public:
    explicit Widget(QWidget *parent = nullptr);

    HomeWidget *homeScreen() const { return mHomeWidget; }
    QImageSlide *player() const { return mPlayer; }

public slots:
    void startSlideShow(int index);
    void startSlidePlay(int index);
    void updateSelectedIndex(int newIndex); // a record, from 1
    void handleSlidePageDown(int diff);
    void handleSlidePageUp(int diff);

private:
    void connectParts();
    void showPlayer();
    void turnPage(bool isDown, int record);
    void fetchBlock(int record);

    HomeWidget *mHomeWidget;
    QImageSlide *mPlayer;
    QStackedLayout *mPages;
};
