#include "index/catalogue.h"

#include "index/database.h"
#include "index/photorows.h"

namespace {

#define ALBUM_COLUMNS                                                                              \
    "SELECT a.id, a.user, u.name, a.title, a.private, a.photoCount, a.published, a.cover "         \
    "FROM albums a JOIN users u ON u.id = a.user "

#define PATH_OF_PHOTO                                                                              \
    "u.photos || '/' || CASE a.folder WHEN '' THEN '' ELSE a.folder || '/' END || p.name"

AlbumRecord albumAt(const Query &query)
{
    AlbumRecord album;
    album.id = query.number(0);
    album.feedId = query.text(0);
    album.userId = query.number(1);
    album.userName = query.text(2);
    album.title = query.text(3);
    album.isPrivate = query.number(4) != 0;
    album.photoCount = static_cast<int>(query.number(5));
    album.published = query.text(6);
    if (!query.isNull(7))
        album.cover = query.number(7);
    return album;
}

} // namespace

std::vector<AlbumRecord> albumsOf(Session &session, const AlbumFilter &filter, const Page &page)
{
    std::vector<AlbumRecord> albums;
    Query query(session,
                ALBUM_COLUMNS "WHERE a.user = ? AND a.photoCount > 0 AND (NOT a.private OR ?) "
                              "ORDER BY a.published DESC, a.title, a.id LIMIT ? OFFSET ?",
                filter.userId, int(filter.withPrivate), page.count, page.start - 1);
    while (query.next())
        albums.push_back(albumAt(query));
    return albums;
}

std::int64_t albumCount(Session &session, const AlbumFilter &filter)
{
    Query query(session,
                "SELECT count(*) FROM albums "
                "WHERE user = ? AND photoCount > 0 AND (NOT private OR ?)",
                filter.userId, int(filter.withPrivate));
    return query.next() ? query.number(0) : 0;
}

std::optional<AlbumRecord> albumWithId(Session &session, std::int64_t userId, std::int64_t albumId)
{
    Query query(session, ALBUM_COLUMNS "WHERE a.user = ? AND a.id = ?", userId, albumId);
    if (!query.next())
        return std::nullopt;
    return albumAt(query);
}

std::optional<std::string> folderOfAlbum(Session &session, std::int64_t albumId)
{
    Query query(session, "SELECT folder FROM albums WHERE id = ?", albumId);
    if (!query.next())
        return std::nullopt;
    return query.text(0);
}

std::vector<PhotoRecord> photosOf(Session &session, std::int64_t albumId, const Page &page)
{
    std::vector<PhotoRecord> photos;
    Query query(session,
                PHOTO_COLUMNS "WHERE p.album = ? AND p.present = 1 "
                              "ORDER BY p.published, p.name LIMIT ? OFFSET ?",
                albumId, page.count, page.start - 1);
    while (query.next())
        photos.push_back(photoAt(query));
    return photos;
}

std::optional<PhotoRecord> photoWithId(Session &session, std::int64_t photoId)
{
    Query query(session, PHOTO_COLUMNS "WHERE p.id = ? AND p.present = 1", photoId);
    if (!query.next())
        return std::nullopt;
    return photoAt(query);
}

std::vector<PhotoRecord> photosWithIds(Session &session, const std::vector<std::int64_t> &ids)
{
    std::vector<PhotoRecord> photos;
    for (const std::int64_t id : ids) {
        if (auto photo = photoWithId(session, id))
            photos.push_back(std::move(*photo));
    }
    return photos;
}

std::vector<CommentRecord> commentsOf(Session &session, std::int64_t photoId)
{
    std::vector<CommentRecord> comments;
    Query query(session,
                "SELECT c.id, c.author, u.name, c.content, c.published FROM comments c "
                "JOIN users u ON u.id = c.author WHERE c.photo = ? ORDER BY c.published, c.id",
                photoId);
    while (query.next())
        comments.push_back(
            {query.number(0), query.number(1), query.text(2), query.text(3), query.text(4)});
    return comments;
}

std::vector<std::string> tagsOf(Session &session, std::int64_t photoId)
{
    std::vector<std::string> tags;
    Query query(session, "SELECT tag FROM tags WHERE photo = ? ORDER BY id", photoId);
    while (query.next())
        tags.push_back(query.text(0));
    return tags;
}

std::optional<PhotoRecord> portraitOf(Session &session, std::int64_t userId)
{
    Query query(session,
                "SELECT cover FROM albums WHERE user = ? AND NOT private AND cover IS NOT NULL "
                "ORDER BY published DESC, id LIMIT 1",
                userId);
    if (!query.next())
        return std::nullopt;
    return photoWithId(session, query.number(0));
}

std::optional<PhotoFile> fileWithKey(Session &session, const std::string &key)
{
    Query query(session,
                "SELECT " PATH_OF_PHOTO
                ", p.id, p.size, p.changed, u.photos, p.shown FROM photos p "
                "JOIN albums a ON a.id = p.album JOIN users u ON u.id = a.user "
                "WHERE p.key = ? AND p.present = 1",
                key);
    if (!query.next())
        return std::nullopt;
    return PhotoFile{query.text(0), query.text(1) + "-" + query.text(2) + "-" + query.text(3),
                     query.text(4), query.number(1), query.number(5) != 0};
}

std::vector<UnreadablePhoto> unreadablePhotos(Session &session)
{
    std::vector<UnreadablePhoto> photos;
    Query query(session, "SELECT " PATH_OF_PHOTO ", p.error FROM photos p "
                         "JOIN albums a ON a.id = p.album JOIN users u ON u.id = a.user "
                         "WHERE p.error <> '' AND p.present = 1 "
                         "UNION ALL SELECT u.photos || '/' || l.path, l.reason FROM leftOut l "
                         "JOIN users u ON u.id = l.user ORDER BY 1");
    while (query.next())
        photos.push_back({query.text(0), query.text(1)});
    return photos;
}
