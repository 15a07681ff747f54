#include "feeds/feeds.h"

#include "base/texts.h"
#include "feeds/feedrequest.h"
#include "feeds/feedwriter.h"
#include "index/catalogue.h"
#include "index/database.h"
#include "index/tokens.h"
#include "index/users.h"

namespace {

constexpr PageLimits pagedLimits = {25, 1000};
constexpr PageLimits listLimits = {10'000, 10'000}; // for clients that read a whole list at once
constexpr int forbidden = 403;
constexpr int notFound = 404;

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

// "default" is the one who asks; anybody else goes by number or mail.
std::optional<UserRecord> userNamed(Session &session, const std::string &name,
                                    const UserRecord &asking)
{
    if (name == "default")
        return asking;
    if (const auto id = parseNumber(name))
        return userWithId(session, *id);
    return userWithMail(session, name);
}

} // namespace

struct Feeds::Asked
{
    Session &session;
    const Router::Call &call;
    httplib::Response &response;
    std::string origin;
    UserRecord asking; // with a token only
    UserRecord owner;  // of the feed; with a token only

    void refuse(int status, const std::string &message) { answerError(response, status, message); }
    std::optional<Page> page(const PageLimits &limits)
    {
        auto page = pageOf(call.request, limits);
        if (!page)
            refuse(400, "start-index and max-results take numbers");
        return page;
    }
    // The album of the address, if the one who asks may see it.
    std::optional<AlbumRecord> album()
    {
        const auto id = parseNumber(call.pieces[1]);
        auto album = id ? albumWithId(session, owner.id, *id) : std::nullopt;
        if (!album)
            refuse(notFound, "there is no such album");
        else if (album->isPrivate && owner.id != asking.id) {
            refuse(forbidden, "this album is private");
            album.reset();
        }
        return album;
    }
    void send(const std::string &title, const Page &page, std::int64_t total, FeedJson entries)
    {
        const std::string &target = call.request.target;
        FeedHead head{origin + target.substr(0, target.find('?')), title, total, page, nullptr};
        if (owner.id != 0)
            head.owner = &owner;
        response.set_content(feedDocument(head, std::move(entries)),
                             "application/json; charset=UTF-8");
    }
    // A list that is always sent whole.
    void sendAll(const std::string &title, FeedJson entries)
    {
        const auto count = static_cast<std::int64_t>(entries.size());
        send(title, {1, count}, count, std::move(entries));
    }
};

Feeds::Feeds(Database &database, std::string scheme)
    : mDatabase(database)
    , mScheme(std::move(scheme))
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
        if (identify(asked))
            (this->*answer)(asked);
    };
}

bool Feeds::identify(Asked &asked) const
{
    const auto asking = userOfToken(asked.session, accessTokenOf(asked.call.request));
    if (!asking) {
        asked.response.set_header("WWW-Authenticate", "Bearer");
        asked.refuse(401, "the access token is missing, unknown or has expired");
        return false;
    }
    const auto owner = userNamed(asked.session, asked.call.pieces[0], *asking);
    if (!owner) {
        asked.refuse(notFound, "there is no such user");
        return false;
    }
    asked.asking = *asking;
    asked.owner = *owner;
    return true;
}

void Feeds::featured(Asked &asked)
{
    const auto page = asked.page(pagedLimits);
    if (!page)
        return;
    const FeaturedList::Ids ids = mFeatured.photos(asked.session);
    const auto photos = photosWithIds(asked.session, slice(*ids, *page));
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
    const auto album = asked.album();
    if (!album)
        return;
    const auto id = parseNumber(asked.call.pieces[2]);
    const auto photo = id ? photoWithId(asked.session, *id) : std::nullopt;
    if (!photo || photo->albumId != album->id)
        return asked.refuse(notFound, "there is no such photo");
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
