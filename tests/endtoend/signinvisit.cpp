#include "endtoend/signinvisit.h"

#include "common/ui/remotekeys.h"
#include "endtoend/television.h"
#include "signin/digitpicture.h"

#include <QRegularExpression>
#include <QSignalSpy>
#include <QTest>
#include <QWebElement>
#include <QWebFrame>
#include <QWebView>

namespace {

constexpr int PATIENCE_MS = 10000;

// The strokes of the digits in a picture, in their order.
QStringList strokesIn(const QString &picture)
{
    static const QRegularExpression digit("<path transform=[^>]* d=\"([^\"]+)\"");
    QStringList strokes;
    for (auto matches = digit.globalMatch(picture); matches.hasNext();)
        strokes << matches.next().captured(1);
    return strokes;
}

} // namespace

bool SignInVisit::open() const
{
    mTv->press(DEVICE_SELECT_KEY);
    return isOpen();
}

bool SignInVisit::isOpen() const
{
    return QTest::qWaitFor([this] { return mTv->page() && mTv->focus() == "OAuthView"; },
                           PATIENCE_MS);
}

bool SignInVisit::fill(const QString &mail, const QString &password) const
{
    if (!mTv->type(mail))
        return false;
    mTv->press(DEVICE_DOWN_KEY);
    return mTv->type(password);
}

bool SignInVisit::submit() const
{
    if (!mTv->page())
        return false;
    QSignalSpy loaded(mTv->page(), &QWebView::loadFinished);
    mTv->press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
    return QTest::qWaitFor([&loaded] { return !loaded.isEmpty(); }, PATIENCE_MS);
}

bool SignInVisit::answer(bool allows) const
{
    if (!allows)
        mTv->press(DEVICE_RIGHT_KEY);
    mTv->press(DEVICE_SELECT_KEY);
    return QTest::qWaitFor([this] { return !mTv->page(); }, PATIENCE_MS);
}

QString SignInVisit::text() const
{
    return mTv->page() ? mTv->page()->page()->mainFrame()->toPlainText() : QString();
}

bool SignInVisit::isAtConsent() const
{
    return mTv->page() && mTv->page()->url().path() == "/o/oauth2/auth";
}

bool SignInVisit::hasPanel() const
{
    return mTv->page() &&
           !mTv->page()->page()->mainFrame()->findFirstElement("#logincaptcha").isNull();
}

QString SignInVisit::digits() const
{
    const QStringList known = strokesIn(QString::fromStdString(digitPicture("0123456789")));
    const QString panel =
        mTv->page()->page()->mainFrame()->findFirstElement("#logincaptcha").toInnerXml();
    QString digits;
    for (const QString &stroke : strokesIn(panel))
        digits += QString::number(known.indexOf(stroke));
    return digits;
}
