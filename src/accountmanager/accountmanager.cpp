#include "accountmanager/accountmanager.h"

#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/errordialog.h"
#include "accountmanager/loginpage.h"
#include "accountmanager/managerwidget.h"
#include "accountmanager/protectioncode.h"
#include "accountmanager/waitwidget.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/closelater.h"
#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"
#include "common/ui/screenbackground.h"
#include "common/ui/shortcutbar.h"
#include "network/systemconfig.h"
#include "oauth/oauthwidget.h"
#include "oauth/signinplugin.h"
#include "oauth/signinview.h"
#include "platform/ipc.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QNetworkProxy>

#include <new>

namespace {

constexpr int kSideSpace = 180;
constexpr int kSpaceAbove = 28; // of what is below the title
constexpr int kHintsHeight = 32;
constexpr QSize kLogo(170, 46);

// The sign-in page goes through the program's proxy. Setting it drops every open connection.
void applyProxy()
{
    const QStringList parts =
        SystemConfig::proxyAddress().split(QLatin1Char(':'), Qt::SkipEmptyParts);
    QNetworkProxy proxy(QNetworkProxy::NoProxy);
    if (parts.size() >= 2)
        proxy = QNetworkProxy(QNetworkProxy::HttpProxy, parts.at(0), parts.at(1).toUShort());
    if (QNetworkProxy::applicationProxy() != proxy)
        QNetworkProxy::setApplicationProxy(proxy);
}

} // namespace

AccountManager::AccountManager(QWidget *parent)
    : QWidget(parent)
    , mLoginPage(new LoginPage(this))
    , mMiddle(new QHBoxLayout)
    , mShortcutBar(new ShortcutBar(this))
{
    mShortcutBar->addEntry(DEVICE_SELECT_KEY, I18n::shortCut(6));
    mShortcutBar->addEntry(DEVICE_RETURN_KEY, I18n::shortCut(2));
    mShortcutBar->setFixedHeight(kHintsHeight);
    mMiddle->setSpacing(0);
    mMiddle->addSpacing(kSideSpace);
    mMiddle->addWidget(mLoginPage);
    mMiddle->addSpacing(kSideSpace);

    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(SystemConfig::borderLeft(), SystemConfig::borderTop(),
                               SystemConfig::borderRight(), SystemConfig::borderBottom());
    column->setSpacing(0);
    column->addWidget(makeTitle());
    column->addSpacing(kSpaceAbove);
    column->addLayout(mMiddle, 1);
    column->addWidget(mShortcutBar);

    connect(mLoginPage, &LoginPage::oauthStarted, this, &AccountManager::startAuthorize);
    connect(mLoginPage, &LoginPage::loginSucessed, this, &AccountManager::startLoading);
    connect(mLoginPage, &LoginPage::exitApp, this, &AccountManager::onReturnClicked);
    connect(mLoginPage, &LoginPage::formWanted, this, &AccountManager::showForm);
}

AccountManager::~AccountManager()
{
    // The main widget keeps them among its pages, where nothing else would end them.
    if (mWaitWidget)
        mWaitWidget->deleteLater();
    dropWizard();
}

QWidget *AccountManager::makeTitle()
{
    auto *title = new QWidget(this);
    auto *logo = new QLabel(title);
    logo->setPixmap(loadPicture(QStringLiteral(":/res/orvala_icon_big.png"), kLogo));
    auto *text = new QLabel(title);
    text->setTextFormat(Qt::PlainText);
    text->setText(I18n::login(0));
    QFont font = text->font();
    font.setPixelSize(32);
    text->setFont(font);

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
    applyProxy();
    if (!prepareWizard()) {
        closeForm();
        mLoginPage->showMessage(AccountTexts::text(AccountTexts::SignInUnavailable));
        return;
    }
    // A kept widget is connected already; twice would report every result twice.
    connect(oauthWizard, &OAuthWidget::oauthFinished, this, &AccountManager::authorizeResult,
            Qt::UniqueConnection);
    connect(oauthWizard, &OAuthWidget::authorizeConnectTimeout, this,
            &AccountManager::handleAuthorizeTimeOut, Qt::UniqueConnection);
    connect(oauthWizard, &OAuthWidget::authorizeCanceled, this,
            &AccountManager::handleAuthorizeCancel, Qt::UniqueConnection);
    emit showNewWidget(oauthWizard);
    oauthWizard->startAuthorizate();
}

// False when there is no web view to sign in with.
bool AccountManager::prepareWizard()
{
    if (oauthWizard) {
        logLine("{AccountManager::startAuthorize} NULL != oauthWizard");
        return true;
    }
    logLine("{AccountManager::startAuthorize} NULL == oauthWizard");
    std::unique_ptr<SignInView> view = SignInPlugin::createView();
    if (!view)
        return false;
    oauthWizard = new OAuthWidget(std::move(view), this);
    return true;
}

void AccountManager::authorizeResult(bool allow)
{
    logLine("authorizeResult SLOT function is called");
    if (!allow) {
        logLine("{AccountManager::authorizeResult} enter authorize failed");
        emit showNewWidget(this);
        connect(showError(I18n::prompt(1)), &ErrorDialog::errorExitApp, this,
                &AccountManager::onReturnClicked);
        return;
    }
    if (!oauthWizard)
        return;
    // Whoever came by the form is known by what was entered there.
    const bool hasLoginId = mForm && !mForm->name().isEmpty();
    const QString account = hasLoginId ? mForm->name() : oauthWizard->getAccountMail();
    const QString pin = mForm ? mForm->password() : protectioncode::kDefault;
    switch (storeAccount(account, pin, oauthWizard->getOauthAccessToken())) {
    case SignedIn:
        emit loginFinished();
        break;
    case NotStored:
        oauthWizard->showMessage(AccountTexts::text(AccountTexts::NotStored));
        break;
    case NotSignedIn:
        askForOtherCode(account);
        break;
    }
}

// The account's PIN is not the one that New signs in with.
void AccountManager::askForOtherCode(const QString &account)
{
    if (!protectioncode::isOffered()) {
        oauthWizard->showMessage(QString()); // nothing is said: it signs in from the list
        return;
    }
    showAccounts();
    dropWizard();
    showForm(account);
}

AccountManager::Outcome AccountManager::storeAccount(const QString &account, const QString &pin,
                                                     const QString &token)
{
    if (account.isEmpty() || token.isEmpty())
        return NotStored;
    const bool exists = mLoginPage->hasAccount(account);
    const AccountManagerHelper::Session session;
    const bool stored = exists ? AccountManagerHelper::updateToken(account, token)
                               : AccountManagerHelper::addAccount(account, pin, token);
    if (!stored) {
        if (!exists)
            logLine(" Add account error: show a error dialog");
        return NotStored;
    }
    if (AccountManagerHelper::login(account, pin))
        return SignedIn;
    return AccountManagerHelper::hasFailed() ? NotStored : NotSignedIn;
}

ErrorDialog *AccountManager::showError(const QString &text)
{
    auto *dialog = new ErrorDialog(this);
    dialog->retranslateUi(I18n::prompt(0), text, false);
    dialog->show();
    return dialog;
}

void AccountManager::handleAuthorizeTimeOut()
{
    showAccounts();
    showError(I18n::prompt(11));
    dropWizard();
}

void AccountManager::handleAuthorizeCancel()
{
    logLine("handleAthorizeCancel invoked!");
    showAccounts();
    dropWizard();
}

void AccountManager::showAccounts()
{
    mLoginPage->reload(); // an account may have been stored although it was not signed in
    emit showNewWidget(this);
}

void AccountManager::showForm(const QString &account)
{
    if (mForm)
        return;
    mForm = new ManagerWidget(this);
    connect(mForm, &ManagerWidget::oauthStarted, this, &AccountManager::startAuthorize);
    connect(mForm, &ManagerWidget::loginSucessed, this, &AccountManager::startLoading);
    connect(mForm, &ManagerWidget::canceled, this, &AccountManager::closeForm);
    if (!account.isEmpty())
        mForm->askForCode(account);
    mLoginPage->hide();
    mMiddle->insertWidget(mMiddle->indexOf(mLoginPage), mForm);
    mForm->show();
}

void AccountManager::closeForm()
{
    if (closeLater(mForm))
        mLoginPage->show();
}

// Later: it is a key or an answer of its own that ends it.
void AccountManager::dropWizard()
{
    if (!oauthWizard)
        return;
    oauthWizard->disconnect(this);
    oauthWizard->deleteLater();
    oauthWizard.clear();
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
