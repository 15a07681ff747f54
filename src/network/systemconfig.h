#pragma once

#include <QSize>
#include <QString>
#include <QStringList>

class QSettings;

// The program's read-only settings: getters over one INI file, each with the default that holds
// when the file or the key is missing or the value is no number. Every getter reads the key afresh.
// The screen size is set once at start; all sizes are pixels of the 1280 x 720 layout unless a
// comment says otherwise.
class SystemConfig
{
public:
    static int mScreen_Width;
    static int mScreen_Height;

    // Proxy as "host:port", or a null text for none: the INI file's, else the one that the device's
    // menu wrote. Found once, kept for the run.
    static QString proxyAddress();

    static qint64 imageCacheSize();     // bytes; 0 without the key
    static int photoDownloaderNumber(); // image downloads at once
    static int pageCacheNumber();       // pages kept
    static int pageCacheSeconds();      // lifetime of a first page, 1 at least
    static int scrollAreaMaxColumn();   // columns of the focus grid
    static int searchPageSize();        // results of one search block, fixed: 100

    static int messageFont(); // points, as all fonts
    static int menuFont();
    static int buttonFont();
    static int titleFont();
    static int appNormalFont();

    static int borderLeft();
    static int borderTop();
    static int borderRight();
    static int borderBottom();
    static int messageHeight();
    static int messageSpace();

    static QSize photoItemSize();
    static int photoItemHeight();
    static QSize logoIconSize();
    static QSize buttonIconSize();
    static QSize userHeadPortraitSize();
    static QSize messagePictureSize();
    static QSize albumPictureSize();

    static QString databasePath();
    static QString version();

    // Group "Service": where the album service is.
    static QString feedBase();   // origin of every feed path, no slash at the end
    static QString oauthBase();  // ends in /o/oauth2/
    static QString signInPage(); // the service's own sign-in page
    static QString oauthScope();

    // Group "Network".
    static QString timeServer();        // empty: no time request
    static bool verifyCertificates();   // false: every certificate is accepted
    static int silenceSeconds();        // after which a GET is given up; 0: never
    static int idleConnectionSeconds(); // how long a parked connection keeps its sockets

    // Layout/Scale: the factor by which the whole interface is scaled, 1 without the key; 0 stands
    // for "auto". Photos are asked for and painted at device pixels: see displayWidth().
    static qreal scaleSetting();
    // The factor in force since start-up (1 until set).
    static qreal scale();
    static void setScale(qreal factor);
    // Width of the space between the left and right border, in device pixels.
    static int displayWidth();

    // A raw value for keys that belong to one module only (group/key), and its default.
    static QString value(const QString &key, const QString &fallback = QString());
    static QStringList keysOf(const QString &group);

    // For tests: another INI file and proxy file; also forgets the cached proxy.
    static void setConfigFile(const QString &path);
    static void setProxyFile(const QString &path);

private:
    static QSettings &settings();
    static int integer(const char *key, int fallback);
    static QSize size(const char *key, const QSize &fallback);

    static QString mConfigFile;
    static QSettings *mSettings;
};
