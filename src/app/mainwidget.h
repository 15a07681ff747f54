#pragma once

#include "app/timerequest.h"
#include "platform/linknotify.h"

#include <QPointer>
#include <QWidget>

class AccountManager;
class QPopupDialog;
class QStackedWidget;
class Widget;

// The top-level window: a stack of pages, first the account manager, then the personal page, and
// the account manager again after signing out. It also keeps the device's state that the screens
// read (devicestate.h): the network cable, about which it tells the user in a dialog, the time zone
// and the clock.
class MainWidget : public QWidget
{
    Q_OBJECT

public:
    explicit MainWidget(QWidget *parent = nullptr);
    ~MainWidget() override;

    // The platform's call-back, on a thread of the platform; it only emits cableStatusNotify().
    static int NetworkStatusNotify(char *name, _NETWORK_EVENT_T event);

signals:
    void signalResponseParent(int type); // to IpcThread::responseParent()
    void cableStatusNotify(bool status); // true: plugged in

public slots:
    // Shows a page; the first time it joins the stack, which owns it from then on.
    void switchWidget(QWidget *w);
    // Leaves the sign-in for the personal page, until the user signs out.
    void enterPersonalPage();
    // Nobody is signed in any longer: ends the personal page and shows the accounts.
    void returnToAccounts();
    // The platform's word: ends the event loop when it comes from the menu shell.
    void exitOrvala(bool isFromParent, bool isSystemError);

    void setTimeZone(int zone);
    void setTimeViaNTP();
    void connectsucess();
    void readingDataGrams();

    void handleCableStatusChange(bool status);
    void closeStatusDialog();

protected:
    void showEvent(QShowEvent *event) override;

private:
    void build();
    void connectPlatform();
    void connectAccountManager();
    void buildLayout();
    void endForLackOfMemory(const QString &reason);
    void showStatusDialog(bool status);

    static MainWidget *mMainInstance; // null until built

    QStackedWidget *mStackedWidget = nullptr;
    AccountManager *mAccountManager = nullptr; // null while the personal page is shown
    Widget *mPersonalPage = nullptr;
    QPointer<QPopupDialog> mStatusDialog;
    TimeRequest mTimeRequest;
};
