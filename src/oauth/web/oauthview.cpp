#include "oauth/web/oauthview.h"

#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "oauth/web/scripttext.h"
#include "oauth/web/trustedpage.h"

#include <QKeyEvent>
#include <QWebFrame>

namespace {

constexpr int kPollInterval = 2500; // milliseconds
constexpr int kLongestName = 1000;  // characters

QString typeOf(const QWebElement &element)
{
    return element.attribute(QStringLiteral("type")).toLower();
}

} // namespace

QString OAuthView::AuthorizeUrl;
QString OAuthView::LoginUrl;

OAuthView::OAuthView(QWidget *parent)
    : QWebView(parent)
{
    setPage(new TrustedPage(this));
    setContextMenuPolicy(Qt::NoContextMenu);
    setAcceptDrops(false);
    connect(this, &QWebView::loadFinished, this, &OAuthView::handleFinished);
}

void OAuthView::halt()
{
    if (mPanelTimer)
        mPanelTimer->stop();
    stop();
}

QWebElement OAuthView::document()
{
    return page()->mainFrame()->documentElement();
}

void OAuthView::handleFinished(bool finished)
{
    logLine("enter OAuthView::handleFinished()");
    if (!finished) {
        logLine("OAuthView::handleFinished finished=false");
        return;
    }
    mDocument = document();
    const QString currentUrl = url().toString();
    logLine("{OAuthView::handleFinished} currentUrl = ", currentUrl);
    if (!mWebElements.isEmpty()) {
        logLine("{OAuthView::handleFinished} mWebElements is not empty...");
        mWebElements.clear();
    }
    if (currentUrl.startsWith(AuthorizeUrl))
        takeConsentPage();
    else if (currentUrl.startsWith(LoginUrl))
        takeSignInPage();
    mWebElements = pageelements::focusable(mWebElements);
    focusElement(0);
    if (mWebElements.isEmpty())
        logLine("ERROR: do not find any button can focus in this page.");
}

void OAuthView::takeConsentPage()
{
    mHasPanel = false;
    mIsLoginPageShown = false;
    if (mPanelTimer)
        mPanelTimer->stop();
    takeUserName();
    QWebElement approve = mDocument.findFirst(QStringLiteral("button[id=submit_approve_access]"));
    QWebElement deny = mDocument.findFirst(QStringLiteral("button[id=submit_deny_access]"));
    if (approve.isNull() || deny.isNull())
        return;
    for (QWebElement *button : {&approve, &deny})
        button->setAttribute(QStringLiteral("disabled"), QString());
    mWebElements << approve << deny;
    pageelements::focus(approve);
}

// The consent page begins with the name of whoever is asked.
void OAuthView::takeUserName()
{
    const QStringList documentStringList =
        mDocument.toPlainText().split(QLatin1Char('\n'), Qt::SkipEmptyParts);
    if (documentStringList.isEmpty())
        return;
    logLine("documentStringList.at(0)=", documentStringList.at(0));
    emit userNameFound(documentStringList.at(0).left(kLongestName));
}

void OAuthView::takeSignInPage()
{
    if (mIsLoginPageShown) {
        mHasPanel = false;
        startPolling();
    }
    collect();
    if (!mIsLoginPageShown) {
        mIsLoginPageShown = true;
        emit pageLoadFinished();
    }
}

// True when the page has both fields and buttons.
bool OAuthView::collect()
{
    const bool hasInputs = pageelements::collectInputs(mDocument, &mWebElements);
    if (hasInputs)
        logLine("has search input text");
    const bool hasButtons = pageelements::collectButtons(mDocument, &mWebElements);
    if (hasButtons)
        logLine("has search button!!!");
    pageelements::hideLinks(mDocument);
    return hasInputs && hasButtons;
}

void OAuthView::startPolling()
{
    if (!mPanelTimer) {
        mPanelTimer = new QTimer(this);
        connect(mPanelTimer, &QTimer::timeout, this, &OAuthView::handleValidatePanel);
    }
    mPanelTimer->start(kPollInterval);
}

void OAuthView::handleValidatePanel()
{
    mDocument = document();
    const bool hasPanel = !mDocument.findFirst(QStringLiteral("#logincaptcha")).isNull();
    if (hasPanel && !mHasPanel)
        takePanel();
    else if (!hasPanel && mHasPanel)
        leavePanel();
    else
        mHasPanel = hasPanel;
}

void OAuthView::takePanel()
{
    const QWebElement input = mDocument.findFirst(QStringLiteral("input[type=text]"));
    if (input.isNull())
        return; // it may still come
    pageelements::makeReadOnly(input);
    logLine("has find ValidatePanel");
    mHasPanel = true;
    mWebElements.clear();
    mFocusIndex = 0;
    if (collect() && mPanelTimer)
        mPanelTimer->stop();
    mWebElements = pageelements::focusable(mWebElements);
    if (!mWebElements.isEmpty()) {
        focusElement(0);
        return;
    }
    if (mPanelTimer)
        mPanelTimer->stop();
    emit errorOccured();
}

void OAuthView::leavePanel()
{
    mHasPanel = false;
    mWebElements.clear();
    logLine("OAuthView::handleValidatePanel Search for LoginUrl widgets!");
    const bool isComplete = collect();
    if (mPanelTimer && (isComplete || mWebElements.isEmpty()))
        mPanelTimer->stop();
    mWebElements = pageelements::focusable(mWebElements);
    focusElement(0);
}

void OAuthView::checkFocus()
{
    pageelements::paintOutlines(mWebElements, mFocusIndex);
}

void OAuthView::focusElement(int index)
{
    mFocusIndex = index;
    if (mWebElements.isEmpty())
        return;
    pageelements::focus(mWebElements.at(index));
    checkFocus();
}

void OAuthView::moveFocus(int step)
{
    const int count = mWebElements.size();
    if (count > 0)
        focusElement((mFocusIndex + step + count) % count);
}

// A script of the page may have moved its focus; without any it is where the outline is.
int OAuthView::focusedIndex() const
{
    for (int i = 0; i < mWebElements.size(); ++i) {
        if (mWebElements.at(i).hasFocus())
            return i;
    }
    return mFocusIndex;
}

void OAuthView::activate()
{
    if (mWebElements.isEmpty())
        return;
    QWebElement element = mWebElements.at(focusedIndex());
    const QString type = typeOf(element);
    // The consent page's buttons need not say of what type they are.
    const bool isButton = type == QLatin1String("submit") || type == QLatin1String("button") ||
                          (type.isEmpty() && element.tagName() == QLatin1String("BUTTON"));
    if (element.hasAttributes() && isButton) {
        element.evaluateJavaScript(QStringLiteral("this.click()"));
        return;
    }
    mEditElement = element;
    logLine("{OAuthView::keyPressEvent} emit showKeyboard()");
    emit showKeyboard();
}

void OAuthView::keyPressEvent(QKeyEvent *event)
{
    logLine("enter OAuthView::keyPressEvent()");
    switch (event->key()) {
    case DEVICE_LEFT_KEY:
    case DEVICE_UP_KEY:
        moveFocus(-1);
        break;
    case DEVICE_RIGHT_KEY:
    case DEVICE_DOWN_KEY:
        moveFocus(1);
        break;
    case DEVICE_SELECT_KEY:
        activate();
        break;
    case DEVICE_RETURN_KEY:
        emit cancelAuthorize();
        break;
    default:
        QWebView::keyPressEvent(event);
    }
}

QString OAuthView::editedType() const
{
    return typeOf(mEditElement);
}

QString OAuthView::editedText() const
{
    QWebElement element = mEditElement;
    return element.evaluateJavaScript(QStringLiteral("this.value")).toString();
}

void OAuthView::setEditedText(const QString &text)
{
    mEditElement.evaluateJavaScript(QStringLiteral("this.value='%1'").arg(scriptText(text)));
}
