#include "network/systemconfig.h"
#include "support/logcapture.h"

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

    void defaultsHoldWithoutFile()
    {
        QCOMPARE(SystemConfig::imageCacheSize(), 0);
        QCOMPARE(SystemConfig::photoDownloaderNumber(), 5);
        QCOMPARE(SystemConfig::photoItemSize(), QSize(280, 200));
        QCOMPARE(SystemConfig::databasePath(), "/var/sns/socialAccountInfo.db");
        QCOMPARE(SystemConfig::feedBase(), "https://album.orvala.example");
        QCOMPARE(SystemConfig::oauthBase(), "https://album.orvala.example/o/oauth2/");
        QVERIFY(!SystemConfig::verifyCertificates());
        QCOMPARE(SystemConfig::scaleSetting(), 1.0);
        QVERIFY(SystemConfig::timeServer().isEmpty());
        QVERIFY(SystemConfig::proxyAddress().isNull());
    }

    void valuesComeFromTheFile()
    {
        configure(
            "[Max]\nCacheSize=4096\n[QSize]\nPhoto_Item=@Size(300 210)\n"
            "[Version]\norvala=3.1.2\n[Keys]\nred=1\nblue=2\n"
            "[Service]\nFeedBase=http://127.0.0.1:81/\nOAuthBase=http://127.0.0.1:81/o/oauth2\n"
            "[Network]\nVerifyCertificates=true\n");
        QCOMPARE(SystemConfig::imageCacheSize(), Q_INT64_C(4096) * 1024 * 1024);
        QCOMPARE(SystemConfig::photoItemHeight(), 210);
        QCOMPARE(SystemConfig::version(), "3.1.2");
        QCOMPARE(SystemConfig::keysOf("Keys"), QStringList({"blue", "red"}));
        QCOMPARE(SystemConfig::feedBase(), "http://127.0.0.1:81");
        QCOMPARE(SystemConfig::oauthBase(), "http://127.0.0.1:81/o/oauth2/");
        QVERIFY(SystemConfig::verifyCertificates());
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

    void displayWidthIsScaled()
    {
        configure("[Layout]\nborder_left=11\n");
        SystemConfig::mScreen_Width = 1280;
        SystemConfig::setScale(1.5);
        QCOMPARE(SystemConfig::displayWidth(), 1829); // 1828.5
        SystemConfig::setScale(1);
        QCOMPARE(SystemConfig::displayWidth(), 1219);
    }

    void configuredProxyIsReadOnce()
    {
        configure("[Network]\nIP=10.0.0.1\nPort=3128\n");
        write("proxyaddr", "10.0.0.2:80\n");
        LogCapture log;
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.1:3128");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.1:3128");
        QCOMPARE(LogCapture::lines(), QStringList({"read proxy from config.ini",
                                                   "[cache config.ini]proxyAddr = 10.0.0.1:3128"}));
    }

    void proxyFileIsRetriedUntilItHoldsAnAddress_data()
    {
        QTest::addColumn<QByteArray>("first");
        QTest::newRow("empty") << QByteArray();
        QTest::newRow("five bytes") << QByteArray("1.2.3");
        QTest::newRow("blank line") << QByteArray("          \n10.0.0.9:1\n");
    }

    void proxyFileIsRetriedUntilItHoldsAnAddress()
    {
        QFETCH(QByteArray, first);
        configure("[Network]\nIP=10.0.0.1\n"); // without a port: no proxy
        LogCapture log;
        QVERIFY(SystemConfig::proxyAddress().isNull());
        QCOMPARE(LogCapture::lines().mid(1, 1), QStringList("read /var/sns/proxyaddr."));
        write("proxyaddr", first);
        QVERIFY(SystemConfig::proxyAddress().isNull());
        QVERIFY(LogCapture::contains("osdProxyAddr is NULL"));

        write("proxyaddr", "10.0.0.2:8080\r\nsecond line\n");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.2:8080");
        QCOMPARE(LogCapture::lines().last(), "osdProxyAddr is not NULL");
        write("proxyaddr", "10.0.0.3:8080\n");
        QCOMPARE(SystemConfig::proxyAddress(), "10.0.0.2:8080");
        QCOMPARE(LogCapture::lines().last(), "[cache file]osdProxyAddr = 10.0.0.2:8080");
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
