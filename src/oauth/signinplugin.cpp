#include "oauth/signinplugin.h"

#include "base/log.h"
#include "network/systemconfig.h"
#include "oauth/signinview.h"
#include "paths.h"

#include <QPluginLoader>

QString SignInPlugin::mFile;

void SignInPlugin::setFile(const QString &path)
{
    mFile = path;
}

std::unique_ptr<SignInView> SignInPlugin::createView()
{
    const QString file =
        mFile.isEmpty() ? QStringLiteral(ORVALA_PLUGIN_DIR "/liborvala-signin.so") : mFile;
    QPluginLoader loader(file);
    auto *factory = qobject_cast<SignInViewFactory *>(loader.instance());
    if (!factory) {
        logLine("{SignInPlugin::createView} ", file, ": ", loader.errorString());
        return nullptr;
    }
    const SignInViewFactory::Addresses addresses{
        SystemConfig::oauthBase() + QStringLiteral("auth?"), SystemConfig::signInPage()};
    return std::unique_ptr<SignInView>(factory->create(addresses));
}
