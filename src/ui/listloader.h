#pragma once

#include "data/packageproperty.h"
#include "network/errorcode.h"

#include <QObject>

class AccountQuestions;
class HomePages;
class Package;
struct HomeState;

// Brings the list that the home screen's state wants: from the cache, or from the service with the
// loading page meanwhile. What does not come, or not as a list, ends in the failure page.
//
//   request() -> in the cache: arrived()
//                else PackageManager -> the screen's call-back -> finished() -> arrived(), or the
//                                                                 failure page
//   arrived() -> held() -> complete(): may be shown; else what is missing is asked for
class ListLoader : public QObject
{
    Q_OBJECT

public:
    // The screen is what the questions pop up over.
    ListLoader(HomeState *state, HomePages *pages, AccountQuestions *questions, QObject *screen);

    // Shows the loading page and asks for what the state wants now.
    void request();
    // The package manager has answered.
    void finished(PackageProperty &property, ErrorCode code);
    // The list from the cache; null without.
    Package *held();
    // After a page has come: true, and the state knows of the list, when it has the page wanted;
    // otherwise that is asked for.
    bool complete(const Package *held, const PackageProperty &arrivedPage);

signals:
    void arrived(PackageProperty &property);
    // No list is held any longer.
    void started();

private:
    void tryToDownload();
    void fetchAnew();
    void showFailure(ErrorCode code);

    HomeState *mState;
    HomePages *mPages;
    AccountQuestions *mQuestions;
};
