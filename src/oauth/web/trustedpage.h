#pragma once

#include <QWebPage>

// A web page that shows nothing but the service's pages: http and https only, no local files, no
// plug-ins, no Java, no windows or dialogs of its own, nothing beyond PageLimits, nothing kept when
// it is gone. The engine has no security support any more, and a script that never ends can only be
// ended together with the program (PageWatchdog): load only addresses that are trusted.
class TrustedPage : public QWebPage
{
    Q_OBJECT

public:
    explicit TrustedPage(QObject *parent = nullptr);

    // Else it would be a question to the user. The engine of today never asks it.
    bool shouldInterruptJavaScript() override { return true; }

protected:
    bool acceptNavigationRequest(QWebFrame *frame, const QNetworkRequest &request,
                                 NavigationType type) override;
    QWebPage *createWindow(WebWindowType) override { return nullptr; }
    QString chooseFile(QWebFrame *, const QString &) override { return QString(); }
    // Nobody could answer these with the remote.
    void javaScriptAlert(QWebFrame *, const QString &) override {}
    bool javaScriptConfirm(QWebFrame *, const QString &) override { return false; }
    bool javaScriptPrompt(QWebFrame *, const QString &, const QString &, QString *) override
    {
        return false;
    }
    void javaScriptConsoleMessage(const QString &, int, const QString &) override {}

private:
    void restrict();
};
