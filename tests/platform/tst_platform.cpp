#include "platform/fakeshell.h"
#include "platform/ipc.h"
#include "platform/ipcthread.h"
#include "platform/shelllink.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFileInfo>
#include <QTemporaryDir>
#include <QTest>

#include <memory>

using netcommon::Ipc;
using netcommon::IpcThread;

class TestPlatform : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        mFolder = std::make_unique<QTemporaryDir>();
        QVERIFY(QDir().mkpath(QFileInfo(path()).path()));
        mContext = std::make_unique<QObject>();
        mExits.clear();
        mZones.clear();
        Ipc::setSocketPath(path().toStdString());
    }

    void cleanup()
    {
        delete IpcThread::getInstance();
        delete Ipc::getInstance();
        mContext.reset();
    }

    void answersByItselfWithoutAShell()
    {
        startThread();
        QElapsedTimer timer;
        timer.start();
        Ipc::getInstance()->requestExit(false);
        QTRY_COMPARE(mExits, QList<Exit>({{true, false}}));
        QVERIFY(timer.elapsed() < 900);

        Ipc::getInstance()->requestExit(false);
        QTRY_COMPARE(mExits.size(), 2);
    }

    void letsTheShellAnswer()
    {
        FakeShell shell(path());
        startThread();
        QVERIFY(shell.accept());
        Ipc::getInstance()->requestExit(true);
        const auto request = shell.next();
        QVERIFY(request);
        QCOMPARE(request->type, int(netcommon::MSG_REQUEST_EXIT));
        QCOMPARE(request->params[0], 1);
        QVERIFY(shell.send(netcommon::MSG_EXIT, 1, 0));
        QTRY_COMPARE(mExits.size(), 1);
        // Nothing is left to do by itself: the library will not answer too.
        QCOMPARE(ShellLink::shared()->nextTimeout(), -1);
    }

    void answersForASilentShell()
    {
        FakeShell shell(path());
        startThread();
        QVERIFY(shell.accept());
        QElapsedTimer timer;
        timer.start();
        Ipc::getInstance()->requestExit(false);
        Ipc::getInstance()->requestExit(false);
        QTRY_COMPARE(mExits, QList<Exit>({{true, false}}));
        QVERIFY2(timer.elapsed() >= 900 && timer.elapsed() < 1900, "an answer after one second");
        QCOMPARE(ShellLink::shared()->nextTimeout(), -1);
    }

    void followsAShellThatComesBack()
    {
        startThread();
        for (int life = 0; life < 3; ++life) {
            FakeShell shell(path());
            QVERIFY(shell.accept());
            QVERIFY(shell.send(netcommon::MSG_TIME_ZONE, life));
            QTRY_COMPARE(mZones.size(), life + 1);
        }
    }

    void ignoresEverythingElse()
    {
        FakeShell shell(path());
        startThread();
        QVERIFY(shell.accept());
        for (int size : {0, 1, 4, 67, 69, 200}) { // a message cut short or with something behind it
            const QByteArray bytes =
                QByteArray(1, netcommon::MSG_EXIT).leftJustified(size, '\0', true);
            QVERIFY(shell.sendBytes(bytes));
        }
        for (int type : {-1, 0, 3, 4, 5, 6, 7, INT_MAX, INT_MIN})
            QVERIFY(shell.send(type, 1, 1));
        QVERIFY(shell.send(netcommon::MSG_TIME_ZONE, -5));
        QTRY_COMPARE(mZones, QList<int>({-5}));
        QVERIFY(mExits.isEmpty());
    }

    void hearsTheLastWordsOfAShell()
    {
        FakeShell shell(path());
        startThread();
        QVERIFY(shell.accept());
        // The shell ends with a message of the program unread, right behind an empty packet.
        IpcThread::getInstance()->updatePlaybackinfo(2, 0, 0, 0);
        QVERIFY(shell.sendBytes(QByteArray()));
        QVERIFY(shell.send(netcommon::MSG_EXIT, 1, 0));
        QVERIFY(shell.send(netcommon::MSG_EXIT, 0, 1));
        shell.hangUp();
        QTRY_COMPARE(mExits, QList<Exit>({{true, false}, {false, true}}));
    }

    void saysGoodbyeInOrder()
    {
        FakeShell shell(path());
        startThread();
        QVERIFY(shell.accept());
        IpcThread *thread = IpcThread::getInstance();
        Ipc *ipc = Ipc::getInstance();
        thread->updatePlaybackinfo(2, 2, 0, 0);
        thread->responseParent(1);
        QVERIFY(thread->isRunning());
        thread->responseParent(2);
        QVERIFY(thread->wait(2000));
        delete thread;
        QVERIFY(ipc->sendIpcMsg({netcommon::MSG_EXIT_REQUEST, {}}));
        delete ipc;

        const QList<QPair<int, int>> expected = {{netcommon::MSG_PLAYBACK_INFO, 2},
                                                 {netcommon::MSG_RESPONSE, 1},
                                                 {netcommon::MSG_RESPONSE, 2},
                                                 {netcommon::MSG_EXIT_REQUEST, 0}};
        for (const auto &[type, param] : expected) {
            const auto message = shell.next();
            QVERIFY(message);
            QCOMPARE(message->type, type);
            QCOMPARE(message->params[0], param);
        }
        QVERIFY(shell.programHasGone());
    }

    void neverWaitsForABusyShell()
    {
        FakeShell shell(path());
        startThread();
        QVERIFY(shell.accept());
        QElapsedTimer timer;
        timer.start();
        int sent = 0;
        while (sent < 100000 && Ipc::getInstance()->sendIpcMsg({netcommon::MSG_PLAYBACK_INFO, {}}))
            ++sent;
        QVERIFY(sent > 0 && sent < 100000);
        Ipc::getInstance()->requestExit(false);
        QTRY_COMPARE(mExits.size(), 1);
        QVERIFY(timer.elapsed() < 900);
    }

private:
    using Exit = QPair<bool, bool>;

    void startThread()
    {
        IpcThread *thread = IpcThread::getInstance();
        connect(thread, &IpcThread::signalExit, mContext.get(),
                [this](bool isFromParent, bool isSystemError) {
                    mExits.append({isFromParent, isSystemError});
                });
        connect(thread, &IpcThread::signalSetTimezone, mContext.get(),
                [this](int zone) { mZones.append(zone); });
        thread->start();
        QVERIFY(thread->isReady());
    }

    // Longer than a socket address has room for.
    QString path() const { return mFolder->filePath(QString(120, QLatin1Char('d')) + "/shell"); }

    std::unique_ptr<QTemporaryDir> mFolder;
    std::unique_ptr<QObject> mContext; // its thread is the test's: signals arrive queued
    QList<Exit> mExits;
    QList<int> mZones;
};

QTEST_GUILESS_MAIN(TestPlatform)
#include "tst_platform.moc"
