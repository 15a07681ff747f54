#include "feeds/feedwriter.h"

#include "base/texts.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace {

// A grid's picture is at most this large on a 1080-line screen: 1.5 times 224 x 176 points. The
// last thumbnail of a photo is the one that grids fetch, so none is larger.
struct Box
{
    int width, height;
};
constexpr std::array<Box, 3> thumbnailBoxes = {Box{112, 88}, Box{224, 176},
                                               Box{widestThumbnail, 264}};

struct Size
{
    int width, height;
};

Size fitted(const PhotoRecord &photo, const Box &box)
{
    if (photo.width <= 0 || photo.height <= 0)
        return {box.width, box.height};
    const double scale =
        std::min({1.0, double(box.width) / photo.width, double(box.height) / photo.height});
    return {std::max(1, static_cast<int>(std::lround(photo.width * scale))),
            std::max(1, static_cast<int>(std::lround(photo.height * scale)))};
}

FeedJson feedText(const std::string &text)
{
    return {{"$t", text}};
}

FeedJson feedNumber(std::int64_t number)
{
    return feedText(std::to_string(number));
}

// Where the picture of a photo is fetched; "/s" and a width go in front of the last "/" for a
// smaller one.
std::string pictureAddress(const PhotoRecord &photo, const std::string &origin)
{
    const std::string name = percentEncoded(withoutExtension(photo.fileName));
    return origin + "/photos/" + photo.key + "/" + name + ".jpg";
}

std::string sizedAddress(const PhotoRecord &photo, const std::string &origin, int width)
{
    std::string address = pictureAddress(photo, origin);
    return address.insert(address.rfind('/'), "/s" + std::to_string(width));
}

std::string thumbnailAddress(const PhotoRecord &photo, const std::string &origin)
{
    return sizedAddress(photo, origin, fitted(photo, thumbnailBoxes.back()).width);
}

FeedJson thumbnail(const PhotoRecord &photo, const std::string &origin, const Box &box)
{
    const Size size = fitted(photo, box);
    return {{"url", sizedAddress(photo, origin, size.width)},
            {"width", size.width},
            {"height", size.height}};
}

FeedJson thumbnails(const PhotoRecord &photo, const std::string &origin)
{
    FeedJson list = FeedJson::array();
    for (const Box &box : thumbnailBoxes)
        list.push_back(thumbnail(photo, origin, box));
    return list;
}

FeedJson mediaContent(const PhotoRecord &photo, const std::string &origin)
{
    return FeedJson::array({{{"url", pictureAddress(photo, origin)},
                             {"width", photo.width},
                             {"height", photo.height},
                             {"type", "image/jpeg"},
                             {"medium", "image"}}});
}

FeedJson authorOf(std::int64_t id, const std::string &name)
{
    return FeedJson::array({{{"name", feedText(name)},
                             {"gphoto$user", feedNumber(id)},
                             {"gphoto$nickname", feedText(name)}}});
}

std::string withZone(const std::string &time)
{
    return time.empty() ? time : time + ".000Z";
}

std::string userFeed(const std::string &origin, std::int64_t userId)
{
    return origin + "/data/feed/api/user/" + std::to_string(userId);
}

std::string albumFeed(const std::string &origin, std::int64_t userId, const std::string &album)
{
    return userFeed(origin, userId) + "/albumid/" + album;
}

std::string photoFeed(const std::string &origin, const PhotoRecord &photo)
{
    return albumFeed(origin, photo.userId, std::to_string(photo.albumId)) + "/photoid/" +
           std::to_string(photo.id);
}

void addPlace(FeedJson &entry, const PhotoRecord &photo)
{
    if (!photo.latitude || !photo.longitude)
        return;
    char position[64];
    std::snprintf(position, sizeof position, "%.6f %.6f", *photo.latitude, *photo.longitude);
    entry["georss$where"] = {{"gml$Point", {{"gml$pos", feedText(position)}}}};
}

} // namespace

FeedJson photoEntry(const PhotoRecord &photo, const std::string &origin)
{
    FeedJson entry = {{"id", feedText(photoFeed(origin, photo))},
                      {"published", feedText(withZone(photo.published))},
                      {"updated", feedText(withZone(photo.published))},
                      {"title", feedText(photo.title)},
                      {"summary", feedText(photo.caption)},
                      {"content", {{"type", "image/jpeg"}, {"src", pictureAddress(photo, origin)}}},
                      {"author", authorOf(photo.userId, photo.userName)},
                      {"gphoto$id", feedNumber(photo.id)},
                      {"gphoto$albumid", feedNumber(photo.albumId)},
                      {"gphoto$width", feedNumber(photo.width)},
                      {"gphoto$height", feedNumber(photo.height)},
                      {"gphoto$size", feedNumber(photo.fileSize)},
                      {"gphoto$commentCount", feedNumber(photo.commentCount)},
                      {"media$group",
                       {{"media$content", mediaContent(photo, origin)},
                        {"media$thumbnail", thumbnails(photo, origin)},
                        {"media$keywords", feedText(photo.keywords)}}}};
    addPlace(entry, photo);
    return entry;
}

FeedJson albumEntry(const AlbumRecord &album, const PhotoRecord *cover, const std::string &origin)
{
    FeedJson group = FeedJson::object();
    if (cover) {
        group["media$content"] = mediaContent(*cover, origin);
        group["media$thumbnail"] =
            FeedJson::array({thumbnail(*cover, origin, thumbnailBoxes.back())});
    }
    return {{"id", feedText(albumFeed(origin, album.userId, album.feedId))},
            {"published", feedText(withZone(album.published))},
            {"updated", feedText(withZone(album.published))},
            {"title", feedText(album.title)},
            {"author", authorOf(album.userId, album.userName)},
            {"gphoto$id", feedText(album.feedId)},
            {"gphoto$user", feedNumber(album.userId)},
            {"gphoto$nickname", feedText(album.userName)},
            {"gphoto$access", feedText(album.isPrivate ? "private" : "public")},
            {"gphoto$numphotos", feedNumber(album.photoCount)},
            {"media$group", std::move(group)}};
}

FeedJson commentEntry(const CommentRecord &comment, const PhotoRecord &photo,
                      const std::string &origin)
{
    const std::string id = photoFeed(origin, photo) + "/commentid/" + std::to_string(comment.id);
    return {{"id", feedText(id)},
            {"published", feedText(withZone(comment.published))},
            {"updated", feedText(withZone(comment.published))},
            {"title", feedText(comment.userName)},
            {"content", {{"type", "text"}, {"$t", comment.content}}},
            {"author", authorOf(comment.userId, comment.userName)},
            {"gphoto$id", feedNumber(comment.id)},
            {"gphoto$photoid", feedNumber(photo.id)},
            {"gphoto$albumid", feedNumber(photo.albumId)}};
}

FeedJson tagEntry(const std::string &tag, const PhotoRecord &photo, const std::string &origin)
{
    return {{"id", feedText(photoFeed(origin, photo) + "/tag/" + percentEncoded(tag))},
            {"updated", feedText(withZone(photo.published))},
            {"title", feedText(tag)},
            {"summary", feedText("")},
            {"author", authorOf(photo.userId, photo.userName)},
            {"gphoto$photoid", feedNumber(photo.id)}};
}

FeedJson contactEntry(const UserRecord &user, const PhotoRecord *portrait,
                      const std::string &origin)
{
    return {{"id", feedText(userFeed(origin, user.id))},
            {"title", feedText(user.name)},
            {"author", authorOf(user.id, user.name)},
            {"gphoto$user", feedNumber(user.id)},
            {"gphoto$nickname", feedText(user.name)},
            {"gphoto$thumbnail", feedText(portrait ? thumbnailAddress(*portrait, origin) : "")}};
}

std::string feedDocument(const FeedHead &head, FeedJson entries)
{
    FeedJson feed = {{"id", feedText(head.id)},
                     {"updated", feedText(withZone(utcTime(currentSeconds())))},
                     {"title", feedText(head.title)},
                     {"openSearch$totalResults", feedNumber(head.total)},
                     {"openSearch$startIndex", feedNumber(head.page.start)},
                     {"openSearch$itemsPerPage", feedNumber(head.page.count)}};
    if (head.owner) {
        feed["author"] = authorOf(head.owner->id, head.owner->name);
        feed["gphoto$user"] = feedNumber(head.owner->id);
        feed["gphoto$nickname"] = feedText(head.owner->name);
    }
    feed["entry"] = std::move(entries);
    const FeedJson document = {
        {"version", "1.0"}, {"encoding", "UTF-8"}, {"feed", std::move(feed)}};
    return document.dump(-1, ' ', false, FeedJson::error_handler_t::replace);
}

std::string entryDocument(FeedJson entry)
{
    const FeedJson document = {
        {"version", "1.0"}, {"encoding", "UTF-8"}, {"entry", std::move(entry)}};
    return document.dump(-1, ' ', false, FeedJson::error_handler_t::replace);
}
