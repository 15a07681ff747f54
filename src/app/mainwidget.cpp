#include "app/mainwidget.h"

#include "accountmanager/accountmanager.h"
#include "accountmanager/accountmanagerhelper.h"
#include "app/mainapplication.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/qpopupdialog.h"
#include "data/photomanager.h"
#include "network/connection.h"
#include "network/systemconfig.h"
#include "oauth/oauthutil.h"
#include "platform/devicestate.h"
#include "platform/ipcthread.h"
#include "ui/homewidget.h"
#include "ui/widget.h"

#include <QMessageBox>
#include <QStackedWidget>
#include <QVBoxLayout>

#include <new>

using netcommon::IpcThread;

namespace {

enum TitleText { ErrorTitle = 11, NotificationTitle = 12 };
enum PromptText { PluggedOutPrompt = 13, PluggedInPrompt = 14 };
enum ButtonText { CloseButton = 5 };

constexpr int LEAVING = 2; // the response to an exit message

} // namespace

MainWidget *MainWidget::mMainInstance = nullptr;

MainWidget::MainWidget(QWidget *parent)
    : QWidget(parent)
{
    try {
        build();
    } catch (const std::bad_alloc &failure) {
        endForLackOfMemory(QString::fromLocal8Bit(failure.what()));
    }
    connect(&mTimeRequest, &TimeRequest::connected, this, &MainWidget::connectsucess);
    connect(&mTimeRequest, &TimeRequest::readyRead, this, &MainWidget::readingDataGrams);
    setTimeViaNTP();
    i4_reg_network_notify_cb(NetworkStatusNotify);
    connect(this, &MainWidget::cableStatusNotify, this, &MainWidget::handleCableStatusChange);
}

MainWidget::~MainWidget()
{
    i4_reg_network_notify_cb(nullptr);
    mMainInstance = nullptr;
    MainApplication::setDialog(nullptr, false);
}

void MainWidget::build()
{
    PhotoManager::init();
    Connection::clearConnections();
    mAccountManager = new AccountManager(this);
    connectPlatform();
    connectAccountManager();
    qWarning().noquote().nospace()
        << "\n\r Application Version:" << QCoreApplication::applicationVersion();
    buildLayout();
    IsSetTimeZone = false;
    mMainInstance = this;
    mStatusDialog = nullptr;
}

void MainWidget::connectPlatform()
{
    IpcThread *thread = IpcThread::getInstance();
    if (!thread)
        return;
    connect(thread, &IpcThread::signalExit, this, &MainWidget::exitOrvala);
    connect(this, &MainWidget::signalResponseParent, thread, &IpcThread::responseParent);
    connect(thread, &IpcThread::signalSetTimezone, this, &MainWidget::setTimeZone);
}

void MainWidget::connectAccountManager()
{
    connect(mAccountManager, &AccountManager::showNewWidget, this, &MainWidget::switchWidget);
    connect(mAccountManager, &AccountManager::loginFinished, this, &MainWidget::enterPersonalPage);
}

void MainWidget::buildLayout()
{
    auto *layout = new QVBoxLayout(this);
    mStackedWidget = new QStackedWidget;
    // The first page measures its texts only when it is shown: by then the interface's font is set,
    // and no other font has been looked up and loaded for nothing.
    if (mAccountManager->layout())
        mAccountManager->layout()->setEnabled(false);
    mStackedWidget->addWidget(mAccountManager);
    mStackedWidget->setCurrentWidget(mAccountManager);
    layout->addWidget(mStackedWidget);
    layout->setMargin(0);
}

void MainWidget::showEvent(QShowEvent *event)
{
    QLayout *first = mAccountManager ? mAccountManager->layout() : nullptr;
    if (first && !first->isEnabled()) {
        first->setEnabled(true);
        first->activate();
    }
    QWidget::showEvent(event);
}

void MainWidget::endForLackOfMemory(const QString &reason)
{
    QMessageBox::critical(this, QStringLiteral("Out of Memory"), reason, QMessageBox::Ok);
    // From the event loop, which has not begun: before it, exit() is without effect.
    QMetaObject::invokeMethod(
        qApp, [] { QCoreApplication::exit(0); }, Qt::QueuedConnection);
}

void MainWidget::switchWidget(QWidget *w)
{
    logLine("MainWidget switchWidget!!");
    if (mStackedWidget->indexOf(w) < 0) {
        logLine("mStackedWidget addWidget!!");
        mStackedWidget->addWidget(w);
    }
    mStackedWidget->setCurrentWidget(w);
}

void MainWidget::enterPersonalPage()
{
    logLine("MainWidget enterPersonalPage!!");
    if (!mAccountManager)
        return;
    mPersonalPage = new Widget;
    auto *tokens = new OAuthUtil(mPersonalPage); // whose tokens end with it
    tokens->scheduleRefresh(AccountManagerHelper::getExpires() == 0);
    connect(mPersonalPage->homeScreen(), &HomeWidget::signedOut, this,
            &MainWidget::returnToAccounts);
    mStackedWidget->removeWidget(mAccountManager);
    mAccountManager->deleteLater();
    mAccountManager = nullptr;
    mStackedWidget->addWidget(mPersonalPage);
    mStackedWidget->setCurrentWidget(mPersonalPage);
}

void MainWidget::returnToAccounts()
{
    if (mAccountManager || !mPersonalPage)
        return;
    mAccountManager = new AccountManager(this);
    connectAccountManager();
    mStackedWidget->addWidget(mAccountManager);
    mStackedWidget->setCurrentWidget(mAccountManager);
    mStackedWidget->removeWidget(mPersonalPage);
    mPersonalPage->hide();
    mPersonalPage->deleteLater();
    mPersonalPage = nullptr;
}

void MainWidget::exitOrvala(bool isFromParent, bool isSystemError)
{
    logLine("MainWidget,exitOrvala,isFromParent=", int(isFromParent),
            ",isSystemError=", int(isSystemError), "...");
    if (!isFromParent)
        return;
    logLine("MainWidget,exitOrvala,signal is from parent...");
    QCoreApplication::exit(0);
    logLine("MainWidget,exitOrvala,signal responseParent 2.");
    emit signalResponseParent(LEAVING);
}

void MainWidget::setTimeZone(int zone)
{
    logLine("Time zone has been set as: ", zone);
    IsSetTimeZone = true;
    TimeZone = zone;
}

void MainWidget::setTimeViaNTP()
{
    mTimeRequest.start(SystemConfig::timeServer());
}

void MainWidget::connectsucess()
{
    mTimeRequest.sendRequest();
}

void MainWidget::readingDataGrams()
{
    mTimeRequest.readReply();
}

int MainWidget::NetworkStatusNotify(char *name, _NETWORK_EVENT_T event)
{
    logLine("enter MainWidget::NetworkStatusNotify");
    const bool pluggedIn = event != NETWORK_EVENT_PLUG_OUT;
    logLine("Notifycation: Network cable ", name,
            pluggedIn ? " has plug in.\n" : " has plug out.\n");
    if (mMainInstance)
        emit mMainInstance->cableStatusNotify(pluggedIn);
    return 0;
}

void MainWidget::handleCableStatusChange(bool status)
{
    logLine("enter MainWidget::handleCableStatusChange");
    NetworkCableStatus = status;
    logLine("{MainWidget::handleCableStatusChange} NetworkCableStatus = ", NetworkCableStatus);
    if (!status)
        Connection::closeIdleSockets(); // what they lead to may not be there when the cable is back
    showStatusDialog(status);
}

void MainWidget::showStatusDialog(bool status)
{
    logLine("enter MainWidget::showStatusDialog");
    closeStatusDialog();
    auto *dialog = new QPopupDialog(this);
    dialog->initDialog(I18n::title(status ? NotificationTitle : ErrorTitle),
                       I18n::prompt(status ? PluggedInPrompt : PluggedOutPrompt),
                       {I18n::button(CloseButton)});
    connect(dialog, &QPopupDialog::accepted, this, &MainWidget::closeStatusDialog);
    dialog->setFocusPolicy(Qt::NoFocus); // its keys are handed to it
    dialog->show();
    mStatusDialog = dialog;
    MainApplication::setDialog(dialog, true);
}

void MainWidget::closeStatusDialog()
{
    logLine("MainWidget::closeStatusDialog");
    if (mStatusDialog) {
        mStatusDialog->close();
        delete mStatusDialog;
    }
    MainApplication::setDialog(nullptr, false);
}
