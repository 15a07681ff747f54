#pragma once

#include <QWidget>

class HomeWidget;
class QStackedLayout;

// The personal page: what is shown from sign-in to sign-out. Stacks the home screen and whatever
// takes the whole screen in its place.
class Widget : public QWidget
{
    Q_OBJECT

public:
    explicit Widget(QWidget *parent = nullptr);

    HomeWidget *homeScreen() const { return mHomeWidget; }

private:
    HomeWidget *mHomeWidget;
    QStackedLayout *mPages;
};
