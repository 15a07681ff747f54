#pragma once

#include <QObject>
#include <QPointer>

class HomePages;
class QPopUpForm;
class QWidget;
struct HomeState;

// Searching on the home screen: the bar, the keyboard for its words, and the blocks of results.
//
//   open() -> bar -> showInputCommentDialog() -> words -> handleStartSearch() -> resultsWanted()
//   Return -> backToBar()         edge of a block -> changeBlock() -> resultsWanted()
class SearchFlow : public QObject
{
    Q_OBJECT

public:
    // The screen is what the keyboard pops up over.
    SearchFlow(HomeState *state, HomePages *pages, QWidget *screen);

    void open();
    void backToBar();
    // The previous or next hundred results; false when there are none.
    bool changeBlock(bool next);

public slots:
    void showInputCommentDialog();
    void handleStartSearch(QString text);

signals:
    void resultsWanted(); // the state says which

private:
    void showBar();
    void takeWords(const QString &text);

    HomeState *mState;
    HomePages *mPages;
    QWidget *mScreen;
    QPointer<QPopUpForm> mKeyboard;
};
