#include "feeds/featuredlist.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/featureddeck.h"
#include "index/revisions.h"

#include <spdlog/spdlog.h>

#include <utility>

namespace {

constexpr std::chrono::milliseconds cheap{10};
constexpr int restFactor = 50; // how many times the cost of reading passes before the next reading
constexpr std::size_t shownPerWrite = 24; // three pages of a grid

} // namespace

FeaturedList::FeaturedList(Database &database, Today today)
    : mDatabase(database)
    , mToday(std::move(today))
{
}

FeaturedList::~FeaturedList()
{
    writeShown();
}

FeaturedList::Ids FeaturedList::photos(Session &session)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    const std::string day = mToday();
    if (day != mDay) {
        writeShown();
        mDay = day;
        mIsDayBegun = false;
        mRevision = -1;
        mCost = {};
    }
    const std::int64_t current = revision(session, Revision::Photos);
    if (current != mRevision && isDue()) {
        read(session);
        mRevision = current;
    }
    return mIds;
}

void FeaturedList::noteShown(const std::vector<std::int64_t> &ids)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    mShown.insert(mShown.end(), ids.begin(), ids.end());
    if (mShown.size() >= shownPerWrite)
        writeShown();
}

bool FeaturedList::isDue() const
{
    return mCost < cheap || Clock::now() - mRead > mCost * restFactor;
}

void FeaturedList::read(Session &session)
{
    const Clock::time_point start = Clock::now();
    mIds = std::make_shared<const std::vector<std::int64_t>>(featuredOrder(session, mDay));
    mRead = Clock::now();
    mCost = mRead - start;
}

// What is not written is shown again, no more.
void FeaturedList::writeShown()
{
    if (mShown.empty())
        return;
    try {
        if (!std::exchange(mIsDayBegun, true))
            beginFeaturedDay(mDatabase, mDay);
        markFeatured(mDatabase, mShown, mDay);
    } catch (const SQLite::Exception &exception) {
        spdlog::warn("what has been shown cannot be written down: {}", exception.what());
    }
    mShown.clear();
}
