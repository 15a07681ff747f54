#include "http/workers.h"

#include <spdlog/spdlog.h>

#include <system_error>
#include <thread>

Workers::Workers(std::size_t most)
    : mMost(most)
{
}

void Workers::enqueue(Work work)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    mWaiting.push_back(std::move(work));
    if (mIdle >= mWaiting.size() || mThreads.size() >= mMost) {
        mWake.notify_one();
        return;
    }
    try {
        mThreads.emplace_back([this] { run(); });
    } catch (const std::system_error &error) { // those that there are have to do
        spdlog::warn("no further thread: {}", error.what());
    }
}

void Workers::shutdown()
{
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mStopping = true;
    }
    mWake.notify_all();
    for (std::thread &thread : mThreads)
        thread.join();
    mThreads.clear();
}

void Workers::run()
{
    std::unique_lock<std::mutex> lock(mMutex);
    for (;;) {
        ++mIdle;
        mWake.wait(lock, [this] { return mStopping || !mWaiting.empty(); });
        --mIdle;
        if (mWaiting.empty())
            return;
        Work work = std::move(mWaiting.front());
        mWaiting.pop_front();
        lock.unlock();
        work();
        work = nullptr; // with what it holds
        lock.lock();
    }
}
