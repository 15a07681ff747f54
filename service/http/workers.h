#pragma once

#include <httplib.h>

#include <condition_variable>
#include <deque>
#include <mutex>

// Threads that answer requests: as many as there was work for at once, up to a bound, so that
// clients that are slow to send or to read keep nobody else waiting.
class Workers : public httplib::TaskQueue
{
public:
    using Work = std::function<void()>;

    explicit Workers(std::size_t most);

    void enqueue(Work work) override;
    // Waits for what has begun and for what is waiting.
    void shutdown() override;

private:
    void run();

    const std::size_t mMost;
    std::mutex mMutex;
    std::condition_variable mWake;
    std::deque<Work> mWaiting;
    std::vector<std::thread> mThreads;
    std::size_t mIdle = 0;
    bool mStopping = false;
};
