#include "feeds/featuredlist.h"

#include "index/catalogue.h"
#include "index/revisions.h"

FeaturedList::Ids FeaturedList::photos(Session &session)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    const std::int64_t current = revision(session, Revision::Photos);
    if (current != mRevision) {
        mIds = std::make_shared<const std::vector<std::int64_t>>(featuredOrder(session));
        mRevision = current;
    }
    return mIds;
}
