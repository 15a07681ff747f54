#pragma once

#include "index/records.h"

#include <vector>

namespace SQLite {
class Database;
}
class Session;

// The search for photos: by title, caption, tags, album, date and the name of whose photo it is. A
// photo that everybody may see is found, any other is not.

struct FoundPhotos
{
    std::vector<std::int64_t> ids; // of the page
    std::int64_t total = 0;
};

// Photos that hold, for each word of the text, a word that begins with it. Those that hold all
// words whole come first, then titles and tags count more than the rest, then the latest are first;
// a text without a word finds nothing.
FoundPhotos searchPhotos(Session &session, const std::string &text, const Page &page);

// Keep the search texts true; to be called whenever one of them changes.
void refreshPhotoSearch(Session &session, std::int64_t photoId);
void refreshAlbumSearch(Session &session, std::int64_t albumId);

// What a connection needs that writes search texts.
void addSearchFunctions(SQLite::Database &database);

// The statement that writes the search texts of all photos, in SQL.
#define REFRESH_ALL_PHOTO_SEARCH                                                                   \
    "INSERT INTO photoSearch (rowid, title, caption, tags, album, date, people) "                  \
    "SELECT p.id, searchText(p.title), searchText(p.caption), "                                    \
    "searchText((SELECT group_concat(tag, ', ') FROM tags WHERE photo = p.id)), "                  \
    "searchText(a.title), searchDate(p.published), 'u' || a.user "                                 \
    "FROM photos p JOIN albums a ON a.id = p.album "                                               \
    "WHERE p.present = 1 AND p.error = '' AND NOT a.private "
