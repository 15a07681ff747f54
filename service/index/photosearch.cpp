#include "index/photosearch.h"

#include "index/database.h"

// Dates are found by their numbers and by the English name of the month.
#define INSERT_SEARCH_TEXTS                                                                        \
    "INSERT INTO photoSearch (rowid, title, caption, tags, album, person, date) "                  \
    "SELECT p.id, p.title, p.caption, "                                                            \
    "coalesce((SELECT group_concat(tag, ', ') FROM tags WHERE photo = p.id), ''), a.title, "       \
    "u.name, substr(p.published, 1, 10) || ' ' || coalesce((SELECT name FROM months "              \
    "WHERE number = substr(p.published, 6, 2)), '') "                                              \
    "FROM photos p JOIN albums a ON a.id = p.album JOIN users u ON u.id = a.user "                 \
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

void refreshUserSearch(Session &session, std::int64_t userId)
{
    Query(session,
          "DELETE FROM photoSearch WHERE rowid IN (SELECT p.id FROM photos p "
          "JOIN albums a ON a.id = p.album WHERE a.user = ?)",
          userId)
        .run();
    Query(session, INSERT_SEARCH_TEXTS "AND u.id = ?", userId).run();
}

void refreshAllSearch(Session &session)
{
    Query(session, "DELETE FROM photoSearch").run();
    Query(session, INSERT_SEARCH_TEXTS).run();
}
