#include "data/download.h"
#include "data/photomanager.h"
#include "heldanswers.h"
#include "support/logcapture.h"
#include "support/testconfig.h"
#include "testpictures.h"

#include <QtTest>

namespace {

QStringList calls; // "name code" in the order of the calls

void callback(QString &url, ErrorCode code)
{
    calls << url.section('/', -1) + ' ' + QString::number(code);
}

void clearingCallback(QString &url, ErrorCode code)
{
    callback(url, code);
    PhotoManager::clearAll();
}

void repeatingCallback(QString &url, ErrorCode code)
{
    callback(url, code);
    if (calls.size() < 3)
        PhotoManager::downloadPhoto(url, &repeatingCallback);
}

QByteArray png(int width, int height)
{
    return encoded(plain(width, height), "png");
}

} // namespace

class TestPhotoManager : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        mServer = std::make_unique<MisbehavingServer>();
        mHeld = HeldAnswers();
        mConfig.write("[Max]\nCacheSize=1\n");
        PhotoManager::init();
        calls.clear();
    }
    void cleanup()
    {
        PhotoManager::clearAll();
        mServer.reset();
    }

    void runsFiveAndReusesTheFinishedConnection()
    {
        for (int i = 0; i < 8; ++i) {
            mServer->on("/" + QByteArray::number(i), mHeld.hold());
            QVERIFY(download(QString::number(i)));
        }
        const auto other = [](QString &, ErrorCode) { calls << "other"; };
        QVERIFY(download("7") && PhotoManager::downloadPhoto(mServer->url("/7"), other));
        QTRY_COMPARE(mHeld.count(), 5);
        QCOMPARE(mServer->requests().size(), 5);
        mHeld.answerFirst(MisbehavingServer::answer(png(4, 4)));
        QTRY_COMPARE(mHeld.count(), 5);
        QCOMPARE(calls.size(), 1);
        QCOMPARE(mServer->requests().last().path, QByteArray("/5"));
        QCOMPARE(mServer->connections(), 5);
        while (calls.size() < 9) {
            QTRY_VERIFY(mHeld.count() > 0);
            const int before = calls.size();
            mHeld.answerFirst(MisbehavingServer::answer(png(4, 4)));
            QTRY_VERIFY(calls.size() > before);
        }
        QCOMPARE(calls.mid(7), QStringList({"7 0", "other"}));
        QCOMPARE(mServer->requests().size(), 8);
        QCOMPARE(mServer->connections(), 5);
    }

    void tellsEachFailureAndGoesOn()
    {
        mConfig.write("[Max]\nPhotoDownloaderNumber=0\nCacheSize=1\n"); // one at a time at least
        mServer->on("/page", MisbehavingServer::html());
        mServer->on("/empty", MisbehavingServer::answer(""));
        mServer->on("/reset", MisbehavingServer::reset());
        mServer->on("/bomb", MisbehavingServer::gzipBomb(70));
        mServer->on("/good", MisbehavingServer::answer(png(4, 4)));
        for (const char *name : {"page", "empty", "gone", "reset", "bomb", "good"})
            QVERIFY(download(name));
        QTRY_COMPARE(calls.size(), 6);
        QCOMPARE(calls, QStringList({"page -1", "empty -88", "gone -89", "reset -87", "bomb -91",
                                     "good 0"}));
        QVERIFY(PhotoManager::getPhoto(mServer->url("/good")));
    }

    void keepsWhatFitsIntoTheCache()
    {
        TestTarget small({20, 20}), large({20, 20});
        const QString smallUrl = mServer->url("/small"), largeUrl = mServer->url("/large");
        mServer->on("/small", MisbehavingServer::answer(png(200, 100)));
        mServer->on("/large", MisbehavingServer::answer(png(513, 512)));
        mServer->on("/fits", MisbehavingServer::answer(png(512, 512))); // exactly 1 MiB
        Download::mHomeLabelUrlHash = {{smallUrl, &small}, {largeUrl, &large}};
        LogCapture log;
        for (const QString &url : {smallUrl, largeUrl})
            QVERIFY(PhotoManager::downloadPhoto(url, &Download::downloadHomePhotoCB));
        QTRY_VERIFY(log.contains("downloadPhoto failed to show photo :" + largeUrl));
        QVERIFY(large.shown.isNull() && large.placeholder.isEmpty());
        QTRY_COMPARE(small.shown.size(), QSize(20, 10));
        QVERIFY(PhotoManager::getPhoto(smallUrl) && download("fits"));
        QTRY_COMPARE(calls.size(), 1);
        QVERIFY(PhotoManager::getPhoto(mServer->url("/fits")) && !PhotoManager::getPhoto(smallUrl));
    }

    void cancelsOnlyWhatWaits()
    {
        for (int i = 0; i < 7; ++i) {
            mServer->on("/" + QByteArray::number(i), mHeld.hold());
            QVERIFY(download(QString::number(i)));
        }
        PhotoManager::cancelDownloadWaitingPhoto();
        QTRY_COMPARE(mHeld.count(), 5);
        while (mHeld.count() > 0)
            mHeld.answerFirst(MisbehavingServer::answer("no picture"));
        QTRY_COMPARE(calls.size(), 5);
        QCOMPARE(mServer->requests().size(), 5);
        mServer->on("/6", MisbehavingServer::answer(png(4, 4)));
        QVERIFY(download("6")); // nothing of it is left
        QTRY_COMPARE(calls.last(), QString("6 0"));
    }

    void allowsRequestsAndClearingInsideCallbacks()
    {
        mServer->on("/0", MisbehavingServer::answer(png(4, 4)));
        mServer->on("/1", mHeld.hold());
        QVERIFY(PhotoManager::downloadPhoto(mServer->url("/gone"), &repeatingCallback));
        QTRY_COMPARE(calls, QStringList({"gone -89", "gone -89", "gone -89"}));
        calls.clear();
        QVERIFY(download("1"));
        QTRY_COMPARE(mHeld.count(), 1);
        QVERIFY(PhotoManager::downloadPhoto(mServer->url("/0"), &clearingCallback));
        QVERIFY(PhotoManager::downloadPhoto(mServer->url("/0"), &callback));
        QTRY_COMPARE(calls, QStringList({"0 0"})); // the second one is not called any more
        QVERIFY(!PhotoManager::getPhoto(mServer->url("/0")));
        mHeld.answerFirst(MisbehavingServer::answer(png(4, 4)));
        mServer->on("/2", MisbehavingServer::answer(png(4, 4)));
        QVERIFY(download("2"));
        QTRY_COMPARE(calls, QStringList({"0 0", "2 0"})); // nor the one that was running
    }

private:
    bool download(const QString &name)
    {
        return PhotoManager::downloadPhoto(mServer->url('/' + name), &callback);
    }

    TestConfig mConfig;
    std::unique_ptr<MisbehavingServer> mServer;
    HeldAnswers mHeld;
};

QTEST_MAIN(TestPhotoManager)
#include "tst_photomanager.moc"
