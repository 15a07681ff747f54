#include "index/photosearch.h"

#include "index/database.h"

#define INSERT_SEARCH_TEXTS                                                                        \
    "INSERT INTO photoSearch (rowid, title, caption, tags, album) "                                \
    "SELECT p.id, p.title, p.caption, "                                                            \
    "coalesce((SELECT group_concat(tag, ', ') FROM tags WHERE photo = p.id), ''), a.title "        \
    "FROM photos p JOIN albums a ON a.id = p.album "                                               \
    "WHERE p.present = 1 AND p.error = '' AND NOT a.private "

void refreshPhotoSearch(Session &session, std::int64_t photoId)
{
    Query(session, "DELETE FROM photoSearch WHERE rowid = ?", photoId).run();
    Query(session, INSERT_SEARCH_TEXTS "AND p.id = ?", photoId).run();
}

void refreshAlbumSearch(Session &session, std::int64_t albumId)
{
    Query(session, "DELETE FROM photoSearch WHERE rowid IN (SELECT id FROM photos WHERE album = ?)",
          albumId)
        .run();
    Query(session, INSERT_SEARCH_TEXTS "AND a.id = ?", albumId).run();
}
