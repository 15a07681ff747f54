#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <vector>

class Session;

// The order of the featured photos, kept in memory between changes of the index: a page far behind
// costs what the first one costs. May be used from any thread.
class FeaturedList
{
public:
    using Ids = std::shared_ptr<const std::vector<std::int64_t>>;
    Ids photos(Session &session);

private:
    std::mutex mMutex;
    std::int64_t mRevision = -1;
    Ids mIds;
};
