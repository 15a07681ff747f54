#include "network/proxyaddress.h"

#include "base/log.h"
#include "network/systemconfig.h"
#include "paths.h"

#include <QFile>

namespace {

constexpr qint64 longestLine = 128;
constexpr int shortestLine = 6;

} // namespace

QString ProxyAddress::mFile = QStringLiteral(ORVALA_PROXY_FILE);
bool ProxyAddress::mIsConfigurationRead = false;
QString ProxyAddress::mConfiguredAddress;
bool ProxyAddress::mIsFileRead = false;
QString ProxyAddress::mFileAddress;

QString ProxyAddress::find()
{
    if (readConfiguration())
        return mConfiguredAddress;
    if (mIsFileRead) {
        logLine("[cache file]osdProxyAddr = ", mFileAddress);
        return mFileAddress;
    }
    readFile();
    return mFileAddress;
}

// True if the INI file names a proxy.
bool ProxyAddress::readConfiguration()
{
    if (mIsConfigurationRead) {
        if (mConfiguredAddress.size() <= 1)
            return false;
        logLine("[cache config.ini]proxyAddr = ", mConfiguredAddress);
        return true;
    }
    logLine("read proxy from config.ini");
    mIsConfigurationRead = true;
    const QString host = SystemConfig::value(QStringLiteral("Network/IP"));
    const QString port = SystemConfig::value(QStringLiteral("Network/Port"));
    if (host.isEmpty() || port.isEmpty())
        return false;
    mConfiguredAddress = host + QLatin1Char(':') + port;
    return true;
}

void ProxyAddress::readFile()
{
    logLine("read /var/sns/proxyaddr.");
    QFile file(mFile);
    if (!file.open(QIODevice::ReadOnly)) {
        logLine("open /var/sns/proxyaddr failed");
        return;
    }
    const QByteArray line = file.readLine(longestLine);
    logLine("read line length = ", line.size());
    // The line end would make the port unreadable.
    const QString address = QString::fromLatin1(line.trimmed());
    if (line.size() >= shortestLine && !address.isEmpty()) {
        mFileAddress = address;
        mIsFileRead = true;
        logLine("osdProxyAddr = ", mFileAddress);
    }
    logLine(mFileAddress.isEmpty() ? "osdProxyAddr is NULL" : "osdProxyAddr is not NULL");
}

void ProxyAddress::reset()
{
    mIsConfigurationRead = false;
    mConfiguredAddress.clear();
    mIsFileRead = false;
    mFileAddress.clear();
}

void ProxyAddress::setFile(const QString &path)
{
    mFile = path;
    reset();
}
