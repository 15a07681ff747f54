#pragma once

#include "base/texts.h"

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

class Database;
class Session;

// The order of the featured photos, kept in memory between changes of the index: a page far behind
// costs what the first one costs. While a scan changes a large index all the time the list may lag
// some seconds behind. What has been shown is written down from time to time and at the end. May be
// used from any thread.
class FeaturedList
{
public:
    using Ids = std::shared_ptr<const std::vector<std::int64_t>>;
    using Today = std::function<std::string()>; // as 2026-05-01

    explicit FeaturedList(Database &database, Today today = localDay);
    ~FeaturedList();

    Ids photos(Session &session);
    void noteShown(const std::vector<std::int64_t> &ids);

private:
    using Clock = std::chrono::steady_clock;

    bool isDue() const;
    void read(Session &session);
    void writeShown();

    Database &mDatabase;
    const Today mToday;
    std::mutex mMutex;
    Clock::duration mCost{};
    Clock::time_point mRead{};
    std::int64_t mRevision = -1;
    std::string mDay;
    bool mIsDayBegun = false;
    Ids mIds;
    std::vector<std::int64_t> mShown; // not yet written
};
