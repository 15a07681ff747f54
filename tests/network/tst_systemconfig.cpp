#include "support/testconfig.h"

#include <QtTest>

// The settings file and the search for the proxy.
class TestSystemConfig : public QObject
{
    Q_OBJECT

private slots:
    void awkwardValuesHaveAClearMeaning()
    {
        mConfig.write(
            "[Max]\nPageCacheNumber=many\n[Layout]\nScale=auto\n[Service]\nScope=a, b\n"
            "[DBPath]\nDBPath=/home/J\xC3\xBCrgen/a.db\n[Network]\nIdleConnectionSeconds=-4\n");
        QCOMPARE(SystemConfig::pageCacheNumber(), 20);
        QCOMPARE(SystemConfig::scaleSetting(), 0.0);
        QCOMPARE(SystemConfig::oauthScope(), "a, b");
        QCOMPARE(SystemConfig::databasePath(), QString::fromUtf8("/home/J\xC3\xBCrgen/a.db"));
        QCOMPARE(SystemConfig::idleConnectionSeconds(), 0);
        mConfig.write("[Layout]\nScale=-2\n");
        QCOMPARE(SystemConfig::scaleSetting(), 1.0);
    }

    void proxyFileIsRetriedUntilItHoldsAnAddress()
    {
        const QTemporaryDir folder;
        const QString proxyFile = folder.filePath("proxyaddr");
        SystemConfig::setProxyFile(proxyFile);
        mConfig.write("[Network]\nIP=10.0.0.1\n"); // without a port: no proxy
        QVERIFY(SystemConfig::proxyAddress().isNull());
        for (const char *text : {"", "1.2.3", "          \n10.0.0.9:1\n"}) {
            write(proxyFile, text);
            QVERIFY(SystemConfig::proxyAddress().isNull());
        }

        write(proxyFile, "10.0.0.2:8080\r\nsecond line\n");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.2:8080");
        write(proxyFile, "10.0.0.3:8080\n");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.2:8080");
        mConfig.write("[Network]\nIP=10.0.0.1\nPort=3128\n"); // goes before the file
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.1:3128");
    }

private:
    static void write(const QString &path, const QByteArray &text)
    {
        QFile file(path);
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(text);
    }

    TestConfig mConfig;
};

QTEST_GUILESS_MAIN(TestSystemConfig)
#include "tst_systemconfig.moc"
