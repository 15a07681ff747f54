#pragma once

#include "common/ui/remotekeys.h"
#include "data/heldanswers.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "data/testpictures.h"
#include "support/logcapture.h"
#include "support/misbehavingserver.h"
#include "support/testconfig.h"
#include "ui/samplefeeds.h"

#include <QKeyEvent>
#include <QSignalSpy>
#include <QtTest>

#include <memory>

// What the tests of the screens share: a configuration and a server of their own, and keys.
class ScreenCase : public QObject
{
protected:
    // The service is the test's server, with these lines in the configuration besides.
    void configure(const QByteArray &lines = QByteArray())
    {
        mConfig.write("[Max]\nCacheSize=64\n[Service]\nFeedBase=" + mServer->url("").toUtf8() +
                      '\n' + lines);
        PhotoManager::init();
    }
    void startServer()
    {
        mLog = std::make_unique<LogCapture>();
        mServer = std::make_unique<MisbehavingServer>();
    }
    // When the screens are gone.
    void forgetAll()
    {
        PackageManager::clearAll();
        PhotoManager::clearAll();
        mServer.reset();
        mLog.reset();
    }
    static void press(std::initializer_list<int> keys)
    {
        for (int key : keys)
            QTest::sendKeyEvent(QTest::Press, QApplication::focusWidget(), Qt::Key(key), QString(),
                                {});
    }
    static void show(QWidget *screen)
    {
        screen->resize(1280, 720);
        screen->show();
        QVERIFY(QTest::qWaitForWindowActive(screen));
    }

    TestConfig mConfig;
    std::unique_ptr<LogCapture> mLog;
    std::unique_ptr<MisbehavingServer> mServer;
};
