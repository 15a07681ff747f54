#include "accountmanager/accountmanager.h"

#include "accountmanager/loginpage.h"
#include "accountmanager/screenbackground.h"
#include "accountmanager/waitwidget.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"
#include "network/systemconfig.h"
#include "platform/ipc.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>

#include <new>

namespace {

constexpr int kSideSpace = 180;
constexpr int kLogoHeight = 46;

} // namespace

AccountManager::AccountManager(QWidget *parent)
    : QWidget(parent)
    , mLoginPage(new LoginPage(this))
    , mShortcutBar(new ShortcutBar(this))
{
    mShortcutBar->addEntry(DEVICE_RETURN_KEY, I18n::shortCut(2));
    auto *middle = new QHBoxLayout;
    middle->setSpacing(0);
    middle->addSpacing(kSideSpace);
    middle->addWidget(mLoginPage);
    middle->addSpacing(kSideSpace);

    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(SystemConfig::borderLeft(), SystemConfig::borderTop(),
                               SystemConfig::borderRight(), SystemConfig::borderBottom());
    column->addWidget(makeTitle(), 1);
    column->addLayout(middle, 8);
    column->addWidget(mShortcutBar, 2, Qt::AlignBottom);

    connect(mLoginPage, &LoginPage::oauthStarted, this, &AccountManager::startAuthorize);
    connect(mLoginPage, &LoginPage::loginSucessed, this, &AccountManager::startLoading);
    connect(mLoginPage, &LoginPage::exitApp, this, &AccountManager::onReturnClicked);
}

AccountManager::~AccountManager()
{
    // The main widget keeps it among its pages, where nothing else would end it.
    if (mWaitWidget)
        mWaitWidget->deleteLater();
}

QWidget *AccountManager::makeTitle()
{
    auto *title = new QWidget(this);
    auto *logo = new QLabel(title);
    const QPixmap picture(QStringLiteral(":/res/orvala_icon_big.png"));
    logo->setPixmap(picture);
    logo->setScaledContents(true);
    logo->setFixedSize(
        picture.size().scaled(QSize(kLogoHeight * 4, kLogoHeight), Qt::KeepAspectRatio));
    auto *text = new QLabel(title);
    text->setTextFormat(Qt::PlainText);
    text->setText(I18n::login(0));
    text->setStyleSheet(QStringLiteral("color: white; font-size: 32px;"));

    auto *row = new QHBoxLayout(title);
    row->setContentsMargins(0, 0, 0, 0);
    row->addWidget(text);
    row->addStretch();
    row->addWidget(logo);
    return title;
}

void AccountManager::startAuthorize()
{
    logLine("enter AccountManager::startAuthorize()");
    mLoginPage->showMessage(I18n::label(29).trimmed());
}

void AccountManager::startLoading()
{
    showWaitWidget();
    emit loginFinished();
}

void AccountManager::showWaitWidget()
{
    // Without the memory for it the sign-in goes on all the same.
    try {
        if (!mWaitWidget) {
            mWaitWidget = new WaitWidget(this);
            connect(mWaitWidget, &WaitWidget::returnClicked, this,
                    &AccountManager::onReturnClicked);
        }
    } catch (const std::bad_alloc &) {
        return;
    }
    emit showNewWidget(mWaitWidget);
}

void AccountManager::onReturnClicked()
{
    logLine("Return key has been Pressed");
    netcommon::Ipc::getInstance()->requestExit(false);
}

void AccountManager::keyPressEvent(QKeyEvent *event)
{
    if (event->key() == DEVICE_RETURN_KEY)
        onReturnClicked();
    else
        event->ignore();
}

void AccountManager::resizeEvent(QResizeEvent *)
{
    setScreenBackground(this);
}
