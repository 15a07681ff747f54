#include "index/albumwriter.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "index/database.h"
#include "index/photosearch.h"
#include "index/revisions.h"

namespace {

constexpr std::size_t keyBytes = 16;
constexpr std::int64_t nanoseconds = 1'000'000'000;

struct AlbumPlace
{
    std::int64_t user;
    std::int64_t album;
};

// The album's row, made or changed to the state.
std::int64_t writeAlbum(Session &session, const FolderState &state)
{
    Query(session,
          "INSERT INTO albums (user, folder, title, private) VALUES (?1, ?2, ?3, ?4) "
          "ON CONFLICT (user, folder) DO UPDATE SET title = ?3, private = ?4",
          state.userId, state.folder, state.title, int(state.isPrivate))
        .run();
    Query query(session, "SELECT id FROM albums WHERE user = ? AND folder = ?", state.userId,
                state.folder);
    return query.next() ? query.number(0) : 0;
}

std::string titleOf(const FoundFile &file)
{
    return file.metadata.title.empty() ? validUtf8(withoutExtension(file.name))
                                       : file.metadata.title;
}

std::string timeOf(const FoundFile &file)
{
    return file.metadata.taken.empty() ? localTime(file.changed / nanoseconds)
                                       : file.metadata.taken;
}

// What the photo is known by when its bytes are not.
std::string sizeAndTime(const FoundFile &file)
{
    return std::to_string(file.size) + " " + std::to_string(file.changed);
}

// The photo takes its new place, with all that belongs to it. Another one that was there before and
// is gone makes room. The result is the album that it has left.
std::int64_t movePhoto(Session &session, std::int64_t albumId, const FoundFile &file)
{
    std::int64_t oldAlbum = 0;
    {
        Query query(session, "SELECT album FROM photos WHERE id = ?", file.movedFrom);
        oldAlbum = query.next() ? query.number(0) : 0;
    }
    Query(session, "DELETE FROM photos WHERE album = ? AND name = ? AND present = 0 AND id <> ?",
          albumId, file.name, file.movedFrom)
        .run();
    Query(session, "UPDATE OR IGNORE photos SET album = ?, name = ? WHERE id = ?", albumId,
          file.name, file.movedFrom)
        .run();
    return oldAlbum;
}

// A file that changed keeps its id, its key, its comments and what people tagged it with.
std::int64_t writePhoto(Session &session, const AlbumPlace &place, const FoundFile &file)
{
    const PhotoMetadata &metadata = file.metadata;
    Query query(
        session,
        "INSERT INTO photos (album, name, key, size, changed, present, error, mimeType, width, "
        "height, title, caption, published, latitude, longitude, user, added, content) "
        "VALUES (?1, ?2, ?3, ?4, ?5, 1, ?6, ?7, ?8, ?9, ?10, ?11, ?12, ?13, ?14, ?15, ?16, ?17) "
        "ON CONFLICT (album, name) DO UPDATE SET size = ?4, changed = ?5, present = 1, "
        "error = ?6, mimeType = ?7, width = ?8, height = ?9, "
        "title = CASE givenTitle WHEN '' THEN ?10 ELSE givenTitle END, "
        "caption = CASE givenCaption WHEN '' THEN ?11 ELSE givenCaption END, "
        "published = ?12, latitude = ?13, longitude = ?14, content = ?17 RETURNING id",
        place.album, file.name, randomText(keyBytes), file.size, file.changed, file.error,
        metadata.mimeType, metadata.width, metadata.height, titleOf(file), metadata.caption,
        timeOf(file), metadata.latitude, metadata.longitude, place.user,
        file.added > 0 ? file.added : currentSeconds(),
        file.content.empty() ? sizeAndTime(file) : file.content);
    return query.next() ? query.number(0) : 0;
}

void writeKeywords(Session &session, std::int64_t photoId, const std::vector<std::string> &keywords)
{
    Query(session, "DELETE FROM tags WHERE photo = ? AND author IS NULL", photoId).run();
    for (const std::string &keyword : keywords) {
        for (const std::string &tag : tagsIn(keyword))
            Query(session,
                  "INSERT OR IGNORE INTO tags (photo, tag) SELECT ?1, ?2 WHERE NOT EXISTS "
                  "(SELECT 1 FROM droppedKeywords WHERE photo = ?1 AND tag = ?2)",
                  photoId, tag)
                .run();
    }
}

void setPresent(Session &session, std::int64_t photoId, bool present)
{
    Query(session, "UPDATE photos SET present = ? WHERE id = ?", int(present), photoId).run();
    refreshPhotoSearch(session, photoId);
}

void refreshAlbum(Session &session, std::int64_t albumId)
{
    Query(session,
          "UPDATE albums SET "
          "photoCount = (SELECT count(*) FROM photos WHERE album = ?1 AND present = 1), "
          "published = coalesce((SELECT max(published) FROM photos "
          "WHERE album = ?1 AND present = 1), ''), "
          "cover = coalesce((SELECT id FROM photos WHERE album = ?1 AND present = 1 "
          "AND error = '' ORDER BY published, name LIMIT 1), "
          "(SELECT id FROM photos WHERE album = ?1 AND present = 1 LIMIT 1)) WHERE id = ?1",
          albumId)
        .run();
}

bool isPrivacyChanged(Session &session, const FolderState &state)
{
    Query query(session, "SELECT private FROM albums WHERE user = ? AND folder = ?", state.userId,
                state.folder);
    return query.next() && (query.number(0) != 0) != state.isPrivate;
}

void renewKey(Session &session, std::int64_t photoId)
{
    Query(session, "UPDATE photos SET key = ? WHERE id = ?", randomText(keyBytes), photoId).run();
}

// The addresses of pictures, which take no token, end when what they show becomes private.
void renewKeys(Session &session, std::int64_t albumId)
{
    std::vector<std::int64_t> photoIds;
    {
        Query query(session, "SELECT id FROM photos WHERE album = ?", albumId);
        while (query.next())
            photoIds.push_back(query.number(0));
    }
    for (const std::int64_t id : photoIds)
        renewKey(session, id);
}

// The photo lay elsewhere before, maybe in another album.
void takeMovedPhoto(Session &session, const AlbumPlace &place, const FoundFile &file,
                    bool isPrivate)
{
    const std::int64_t oldAlbum = movePhoto(session, place.album, file);
    if (oldAlbum == place.album)
        return;
    refreshAlbum(session, oldAlbum);
    if (isPrivate)
        renewKey(session, file.movedFrom);
}

void writeFolder(Session &session, const FolderChanges &changes)
{
    const bool privacyChanged = isPrivacyChanged(session, changes.state);
    const std::int64_t albumId = writeAlbum(session, changes.state);
    const AlbumPlace place{changes.state.userId, albumId};
    for (const FoundFile &file : changes.found) {
        if (file.movedFrom != 0)
            takeMovedPhoto(session, place, file, changes.state.isPrivate);
        const std::int64_t photoId = writePhoto(session, place, file);
        writeKeywords(session, photoId, file.metadata.keywords);
        refreshPhotoSearch(session, photoId);
    }
    for (const std::int64_t photoId : changes.gone)
        setPresent(session, photoId, false);
    for (const std::int64_t photoId : changes.back)
        setPresent(session, photoId, true);
    if (privacyChanged && changes.state.isPrivate)
        renewKeys(session, albumId);
    if (privacyChanged)
        refreshAlbumSearch(session, albumId);
    refreshAlbum(session, albumId);
}

} // namespace

std::map<std::string, KnownAlbum> knownAlbums(Session &session, std::int64_t userId)
{
    std::map<std::string, KnownAlbum> albums;
    Query query(session, "SELECT folder, id, private FROM albums WHERE user = ?", userId);
    while (query.next())
        albums[query.text(0)] = {query.number(1), query.number(2) != 0};
    return albums;
}

std::map<std::string, KnownFile> knownFiles(Session &session, std::int64_t albumId)
{
    std::map<std::string, KnownFile> files;
    Query query(session, "SELECT name, id, size, changed, present FROM photos WHERE album = ?",
                albumId);
    while (query.next())
        files[query.text(0)] = {query.number(1), query.number(2), query.number(3),
                                query.number(4) != 0};
    return files;
}

std::vector<LikePhoto> photosLike(Session &session, std::int64_t userId, const FoundFile &file)
{
    std::vector<LikePhoto> photos;
    const auto add = [&photos](Query &&query) {
        while (query.next())
            photos.push_back({query.number(0), query.text(1), query.text(2)});
    };
    // Folders that are renamed keep the names of their files.
    add(Query(session,
              "SELECT p.id, a.folder, p.name FROM photos p JOIN albums a ON a.id = p.album "
              "WHERE p.content IN (?, ?) AND p.name = ? AND p.user = ? LIMIT 8",
              file.content, sizeAndTime(file), file.name, userId));
    add(Query(session,
              "SELECT p.id, a.folder, p.name FROM photos p JOIN albums a ON a.id = p.album "
              "WHERE p.content IN (?, ?) AND p.user = ? LIMIT 8",
              file.content, sizeAndTime(file), userId));
    return photos;
}

std::int64_t presentPhotos(Session &session, std::int64_t userId)
{
    Query query(session, "SELECT coalesce(sum(photoCount), 0) FROM albums WHERE user = ?", userId);
    return query.next() ? query.number(0) : 0;
}

std::int64_t addPhoto(Database &database, FolderState state, const FoundFile &file,
                      const GivenTexts &texts)
{
    Database::Writer writer(database);
    if (isPrivacyChanged(writer, state)) // while the photo was on its way
        state.isPrivate = !state.isPrivate;
    writeFolder(writer, {state, {file}, {}, {}});
    std::int64_t photoId = 0;
    {
        Query query(writer,
                    "SELECT p.id FROM photos p JOIN albums a ON a.id = p.album "
                    "WHERE a.user = ? AND a.folder = ? AND p.name = ?",
                    state.userId, state.folder, file.name);
        photoId = query.next() ? query.number(0) : 0;
    }
    Query(writer,
          "UPDATE photos SET givenTitle = ?2, givenCaption = ?3, "
          "title = CASE ?2 WHEN '' THEN title ELSE ?2 END, "
          "caption = CASE ?3 WHEN '' THEN caption ELSE ?3 END WHERE id = ?1",
          photoId, texts.title, texts.caption)
        .run();
    refreshPhotoSearch(writer, photoId);
    raiseRevision(writer, Revision::Photos);
    writer.commit();
    return photoId;
}

void writeLeftOut(Database &database, std::int64_t userId, const LeftOut &leftOut)
{
    LeftOut known;
    {
        auto reader = database.read();
        Query query(reader, "SELECT path, reason FROM leftOut WHERE user = ?", userId);
        while (query.next())
            known[query.text(0)] = query.text(1);
    }
    if (known == leftOut)
        return;
    Database::Writer writer(database);
    Query(writer, "DELETE FROM leftOut WHERE user = ?", userId).run();
    for (const auto &[path, reason] : leftOut)
        Query(writer,
              "INSERT INTO leftOut (user, path, reason) SELECT id, ?2, ?3 FROM users WHERE id = ?1",
              userId, path, reason)
            .run();
    writer.commit();
}

void markShown(Database &database, const std::set<std::int64_t> &photoIds)
{
    Database::Writer writer(database);
    for (const std::int64_t id : photoIds)
        Query(writer, "UPDATE photos SET shown = 1 WHERE id = ? AND shown = 0", id).run();
    writer.commit();
}

void writeChanges(Database &database, const std::vector<FolderChanges> &changes)
{
    Database::Writer writer(database);
    for (const FolderChanges &folder : changes) {
        // The user may have been removed while the folder was read.
        if (Query(writer, "SELECT 1 FROM users WHERE id = ?", folder.state.userId).next())
            writeFolder(writer, folder);
    }
    raiseRevision(writer, Revision::Photos);
    writer.commit();
}
