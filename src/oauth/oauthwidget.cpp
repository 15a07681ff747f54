#include "oauth/oauthwidget.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/closelater.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/remotekeys.h"
#include "common/ui/screenbackground.h"
#include "common/ui/shortcutbar.h"
#include "network/systemconfig.h"
#include "oauth/oauthutil.h"
#include "oauth/signinview.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QStackedWidget>
#include <QVBoxLayout>

#include <algorithm>

namespace {

constexpr int kSecondsToLoad = 30;
constexpr int kMostSecondsToLoad = 3600;
// A load that failed may be one that the page itself broke off to begin the next.
constexpr int kSecondsAfterFailure = 3;
constexpr int kBusySize = 32;
constexpr int kLightestGround = 48; // of 255, behind the hints

int loadingMilliseconds()
{
    const int seconds = SystemConfig::value(QStringLiteral("Network/SignInSeconds")).toInt();
    return 1000 * (seconds > 0 ? std::min(seconds, kMostSecondsToLoad) : kSecondsToLoad);
}

QLabel *makeLabel(QWidget *parent, const QString &text)
{
    auto *label = new QLabel(parent);
    label->setTextFormat(Qt::PlainText);
    label->setAlignment(Qt::AlignCenter);
    label->setWordWrap(true);
    label->setStyleSheet(QStringLiteral("color: white; font-size: 28px;"));
    label->setText(text);
    return label;
}

} // namespace

OAuthWidget::OAuthWidget(std::unique_ptr<SignInView> page, QWidget *parent)
    : QWidget(parent)
    , mPage(std::move(page))
    , mUtil(std::make_unique<OAuthUtil>(mPage.get()))
{
    setFocusPolicy(Qt::StrongFocus);
    buildLayout();
    mStallTimer.setSingleShot(true);
    connect(&mStallTimer, &QTimer::timeout, this, &OAuthWidget::handleLoadingTimeout);
}

OAuthWidget::~OAuthWidget()
{
    mPage->disconnect(this);
    mUtil.reset();
    mPage.reset();
}

void OAuthWidget::buildLayout()
{
    mLoadingPage = makeLoadingPage();
    mMessage = makeLabel(this, QString());
    mMessage->setObjectName(QStringLiteral("message"));
    mStack = new QStackedWidget(this);
    mStack->addWidget(mLoadingPage);
    mStack->addWidget(mPage->widget());
    mStack->addWidget(mMessage);

    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(SystemConfig::borderLeft(), SystemConfig::borderTop(),
                               SystemConfig::borderRight(), SystemConfig::borderBottom());
    column->setSpacing(10);
    column->addWidget(mStack, 1);
    column->addWidget(makeBottomBar());
}

QWidget *OAuthWidget::makeLoadingPage()
{
    auto *loading = new QWidget(this);
    mRing = new QProgressIndicator(loading);
    auto *column = new QVBoxLayout(loading);
    column->setSpacing(24);
    column->addStretch();
    column->addWidget(mRing, 0, Qt::AlignHCenter);
    column->addWidget(makeLabel(loading, I18n::prompt(2)), 0, Qt::AlignHCenter);
    column->addStretch();
    return loading;
}

QWidget *OAuthWidget::makeBottomBar()
{
    auto *bar = new QWidget(this);
    mBusy = new QProgressIndicator(bar);
    mBusy->setFixedSize(kBusySize, kBusySize);
    mHints = new ShortcutBar(bar);
    mHints->addEntry(DEVICE_SELECT_KEY, I18n::shortCut(6));
    mHints->addEntry(DEVICE_RETURN_KEY, I18n::shortCut(2));
    auto *row = new QHBoxLayout(bar);
    row->setContentsMargins(0, 0, 0, 0);
    row->addWidget(mBusy);
    row->addWidget(mHints, 1);
    return bar;
}

void OAuthWidget::startAuthorizate()
{
    startLoading();
    showAuthorizationView();
}

void OAuthWidget::showAuthorizationView()
{
    connectPage();
    mUtil->startUserAuthorizate();
}

void OAuthWidget::connectPage()
{
    const SignInView *page = mPage.get();
    const auto kind = Qt::UniqueConnection; // signing in may start anew
    connect(mUtil.get(), &OAuthUtil::loadingPageTimeout, this, &OAuthWidget::handleLoadingTimeout,
            kind);
    connect(mUtil.get(), &OAuthUtil::authorized, this, &OAuthWidget::getAuthorizedResult, kind);
    connect(page, &SignInView::errorOccured, this, &OAuthWidget::handleError, kind);
    connect(page, &SignInView::showKeyboard, this, &OAuthWidget::showInputDialog, kind);
    connect(page, &SignInView::pageLoadFinished, this, &OAuthWidget::showWebView, kind);
    connect(page, &SignInView::cancelAuthorize, this, &OAuthWidget::authorizeCanceled, kind);
    connect(page, &SignInView::loadStarted, this, &OAuthWidget::handleLoadStarted, kind);
    connect(page, &SignInView::loadFinished, this, &OAuthWidget::handleLoadFinished, kind);
    // Closed by its result: now the tokens are on their way.
    connect(page, &SignInView::pageClosed, this, &OAuthWidget::startLoading, kind);
    disconnect(page, &SignInView::userNameFound, this, nullptr);
    connect(page, &SignInView::userNameFound, this,
            [](const QString &name) { AccountManagerHelper::setUserName(name); });
}

void OAuthWidget::startLoading()
{
    closeInputDialog();
    mBusy->stopAnimation();
    mRing->startAnimation();
    showPage(mLoadingPage);
    mStallTimer.stop();
    mUtil->startLoadingTimer(loadingMilliseconds());
}

void OAuthWidget::stopTimers()
{
    mStallTimer.stop();
    mUtil->stopTimer();
}

void OAuthWidget::stopAnimation()
{
    mRing->stopAnimation();
    mBusy->stopAnimation();
}

void OAuthWidget::handleLoadStarted()
{
    if (mStack->currentWidget() == mPage->widget())
        mBusy->startAnimation();
    mStallTimer.start(loadingMilliseconds());
}

void OAuthWidget::handleLoadFinished(bool finished)
{
    if (!finished) {
        mStallTimer.start(std::min(loadingMilliseconds(), 1000 * kSecondsAfterFailure));
        return;
    }
    stopTimers();
    mBusy->stopAnimation();
    // Whatever page came, the user must see it.
    if (mStack->currentWidget() == mLoadingPage)
        showWebView();
    else
        takePageColour();
}

void OAuthWidget::showWebView()
{
    stopTimers();
    stopAnimation();
    mPage->widget()->show(); // it has been closed if this is the second time
    showPage(mPage->widget());
    takePageColour();
}

// The page lies in the middle of the screen; the edges take its colour, if it is as dark as the
// hints below it need.
void OAuthWidget::takePageColour()
{
    if (mStack->currentWidget() != mPage->widget())
        return;
    const QImage corner = mPage->widget()->grab(QRect(0, 0, 1, 1)).toImage();
    const QColor colour = corner.pixelColor(0, 0);
    if (qGray(colour.rgb()) > kLightestGround)
        return;
    QPalette ground = palette();
    ground.setBrush(QPalette::Window, colour);
    setPalette(ground);
}

void OAuthWidget::showPage(QWidget *page)
{
    if (page != mPage->widget())
        setScreenBackground(this);
    mStack->setCurrentWidget(page);
    mHints->setShown(DEVICE_SELECT_KEY, page == mPage->widget());
    takeFocus();
}

void OAuthWidget::takeFocus()
{
    // A keyboard takes the focus by itself and gives it back; a page that comes when the user has
    // left must not have it at all.
    if (mInputForm || !isVisible())
        return;
    const bool isPage = mStack->currentWidget() == mPage->widget();
    (isPage ? mPage->widget() : this)->setFocus();
}

void OAuthWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    takeFocus();
}

void OAuthWidget::showInputDialog()
{
    closeInputDialog();
    const bool isPassword = mPage->editedType() == QLatin1String("password");
    mInputForm = new QPopUpForm(this);
    mInputForm->initForm(QPopUpForm::POPUP_FORM_TEXT_INPUT,
                         isPassword ? QString() : mPage->editedText());
    if (isPassword) {
        logLine("setInputMode is true");
        mInputForm->setInputMode(true);
    }
    connect(mInputForm, &QPopUpForm::returnPopUpForm, this, &OAuthWidget::closeInputDialog);
    connect(mInputForm, &QPopUpForm::editFinished, this, &OAuthWidget::getInput);
    mInputForm->show();
}

void OAuthWidget::closeInputDialog()
{
    if (closeLater(mInputForm))
        takeFocus();
}

void OAuthWidget::getInput(const QString &contents)
{
    logLine("OAuthWidget::getInput, contents = ", contents);
    mPage->setEditedText(contents);
    if (mPage->editedType() == QLatin1String("email")) {
        logLine("{OAuthWidget::getInput} enter type = email");
        mAccountMail = contents;
    }
    closeInputDialog();
}

void OAuthWidget::handleError()
{
    showMessage(I18n::prompt(10));
}

void OAuthWidget::showMessage(const QString &text)
{
    closeInputDialog();
    stopTimers();
    stopAnimation();
    mMessage->setText(text);
    showPage(mMessage);
}

void OAuthWidget::handleLoadingTimeout()
{
    stopAnimation();
    stopTimers();
    emit authorizeConnectTimeout();
}

void OAuthWidget::getAuthorizedResult(bool result)
{
    stopTimers();
    emit oauthFinished(result);
}

QString OAuthWidget::getOauthAccessToken() const
{
    return mUtil->getAccessToken();
}

void OAuthWidget::keyPressEvent(QKeyEvent *event)
{
    if (event->key() == DEVICE_RETURN_KEY)
        emit authorizeCanceled();
    else
        event->ignore();
}

void OAuthWidget::resizeEvent(QResizeEvent *)
{
    setScreenBackground(this);
    takePageColour();
}
