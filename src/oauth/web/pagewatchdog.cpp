#include "oauth/web/pagewatchdog.h"

#include "base/log.h"

#include <unistd.h>

#include <fstream>
#include <system_error>
#include <utility>

namespace {

constexpr int TICKS = 10; // of the patience

// In bytes; 0 where the system does not tell.
qint64 residentMemory()
{
    qint64 total = 0, resident = 0;
    std::ifstream("/proc/self/statm") >> total >> resident;
    return resident * ::sysconf(_SC_PAGESIZE);
}

} // namespace

PageWatchdog::PageWatchdog(std::chrono::milliseconds patience, QObject *parent,
                           std::function<void()> onHung)
    : QObject(parent)
    , mTick(patience / TICKS)
    , mOnHung(std::move(onHung))
{
    connect(&mBeat, &QTimer::timeout, this, [this] {
        const std::lock_guard<std::mutex> lock(mMutex);
        mHasBeaten = true;
    });
    mBeat.start(mTick / 2);
    try {
        mThread = std::thread([this] { watch(); });
    } catch (const std::system_error &) {
        logLine("{PageWatchdog} no thread to watch the page's scripts from");
    }
}

PageWatchdog::~PageWatchdog()
{
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mIsOver = true;
    }
    mOver.notify_one();
    if (mThread.joinable())
        mThread.join();
}

// Missed ticks are counted rather than time: a process that was stopped for an hour, or a device
// that slept, has missed one.
void PageWatchdog::watch()
{
    const qint64 before = residentMemory();
    std::unique_lock<std::mutex> lock(mMutex);
    int missed = 0;
    while (!mOver.wait_for(lock, mTick, [this] { return mIsOver; })) {
        missed = std::exchange(mHasBeaten, false) ? 0 : missed + 1;
        if (missed < TICKS && residentMemory() - before < MOST_GROWTH)
            continue;
        lock.unlock();
        mOnHung();
        return;
    }
}

void PageWatchdog::endProcess()
{
    logLine("{PageWatchdog} the sign-in page holds up the program or fills its memory: it ends");
    ::_exit(EXIT_HUNG);
}
