#include "feeds/feeds.h"

#include "base/texts.h"
#include "feeds/asked.h"
#include "feeds/shownphotos.h"
#include "index/catalogue.h"
#include "index/database.h"
#include "index/photosearch.h"
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

// The part of several lists, one behind the other, that a page shows.
class AlbumPage
{
public:
    explicit AlbumPage(const Page &page)
        : mRest(page)
    {
    }
    // A list of which all is at hand.
    void add(std::vector<AlbumRecord> list)
    {
        const auto size = static_cast<std::int64_t>(list.size());
        const auto first = std::min(mRest.start - 1, size);
        const auto last = std::min(first + mRest.count, size);
        add({list.begin() + first, list.begin() + last}, size);
    }
    // Of a list of `total` albums, those of rest().
    void add(const std::vector<AlbumRecord> &part, std::int64_t total)
    {
        mAlbums.insert(mAlbums.end(), part.begin(), part.end());
        mTotal += total;
        mRest.start = std::max<std::int64_t>(mRest.start - total, 1);
        mRest.count -= static_cast<std::int64_t>(part.size());
    }
    // What is still to come, counted from the start of the next list.
    const Page &rest() const { return mRest; }
    const std::vector<AlbumRecord> &albums() const { return mAlbums; }
    std::int64_t total() const { return mTotal; }

private:
    Page mRest;
    std::vector<AlbumRecord> mAlbums;
    std::int64_t mTotal = 0;
};

} // namespace

Feeds::Feeds(Database &database, ShownPhotos &shown, Settings settings)
    : mDatabase(database)
    , mShown(shown)
    , mSettings(std::move(settings))
    , mFeatured(database, mSettings.today)
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
        Asked asked{reader, call, response, originOf(call.request, mSettings.scheme), {}, {}};
        (this->*answer)(asked);
    };
}

Router::Handler Feeds::withToken(Answer answer)
{
    return [this, answer](const Router::Call &call, httplib::Response &response) {
        auto reader = mDatabase.read();
        Asked asked{reader, call, response, originOf(call.request, mSettings.scheme), {}, {}};
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
    const FoundPhotos found =
        searchPhotos(asked.session, asked.call.request.get_param_value("q"), *page);
    const auto photos = photosWithIds(asked.session, found.ids);
    asked.send("Search", *page, found.total, photoEntries(photos, asked.origin));
}

// One's own feed begins with what is asked for most and ends with the years; the folders between
// them are what others see.
void Feeds::albums(Asked &asked)
{
    const auto page = asked.page(listLimits);
    if (!page)
        return;
    AlbumPage list(*page);
    const Gathering gathering = gatheringFor(asked);
    list.add(gatheredAlbums(asked.session, gathering));
    const AlbumFilter filter{asked.owner.id, asked.isOwn()};
    const std::int64_t count = albumCount(asked.session, filter);
    list.add(albumsOf(asked.session, filter, list.rest()), count);
    list.add(periodAlbums(asked.session, gathering));
    FeedJson entries = FeedJson::array();
    for (const AlbumRecord &album : list.albums()) {
        const auto cover = coverOf(asked.session, album);
        entries.push_back(albumEntry(album, cover ? &*cover : nullptr, asked.origin));
    }
    asked.send(asked.owner.name, *page, list.total(), std::move(entries));
}

// Others have no part in the albums that are gathered from all folders.
Gathering Feeds::gatheringFor(const Asked &asked) const
{
    Gathering gathering{asked.owner.id, mSettings.today(), {}};
    if (asked.isOwn()) {
        gathering.kinds = mSettings.gathered;
        mShown.write();
    }
    return gathering;
}

void Feeds::albumPhotos(Asked &asked)
{
    const auto page = asked.page(listLimits);
    if (!page)
        return;
    if (!parseNumber(asked.call.pieces[1]))
        return gatheredPhotos(asked, *page);
    const auto album = asked.album();
    if (!album)
        return;
    const auto photos = photosOf(asked.session, album->id, *page);
    asked.send(album->title, *page, album->photoCount, photoEntries(photos, asked.origin));
}

void Feeds::gatheredPhotos(Asked &asked, const Page &page)
{
    const std::string &id = asked.call.pieces[1];
    const Gathering gathering = gatheringFor(asked);
    const auto album = gatheredAlbum(asked.session, gathering, id);
    if (!album)
        return asked.refuse(404, "there is no such album");
    const auto photos = ::gatheredPhotos(asked.session, gathering, id, page);
    asked.send(album->title, page, album->photoCount, photoEntries(photos, asked.origin));
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
