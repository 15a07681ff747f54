#include "network/systemconfig.h"

#include <QTemporaryDir>
#include <QtTest>

// The settings file and the search for the proxy.
class TestSystemConfig : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        mFolder = std::make_unique<QTemporaryDir>();
        SystemConfig::setConfigFile(path("config.ini"));
        SystemConfig::setProxyFile(path("proxyaddr"));
    }

    void awkwardValuesHaveAClearMeaning()
    {
        configure(
            "[Max]\nPageCacheNumber=many\n[Layout]\nScale=auto\n[Service]\nScope=a, b\n"
            "[DBPath]\nDBPath=/home/J\xC3\xBCrgen/a.db\n[Network]\nIdleConnectionSeconds=-4\n");
        QCOMPARE(SystemConfig::pageCacheNumber(), 20);
        QCOMPARE(SystemConfig::scaleSetting(), 0.0);
        QCOMPARE(SystemConfig::oauthScope(), "a, b");
        QCOMPARE(SystemConfig::databasePath(), QString::fromUtf8("/home/J\xC3\xBCrgen/a.db"));
        QCOMPARE(SystemConfig::idleConnectionSeconds(), 0);
        configure("[Layout]\nScale=-2\n");
        QCOMPARE(SystemConfig::scaleSetting(), 1.0);
    }

    void proxyFileIsRetriedUntilItHoldsAnAddress()
    {
        configure("[Network]\nIP=10.0.0.1\n"); // without a port: no proxy
        QVERIFY(SystemConfig::proxyAddress().isNull());
        for (const char *text : {"", "1.2.3", "          \n10.0.0.9:1\n"}) {
            write("proxyaddr", text);
            QVERIFY(SystemConfig::proxyAddress().isNull());
        }

        write("proxyaddr", "10.0.0.2:8080\r\nsecond line\n");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.2:8080");
        write("proxyaddr", "10.0.0.3:8080\n");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.2:8080");
        configure("[Network]\nIP=10.0.0.1\nPort=3128\n"); // goes before the file
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.1:3128");
    }

private:
    QString path(const char *name) const { return mFolder->filePath(QLatin1String(name)); }

    void write(const char *name, const QByteArray &text) const
    {
        QFile file(path(name));
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(text);
    }

    void configure(const QByteArray &text) const
    {
        write("config.ini", text);
        SystemConfig::setConfigFile(path("config.ini"));
    }

    std::unique_ptr<QTemporaryDir> mFolder;
};

QTEST_GUILESS_MAIN(TestSystemConfig)
#include "tst_systemconfig.moc"
