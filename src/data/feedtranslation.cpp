#include "data/feedtranslation.h"

#include "base/log.h"
#include "data/datacreator.h"
#include "data/jsonwalk.h"

#include <memory>
#include <new>

using namespace jsonwalk;

namespace {

const QString kFeed = QStringLiteral("feed");

void appendRecords(const DataCreator &creator, const JsonObject &document, Package *package)
{
    const JsonObject &feed = object(document, kFeed);
    package->mIsFeed = document.contains(kFeed);
    const QVariantList &entries = list(feed, QStringLiteral("entry"));
    if (package->mProperty.mType == SEARCH_MORE_PHOTOS_LIST)
        package->retireRecords();
    package->mDataList.reserve(package->count() + entries.size());
    for (const QVariant &entry : entries)
        package->mDataList.append(creator.createData(toObject(entry)));
}

// Feed-level members go into the package and its records.
void applyFeedMembers(const JsonObject &feed, Package *package)
{
    const int type = package->mProperty.mType;
    if (hasTotalCount(type)) {
        package->mTotalCount = number(feed, QStringLiteral("openSearch$totalResults"));
        package->mProperty.mTotalCount = package->mTotalCount;
    }
    if (type == ALBUMS_LIST || type == ALBUM_PHOTOS_LIST) {
        const QString owner = text(feed, QStringLiteral("gphoto$user"));
        for (OrvalaData *record : qAsConst(package->mDataList))
            record->setUserId(owner);
    }
}

template <typename Text>
ErrorCode create(const PackageProperty &property, const Text &feedText, Package **out)
{
    const JsonObject document = JsonParser::parse(feedText);
    std::unique_ptr<Package> package(new (std::nothrow) Package);
    if (!package) {
        logLine("Error: Failed to allocate memory!");
        return NET_OUT_OF_MEMORY;
    }
    package->mProperty = property;
    const DataCreator *creator = DataCreator::forType(property.mType);
    if (!creator) {
        if (property.mType == INVALID_LIST)
            logLine("INVALID type!");
        logLine("Error: Unkown Type.");
        return NET_REJECTED;
    }
    appendRecords(*creator, document, package.get());
    applyFeedMembers(object(document, kFeed), package.get());
    *out = package.release();
    return NET_SUCCESS;
}

template <typename Text>
ErrorCode append(const PackageProperty &property, const Text &feedText, Package *package)
{
    if (property.mType != FEATURED_PHOTOS_LIST && property.mType != SEARCH_MORE_PHOTOS_LIST) {
        logLine("appendPackage other property type!!");
        return NET_SUCCESS;
    }
    const JsonObject document = JsonParser::parse(feedText);
    appendRecords(OrvalaPhotoCreator(), document, package);
    return NET_SUCCESS;
}

} // namespace

ErrorCode createPackage(const PackageProperty &property, const QString &feedText, Package **out)
{
    return create(property, feedText, out);
}

ErrorCode createPackage(const PackageProperty &property, const QByteArray &utf8, Package **out)
{
    return create(property, utf8, out);
}

ErrorCode appendPackage(const PackageProperty &property, const QString &feedText, Package **package)
{
    return append(property, feedText, *package);
}

ErrorCode appendPackage(const PackageProperty &property, const QByteArray &utf8, Package **package)
{
    return append(property, utf8, *package);
}
