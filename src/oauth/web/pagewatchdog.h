#pragma once

#include <QObject>
#include <QTimer>

#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <thread>

// Looks from a thread of its own whether the event loop still turns while web pages run in it, and
// what memory they take. A page's script without end would hold up the program for ever, or fill
// the device, and the engine cannot interrupt it: when the loop has stood still for longer than the
// patience, or the process has grown by MOST_GROWTH, the watchdog ends the process, which whoever
// started it starts again. Nothing that is kept suffers: every file of the program outlives a
// sudden end.
class PageWatchdog : public QObject
{
    Q_OBJECT

public:
    // How the process ends: the software failed.
    static constexpr int EXIT_HUNG = 70;
    static constexpr qint64 MOST_GROWTH = 512LL * 1024 * 1024; // bytes of resident memory

    // onHung is called on the watchdog's thread, at most once, and then instead of ending.
    explicit PageWatchdog(std::chrono::milliseconds patience, QObject *parent = nullptr,
                          std::function<void()> onHung = endProcess);
    ~PageWatchdog() override;

private:
    static void endProcess();
    void watch();

    const std::chrono::milliseconds mTick;
    const std::function<void()> mOnHung;
    QTimer mBeat;
    std::mutex mMutex; // guards the two below
    bool mHasBeaten = false;
    bool mIsOver = false;
    std::condition_variable mOver;
    std::thread mThread;
};
