#include "index/schema.h"

#include "index/database.h"
#include "index/photosearch.h"

namespace {

// Times are ISO texts: those of photos in local time as written by the camera, those of comments in
// UTC. File and folder names are the bytes that the file system gives. A photo that is gone keeps
// its row (present = 0) with its comments and tags, for disks that are away for a while.
const char firstVersion[] = R"sql(
CREATE TABLE users (
    id INTEGER PRIMARY KEY AUTOINCREMENT,
    mail TEXT NOT NULL UNIQUE COLLATE NOCASE,
    name TEXT NOT NULL,
    photos TEXT NOT NULL,
    password TEXT NOT NULL DEFAULT ''
);
CREATE TABLE tokens (
    hash TEXT PRIMARY KEY,
    user INTEGER NOT NULL REFERENCES users (id) ON DELETE CASCADE,
    kind INTEGER NOT NULL,
    expires INTEGER NOT NULL
) WITHOUT ROWID;
CREATE INDEX tokensOfUser ON tokens (user);
CREATE TABLE albums (
    id INTEGER PRIMARY KEY AUTOINCREMENT,
    user INTEGER NOT NULL REFERENCES users (id) ON DELETE CASCADE,
    folder TEXT NOT NULL,
    title TEXT NOT NULL,
    private INTEGER NOT NULL,
    photoCount INTEGER NOT NULL DEFAULT 0,
    published TEXT NOT NULL DEFAULT '',
    cover INTEGER,
    UNIQUE (user, folder)
);
CREATE TABLE photos (
    id INTEGER PRIMARY KEY AUTOINCREMENT,
    album INTEGER NOT NULL REFERENCES albums (id) ON DELETE CASCADE,
    name TEXT NOT NULL,
    key TEXT NOT NULL UNIQUE,
    size INTEGER NOT NULL,
    changed INTEGER NOT NULL,
    present INTEGER NOT NULL DEFAULT 1,
    error TEXT NOT NULL,
    mimeType TEXT NOT NULL,
    width INTEGER NOT NULL,
    height INTEGER NOT NULL,
    title TEXT NOT NULL,
    caption TEXT NOT NULL,
    published TEXT NOT NULL,
    latitude REAL,
    longitude REAL,
    UNIQUE (album, name)
);
CREATE INDEX photosInOrder ON photos (album, present, published, name);
CREATE INDEX showablePhotos ON photos (key, album, present, error)
    WHERE present = 1 AND error = '';
CREATE INDEX unreadablePhotos ON photos (album) WHERE error <> '';
CREATE TABLE tags (
    id INTEGER PRIMARY KEY,
    photo INTEGER NOT NULL REFERENCES photos (id) ON DELETE CASCADE,
    tag TEXT NOT NULL,
    author INTEGER REFERENCES users (id) ON DELETE CASCADE,
    UNIQUE (photo, tag)
);
CREATE INDEX tagsOfAuthor ON tags (author);
CREATE TABLE comments (
    id INTEGER PRIMARY KEY AUTOINCREMENT,
    photo INTEGER NOT NULL REFERENCES photos (id) ON DELETE CASCADE,
    author INTEGER NOT NULL REFERENCES users (id) ON DELETE CASCADE,
    content TEXT NOT NULL,
    published TEXT NOT NULL
);
CREATE INDEX commentsOfPhoto ON comments (photo, published, id);
CREATE INDEX commentsOfAuthor ON comments (author);
CREATE TABLE imports (
    id INTEGER PRIMARY KEY,
    kind TEXT NOT NULL,
    path TEXT NOT NULL,
    author INTEGER NOT NULL REFERENCES users (id) ON DELETE CASCADE,
    content TEXT NOT NULL,
    published TEXT NOT NULL,
    done INTEGER NOT NULL DEFAULT 0,
    UNIQUE (kind, path, author, content, published)
);
CREATE INDEX waitingImports ON imports (id) WHERE done = 0;
CREATE TABLE revisions (name TEXT PRIMARY KEY, value INTEGER NOT NULL) WITHOUT ROWID;
INSERT INTO revisions VALUES ('photos', 1), ('users', 1);
CREATE VIRTUAL TABLE photoSearch USING fts5 (
    title, caption, tags, album,
    tokenize = "unicode61 remove_diacritics 2", prefix = '2 3'
);
)sql";

// Texts that came with an uploaded photo; they stand above those in its file.
const char givenTexts[] = R"sql(
ALTER TABLE photos ADD COLUMN givenTitle TEXT NOT NULL DEFAULT '';
ALTER TABLE photos ADD COLUMN givenCaption TEXT NOT NULL DEFAULT '';
)sql";

// What has been featured since all photos had been, and when.
const char featuredMemory[] = R"sql(
CREATE TABLE featuredShown (
    photo INTEGER PRIMARY KEY REFERENCES photos (id) ON DELETE CASCADE,
    day TEXT NOT NULL
);
DROP INDEX showablePhotos;
CREATE INDEX showablePhotos ON photos (album, published, key, present, error)
    WHERE present = 1 AND error = '';
)sql";

// What the albums need that the service gathers itself: whose photo it is without a look at its
// album, when it came, and whether it has been on a screen. `scanned`: a walk through the user's
// whole folder has ended, so what is found from now on is new.
const char gatheredAlbums[] = R"sql(
ALTER TABLE users ADD COLUMN scanned INTEGER NOT NULL DEFAULT 0;
UPDATE users SET scanned = EXISTS (SELECT 1 FROM albums WHERE user = users.id);
ALTER TABLE photos ADD COLUMN user INTEGER NOT NULL DEFAULT 0;
ALTER TABLE photos ADD COLUMN added INTEGER NOT NULL DEFAULT 0;
ALTER TABLE photos ADD COLUMN shown INTEGER NOT NULL DEFAULT 0;
UPDATE photos SET user = (SELECT user FROM albums WHERE id = album), added = changed / 1000000000;
CREATE INDEX photosByTime ON photos (user, published, name) WHERE present = 1 AND error = '';
CREATE INDEX photosByDay ON photos (user, substr(published, 6, 5), published)
    WHERE present = 1 AND error = '';
CREATE INDEX photosByArrival ON photos (user, added, published)
    WHERE present = 1 AND error = '';
CREATE INDEX neverShownPhotos ON photos (user, published, name)
    WHERE present = 1 AND error = '' AND shown = 0;
CREATE INDEX tagsByName ON tags (tag COLLATE NOCASE, photo);
)sql";

// Search texts in one spelling, with people and dates. Photos stand under the number of their user,
// as in "u7": a user who takes another name needs no new texts.
const char searchInAnyScript[] = R"sql(
DROP TABLE photoSearch;
CREATE VIRTUAL TABLE photoSearch USING fts5 (
    title, caption, tags, album, date, people,
    tokenize = "unicode61 remove_diacritics 0 categories 'L* M* N*'", prefix = '1 2 3'
);
)sql" REFRESH_ALL_PHOTO_SEARCH;

// What a file is known by when it lies elsewhere, and the keywords of files that people do not
// want. For files read before, size and time have to do.
const char movedFiles[] = R"sql(
ALTER TABLE photos ADD COLUMN content TEXT NOT NULL DEFAULT '';
UPDATE photos SET content = size || ' ' || changed;
CREATE INDEX photosByContent ON photos (content, name);
CREATE TABLE droppedKeywords (
    photo INTEGER NOT NULL REFERENCES photos (id) ON DELETE CASCADE,
    tag TEXT NOT NULL,
    PRIMARY KEY (photo, tag)
) WITHOUT ROWID;
)sql";

// What lies in the folders and cannot be shown, but for files with the name of a photo.
const char leftOut[] = R"sql(
CREATE TABLE leftOut (
    user INTEGER NOT NULL REFERENCES users (id) ON DELETE CASCADE,
    path TEXT NOT NULL,
    reason TEXT NOT NULL,
    PRIMARY KEY (user, path)
) WITHOUT ROWID;
)sql";

// The next scan reads all files again, for the people whom they name.
const char peopleInFiles[] = "UPDATE photos SET changed = 0 WHERE error = ''";

const char *const steps[] = {firstVersion,      givenTexts, featuredMemory, gatheredAlbums,
                             searchInAnyScript, movedFiles, leftOut,        peopleInFiles};
static_assert(sizeof steps / sizeof steps[0] == newestSchema);

} // namespace

bool upgradeSchema(Session &session, std::string *error, int version)
{
    SQLite::Database &database = session.database();
    const int present = database.execAndGet("PRAGMA user_version").getInt();
    if (present > newestSchema) {
        *error = "the index was written by a newer version of this program";
        return false;
    }
    for (int step = present; step < version; ++step)
        database.exec(steps[step]);
    if (present < version)
        database.exec("PRAGMA user_version = " + std::to_string(version));
    return true;
}
