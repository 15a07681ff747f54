#pragma once

#include "index/records.h"

class Database;

// What people write on photos.

CommentRecord addComment(Database &database, std::int64_t photoId, const UserRecord &author,
                         const std::string &content);
struct CommentPlace
{
    std::int64_t photoId = 0;
    std::int64_t author = 0;
};
std::optional<CommentPlace> placeOfComment(Database &database, std::int64_t commentId);
bool removeComment(Database &database, std::int64_t commentId);

// A tag that is there already stays.
void addTag(Database &database, std::int64_t photoId, std::int64_t author, const std::string &tag);
// False if the photo has no such tag.
bool removeTag(Database &database, std::int64_t photoId, const std::string &tag);
