#include "feeds/asked.h"

#include "base/texts.h"
#include "index/catalogue.h"
#include "index/tokens.h"
#include "index/users.h"

namespace {

constexpr int forbidden = 403;
constexpr int notFound = 404;

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

void Asked::refuse(int status, const std::string &message)
{
    answerError(response, status, message);
}

bool Asked::identify()
{
    const auto user = userOfToken(session, accessTokenOf(call.request));
    if (!user) {
        response.set_header("WWW-Authenticate", "Bearer");
        refuse(401, "the access token is missing, unknown or has expired");
        return false;
    }
    const auto named = userNamed(session, call.pieces[0], *user);
    if (!named) {
        refuse(notFound, "there is no such user");
        return false;
    }
    asking = *user;
    owner = *named;
    return true;
}

std::optional<Page> Asked::page(const PageLimits &limits)
{
    auto page = pageOf(call.request, limits);
    if (!page)
        refuse(400, "start-index and max-results take numbers");
    return page;
}

std::optional<AlbumRecord> Asked::album()
{
    const auto id = parseNumber(call.pieces[1]);
    auto album = id ? albumWithId(session, owner.id, *id) : std::nullopt;
    if (!album)
        refuse(notFound, "there is no such album");
    else if (album->isPrivate && !isOwn()) {
        refuse(forbidden, "this album is private");
        album.reset();
    }
    return album;
}

std::optional<PhotoRecord> Asked::photo()
{
    const auto inAlbum = album();
    if (!inAlbum)
        return std::nullopt;
    const auto id = parseNumber(call.pieces[2]);
    auto photo = id ? photoWithId(session, *id) : std::nullopt;
    if (photo && photo->albumId == inAlbum->id)
        return photo;
    refuse(notFound, "there is no such photo");
    return std::nullopt;
}

void Asked::send(const std::string &title, const Page &page, std::int64_t total, FeedJson entries)
{
    const std::string &target = call.request.target;
    FeedHead head{origin + target.substr(0, target.find('?')), title, total, page, nullptr};
    if (owner.id != 0)
        head.owner = &owner;
    response.set_content(feedDocument(head, std::move(entries)), "application/json; charset=UTF-8");
}

void Asked::sendAll(const std::string &title, FeedJson entries)
{
    const auto count = static_cast<std::int64_t>(entries.size());
    send(title, {1, count}, count, std::move(entries));
}
