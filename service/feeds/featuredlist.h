#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>
#include <vector>

class Session;

// The order of the featured photos, kept in memory between changes of the index: a page far behind
// costs what the first one costs. While a scan changes a large index all the time the list may lag
// some seconds behind. May be used from any thread.
class FeaturedList
{
public:
    using Ids = std::shared_ptr<const std::vector<std::int64_t>>;
    Ids photos(Session &session);

private:
    using Clock = std::chrono::steady_clock;

    bool isDue() const;
    void read(Session &session);

    std::mutex mMutex;
    Clock::duration mCost{};
    Clock::time_point mRead{};
    std::int64_t mRevision = -1;
    Ids mIds;
};
