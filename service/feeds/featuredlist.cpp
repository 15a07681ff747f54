#include "feeds/featuredlist.h"

#include "index/catalogue.h"
#include "index/revisions.h"

namespace {

constexpr std::chrono::milliseconds cheap{10};
constexpr int restFactor = 50; // how many times the cost of reading passes before the next reading

} // namespace

FeaturedList::Ids FeaturedList::photos(Session &session)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    const std::int64_t current = revision(session, Revision::Photos);
    if (current != mRevision && isDue()) {
        read(session);
        mRevision = current;
    }
    return mIds;
}

bool FeaturedList::isDue() const
{
    return mCost < cheap || Clock::now() - mRead > mCost * restFactor;
}

void FeaturedList::read(Session &session)
{
    const Clock::time_point start = Clock::now();
    mIds = std::make_shared<const std::vector<std::int64_t>>(featuredOrder(session));
    mRead = Clock::now();
    mCost = mRead - start;
}
