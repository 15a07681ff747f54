#pragma once

#include "index/records.h"
#include "pictures/photometadata.h"

#include <map>
#include <set>
#include <vector>

class Database;
class Session;

// The scan's side of the index: what is known of a folder, and batches of what was found.
struct KnownFile
{
    std::int64_t id = 0;
    std::int64_t size = 0;
    std::int64_t changed = 0; // nanoseconds since 1970
    bool isPresent = false;
};

struct KnownAlbum
{
    std::int64_t id = 0;
    bool isPrivate = false;
};

struct FolderState
{
    std::int64_t userId = 0;
    std::string folder; // below the user's folder, without slashes at its ends
    std::string title;
    bool isPrivate = false;
};

struct FoundFile
{
    std::string name;
    std::int64_t size = 0;
    std::int64_t changed = 0;
    PhotoMetadata metadata;     // empty with an error
    std::string error;          // why the file is no photo; empty when it is one
    std::int64_t added = 0;     // when it came, in seconds since 1970; 0: now
    std::string content;        // the same for a file with the same bytes; may be empty
    std::int64_t movedFrom = 0; // the photo that this file is, which lay elsewhere before
};

// All that changed in one folder since the last scan.
struct FolderChanges
{
    FolderState state;
    std::vector<FoundFile> found;   // new, changed or back
    std::vector<std::int64_t> gone; // photo ids
    std::vector<std::int64_t> back; // photo ids: as before, after having been gone
    bool isEmpty() const { return found.empty() && gone.empty() && back.empty(); }
};

std::map<std::string, KnownAlbum> knownAlbums(Session &session, std::int64_t userId);
std::map<std::string, KnownFile> knownFiles(Session &session, std::int64_t albumId);

// Photos of the user, but for a few of very many, that were made from a file like this one.
struct LikePhoto
{
    std::int64_t id = 0;
    std::string folder;
    std::string name;
};
std::vector<LikePhoto> photosLike(Session &session, std::int64_t userId, const FoundFile &file);

std::int64_t presentPhotos(Session &session, std::int64_t userId);

// A photo that is new in its folder, whose privacy stays as it is, with texts that stand above
// those in the file (empty: none). The result is its id.
struct GivenTexts
{
    std::string title;
    std::string caption;
};
std::int64_t addPhoto(Database &database, FolderState state, const FoundFile &file,
                      const GivenTexts &texts);

// All that was left out in the user's folders: paths below the user's folder, and why.
using LeftOut = std::map<std::string, std::string>;
void writeLeftOut(Database &database, std::int64_t userId, const LeftOut &leftOut);

// These photos have been on a screen.
void markShown(Database &database, const std::set<std::int64_t> &photoIds);

// Writes the changes in one transaction.
void writeChanges(Database &database, const std::vector<FolderChanges> &changes);
