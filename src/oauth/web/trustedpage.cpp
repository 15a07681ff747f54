#include "oauth/web/trustedpage.h"

#include "oauth/web/pagelimits.h"

#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QWebSettings>

namespace {

bool isWebAddress(const QUrl &url)
{
    return url.scheme() == QLatin1String("http") || url.scheme() == QLatin1String("https");
}

// Loads nothing from the device itself, wherever a page or a redirect points to, and nothing beyond
// the limits.
class WebOnlyManager : public QNetworkAccessManager
{
public:
    WebOnlyManager(PageLimits *limits, QObject *parent)
        : QNetworkAccessManager(parent)
        , mLimits(limits)
    {
    }

protected:
    QNetworkReply *createRequest(Operation operation, const QNetworkRequest &request,
                                 QIODevice *data) override
    {
        const QUrl url = request.url();
        if (url.scheme() == QLatin1String("data"))
            return limited(QNetworkAccessManager::createRequest(operation, request, data));
        // One without an address fails in the ordinary way.
        if (!isWebAddress(url))
            return QNetworkAccessManager::createRequest(GetOperation, QNetworkRequest(), nullptr);
        QNetworkRequest plain(request);
        plain.setRawHeader("Accept-Encoding", "identity"); // the toolkit inflates without a bound
        return limited(QNetworkAccessManager::createRequest(operation, plain, data));
    }

private:
    QNetworkReply *limited(QNetworkReply *reply)
    {
        mLimits->watch(reply);
        return reply;
    }

    PageLimits *mLimits;
};

} // namespace

TrustedPage::TrustedPage(QObject *parent)
    : QWebPage(parent)
{
    auto *limits = new PageLimits(this);
    setNetworkAccessManager(new WebOnlyManager(limits, this));
    connect(this, &QWebPage::loadStarted, limits, &PageLimits::startPage);
    restrict();
}

void TrustedPage::restrict()
{
    settings()->setAttribute(QWebSettings::PrivateBrowsingEnabled, true);
    for (const QWebSettings::WebAttribute unwanted :
         {QWebSettings::PluginsEnabled, QWebSettings::JavaEnabled,
          QWebSettings::LocalContentCanAccessFileUrls,
          QWebSettings::LocalContentCanAccessRemoteUrls, QWebSettings::JavascriptCanOpenWindows,
          QWebSettings::JavascriptCanCloseWindows, QWebSettings::JavascriptCanAccessClipboard,
          QWebSettings::OfflineStorageDatabaseEnabled,
          QWebSettings::OfflineWebApplicationCacheEnabled, QWebSettings::LocalStorageEnabled,
          QWebSettings::DeveloperExtrasEnabled, QWebSettings::NotificationsEnabled,
          QWebSettings::DnsPrefetchEnabled, QWebSettings::WebGLEnabled})
        settings()->setAttribute(unwanted, false);
}

bool TrustedPage::acceptNavigationRequest(QWebFrame *frame, const QNetworkRequest &request,
                                          NavigationType type)
{
    const QUrl url = request.url();
    // "about:blank" is where every frame begins.
    const bool isBlank = url.scheme() == QLatin1String("about");
    return frame && (isBlank || isWebAddress(url)) &&
           QWebPage::acceptNavigationRequest(frame, request, type);
}
