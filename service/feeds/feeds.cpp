#include "feeds/feeds.h"

#include "feeds/asked.h"
#include "index/catalogue.h"
#include "index/database.h"
#include "index/users.h"

namespace {

constexpr PageLimits pagedLimits = {25, 1000};
constexpr PageLimits listLimits = {10'000, 10'000}; // for clients that read a whole list at once

FeedJson photoEntries(const std::vector<PhotoRecord> &photos, const std::string &origin)
{
    FeedJson entries = FeedJson::array();
    for (const PhotoRecord &photo : photos)
        entries.push_back(photoEntry(photo, origin));
    return entries;
}

std::vector<std::int64_t> slice(const std::vector<std::int64_t> &ids, const Page &page)
{
    const auto size = static_cast<std::int64_t>(ids.size());
    const std::int64_t first = std::min(page.start - 1, size);
    const std::int64_t last = std::min(first + page.count, size);
    return {ids.begin() + first, ids.begin() + last};
}

std::optional<PhotoRecord> coverOf(Session &session, const AlbumRecord &album)
{
    return album.cover ? photoWithId(session, *album.cover) : std::nullopt;
}

} // namespace

Feeds::Feeds(Database &database, std::string scheme)
    : mDatabase(database)
    , mScheme(std::move(scheme))
    , mFeatured(database)
{
}

void Feeds::addRoutes(Router &router)
{
    const std::string base = "data/feed/api/";
    router.add("GET", base + "featured", openToAll(&Feeds::featured));
    router.add("GET", base + "all", openToAll(&Feeds::search));
    router.add("GET", base + "user/*", withToken(&Feeds::albums));
    router.add("GET", base + "user/*/contacts", withToken(&Feeds::contacts));
    router.add("GET", base + "user/*/albumid/*", withToken(&Feeds::albumPhotos));
    router.add("GET", base + "user/*/albumid/*/photoid/*", withToken(&Feeds::aboutPhoto));
}

Router::Handler Feeds::openToAll(Answer answer)
{
    return [this, answer](const Router::Call &call, httplib::Response &response) {
        auto reader = mDatabase.read();
        Asked asked{reader, call, response, originOf(call.request, mScheme), {}, {}};
        (this->*answer)(asked);
    };
}

Router::Handler Feeds::withToken(Answer answer)
{
    return [this, answer](const Router::Call &call, httplib::Response &response) {
        auto reader = mDatabase.read();
        Asked asked{reader, call, response, originOf(call.request, mScheme), {}, {}};
        if (asked.identify())
            (this->*answer)(asked);
    };
}

void Feeds::featured(Asked &asked)
{
    const auto page = asked.page(pagedLimits);
    if (!page)
        return;
    const FeaturedList::Ids ids = mFeatured.photos(asked.session);
    const std::vector<std::int64_t> shown = slice(*ids, *page);
    const auto photos = photosWithIds(asked.session, shown);
    mFeatured.noteShown(shown);
    asked.send("Featured photos", *page, ids->size(), photoEntries(photos, asked.origin));
}

void Feeds::search(Asked &asked)
{
    const auto page = asked.page(pagedLimits);
    if (!page)
        return;
    const std::string expression = searchExpression(asked.call.request.get_param_value("q"));
    if (expression.empty())
        return asked.send("Search", *page, 0, FeedJson::array());
    const auto photos =
        photosWithIds(asked.session, searchPhotos(asked.session, expression, *page));
    asked.send("Search", *page, searchCount(asked.session, expression),
               photoEntries(photos, asked.origin));
}

void Feeds::albums(Asked &asked)
{
    const auto page = asked.page(listLimits);
    if (!page)
        return;
    const AlbumFilter filter{asked.owner.id, asked.owner.id == asked.asking.id};
    FeedJson entries = FeedJson::array();
    for (const AlbumRecord &album : albumsOf(asked.session, filter, *page)) {
        const auto cover = coverOf(asked.session, album);
        entries.push_back(albumEntry(album, cover ? &*cover : nullptr, asked.origin));
    }
    asked.send(asked.owner.name, *page, albumCount(asked.session, filter), std::move(entries));
}

void Feeds::albumPhotos(Asked &asked)
{
    const auto page = asked.page(listLimits);
    const auto album = page ? asked.album() : std::nullopt;
    if (!album)
        return;
    const auto photos = photosOf(asked.session, album->id, *page);
    asked.send(album->title, *page, album->photoCount, photoEntries(photos, asked.origin));
}

void Feeds::aboutPhoto(Asked &asked)
{
    const auto photo = asked.photo();
    if (!photo)
        return;
    const std::string kind = asked.call.request.get_param_value("kind");
    if (kind == "comment")
        comments(asked, *photo);
    else if (kind == "tag")
        tags(asked, *photo);
    else
        asked.refuse(400, "kind takes comment or tag");
}

void Feeds::comments(Asked &asked, const PhotoRecord &photo)
{
    FeedJson entries = FeedJson::array();
    for (const CommentRecord &comment : commentsOf(asked.session, photo.id))
        entries.push_back(commentEntry(comment, photo, asked.origin));
    asked.sendAll(photo.title, std::move(entries));
}

void Feeds::tags(Asked &asked, const PhotoRecord &photo)
{
    FeedJson entries = FeedJson::array();
    for (const std::string &tag : tagsOf(asked.session, photo.id))
        entries.push_back(tagEntry(tag, photo, asked.origin));
    asked.sendAll(photo.title, std::move(entries));
}

void Feeds::contacts(Asked &asked)
{
    FeedJson entries = FeedJson::array();
    for (const UserRecord &user : allUsers(asked.session)) {
        if (user.id == asked.owner.id)
            continue;
        const auto portrait = portraitOf(asked.session, user.id);
        entries.push_back(contactEntry(user, portrait ? &*portrait : nullptr, asked.origin));
    }
    asked.sendAll(asked.owner.name, std::move(entries));
}
