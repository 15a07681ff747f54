#include "network/systemconfig.h"

#include "network/proxyaddress.h"
#include "paths.h"

#include <QSettings>
#include <QtMath>

#include <memory>

int SystemConfig::mScreen_Width = 0;
int SystemConfig::mScreen_Height = 0;
QString SystemConfig::mConfigFile = QStringLiteral(ORVALA_CONFIG_FILE);
QSettings *SystemConfig::mSettings = nullptr;

namespace {

qreal scaleInForce = 1;

constexpr int longestWait = 24 * 60 * 60; // seconds; timers count in milliseconds, as an int

const QString serviceOrigin = QStringLiteral("https://album.orvala.example");

} // namespace

QSettings &SystemConfig::settings()
{
    static std::unique_ptr<QSettings> owner;
    if (!mSettings) {
        owner = std::make_unique<QSettings>(mConfigFile, QSettings::IniFormat);
        owner->setIniCodec("UTF-8");
        mSettings = owner.get();
    }
    return *mSettings;
}

int SystemConfig::integer(const char *key, int fallback)
{
    bool isNumber = false;
    const int number = settings().value(QLatin1String(key)).toInt(&isNumber);
    return isNumber ? number : fallback;
}

QSize SystemConfig::size(const char *key, const QSize &fallback)
{
    const QSize found = settings().value(QLatin1String(key)).toSize();
    return found.isValid() ? found : fallback;
}

QString SystemConfig::value(const QString &key, const QString &fallback)
{
    const QVariant found = settings().value(key, fallback);
    // An unquoted comma makes the file reader split the value.
    if (found.type() == QVariant::StringList)
        return found.toStringList().join(QLatin1String(", "));
    return found.toString();
}

QStringList SystemConfig::keysOf(const QString &group)
{
    settings().beginGroup(group);
    QStringList keys = settings().childKeys();
    settings().endGroup();
    return keys;
}

void SystemConfig::setConfigFile(const QString &path)
{
    mConfigFile = path;
    mSettings = nullptr;
    ProxyAddress::reset();
}

void SystemConfig::setProxyFile(const QString &path)
{
    ProxyAddress::setFile(path);
}

QString SystemConfig::proxyAddress()
{
    return ProxyAddress::find();
}

qint64 SystemConfig::imageCacheSize()
{
    constexpr qint64 bytesPerMegabyte = 1 << 20;
    return integer("Max/CacheSize", 0) * bytesPerMegabyte;
}

int SystemConfig::photoDownloaderNumber()
{
    return integer("Max/PhotoDownloaderNumber", 5);
}

int SystemConfig::pageCacheNumber()
{
    return integer("Max/PageCacheNumber", 20);
}

int SystemConfig::pageCacheSeconds()
{
    return qMax(1, integer("Max/PageCacheSeconds", 60));
}

int SystemConfig::scrollAreaMaxColumn()
{
    return integer("Max/ScrollAreaMaxCol", 4);
}

int SystemConfig::searchPageSize()
{
    return 100;
}

int SystemConfig::messageFont()
{
    return integer("Font/Message", 10);
}

int SystemConfig::menuFont()
{
    return integer("Font/Menu", 16);
}

int SystemConfig::buttonFont()
{
    return integer("Font/Button", 12);
}

int SystemConfig::titleFont()
{
    return integer("Font/Title", 30);
}

int SystemConfig::appNormalFont()
{
    return integer("Font/AppNormal", 12);
}

int SystemConfig::borderLeft()
{
    return integer("Layout/border_left", 50);
}

int SystemConfig::borderTop()
{
    return integer("Layout/border_top", 30);
}

int SystemConfig::borderRight()
{
    return integer("Layout/border_right", 50);
}

int SystemConfig::borderBottom()
{
    return integer("Layout/border_bottom", 30);
}

int SystemConfig::messageHeight()
{
    return integer("Layout/Message_Height", 200);
}

int SystemConfig::messageSpace()
{
    return integer("Layout/Message_Space", 40);
}

QSize SystemConfig::photoItemSize()
{
    return size("QSize/Photo_Item", {280, 200});
}

int SystemConfig::photoItemHeight()
{
    return photoItemSize().height();
}

QSize SystemConfig::logoIconSize()
{
    return size("QSize/Logo_Icon", {60, 60});
}

QSize SystemConfig::buttonIconSize()
{
    return size("QSize/Button_Icon", {40, 40});
}

QSize SystemConfig::userHeadPortraitSize()
{
    return size("QSize/User_HeadPortrait", {50, 50});
}

QSize SystemConfig::messagePictureSize()
{
    return size("QSize/Message_Picture", {120, 120});
}

QSize SystemConfig::albumPictureSize()
{
    return size("QSize/Album_Picture", {150, 150});
}

QString SystemConfig::databasePath()
{
    return value(QStringLiteral("DBPath/DBPath"), QStringLiteral("/var/sns/socialAccountInfo.db"));
}

QString SystemConfig::version()
{
    return value(QStringLiteral("Version/orvala"), QStringLiteral("2.week.number"));
}

QString SystemConfig::feedBase()
{
    QString base = value(QStringLiteral("Service/FeedBase"), serviceOrigin);
    while (base.endsWith(QLatin1Char('/')))
        base.chop(1);
    return base;
}

QString SystemConfig::oauthBase()
{
    const QString base =
        value(QStringLiteral("Service/OAuthBase"), serviceOrigin + QStringLiteral("/o/oauth2/"));
    return base.endsWith(QLatin1Char('/')) ? base : base + QLatin1Char('/');
}

QString SystemConfig::signInPage()
{
    return value(QStringLiteral("Service/SignInPage"),
                 serviceOrigin + QStringLiteral("/ServiceLogin"));
}

QString SystemConfig::oauthScope()
{
    return value(QStringLiteral("Service/Scope"), serviceOrigin + QStringLiteral("/data/"));
}

QString SystemConfig::timeServer()
{
    return value(QStringLiteral("Network/TimeServer"));
}

bool SystemConfig::verifyCertificates()
{
    return settings().value(QStringLiteral("Network/VerifyCertificates"), false).toBool();
}

int SystemConfig::silenceSeconds()
{
    return qBound(0, integer("Network/SilenceSeconds", 0), longestWait);
}

int SystemConfig::idleConnectionSeconds()
{
    return qBound(0, integer("Network/IdleConnectionSeconds", 60), longestWait);
}

qreal SystemConfig::scaleSetting()
{
    const QString text = value(QStringLiteral("Layout/Scale"), QStringLiteral("1")).trimmed();
    if (text.compare(QLatin1String("auto"), Qt::CaseInsensitive) == 0)
        return 0;
    bool isNumber = false;
    const qreal factor = text.toDouble(&isNumber);
    return isNumber && qIsFinite(factor) && factor > 0 ? factor : 1;
}

qreal SystemConfig::scale()
{
    return scaleInForce;
}

void SystemConfig::setScale(qreal factor)
{
    scaleInForce = factor;
}

int SystemConfig::displayWidth()
{
    return qRound((mScreen_Width - borderLeft() - borderRight()) * scale());
}
