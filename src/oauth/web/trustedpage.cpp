#include "oauth/web/trustedpage.h"

#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QWebSettings>

namespace {

bool isWebAddress(const QUrl &url)
{
    return url.scheme() == QLatin1String("http") || url.scheme() == QLatin1String("https");
}

// Loads nothing from the device itself, wherever a page or a redirect points to.
class WebOnlyManager : public QNetworkAccessManager
{
public:
    using QNetworkAccessManager::QNetworkAccessManager;

protected:
    QNetworkReply *createRequest(Operation operation, const QNetworkRequest &request,
                                 QIODevice *data) override
    {
        const QUrl url = request.url();
        if (isWebAddress(url) || url.scheme() == QLatin1String("data"))
            return QNetworkAccessManager::createRequest(operation, request, data);
        // One without an address fails in the ordinary way.
        return QNetworkAccessManager::createRequest(GetOperation, QNetworkRequest(), nullptr);
    }
};

} // namespace

TrustedPage::TrustedPage(QObject *parent)
    : QWebPage(parent)
{
    setNetworkAccessManager(new WebOnlyManager(this));
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
