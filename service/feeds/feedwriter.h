#pragma once

#include "index/records.h"

#include <nlohmann/json.hpp>

#include <string>
#include <vector>

// Builds feeds as their readers expect them: {"feed": {..., "entry": [...]}}, every text as the
// member "$t" of an object, numbers as texts too. Texts go out as they are, whatever they hold;
// bytes that are no UTF-8 become U+FFFD.
using FeedJson = nlohmann::ordered_json;

// The width of the largest picture that a grid shows, in pixels.
constexpr int widestThumbnail = 336;

// `origin` is what all addresses begin with, as in "https://192.168.1.5:8443".
FeedJson photoEntry(const PhotoRecord &photo, const std::string &origin);
// `cover` may be null.
FeedJson albumEntry(const AlbumRecord &album, const PhotoRecord *cover, const std::string &origin);
FeedJson commentEntry(const CommentRecord &comment, const PhotoRecord &photo,
                      const std::string &origin);
FeedJson tagEntry(const std::string &tag, const PhotoRecord &photo, const std::string &origin);
// `portrait` may be null.
FeedJson contactEntry(const UserRecord &user, const PhotoRecord *portrait,
                      const std::string &origin);

struct FeedHead
{
    std::string id; // the feed's own address
    std::string title;
    std::int64_t total = 0;
    Page page;
    const UserRecord *owner = nullptr; // of the feeds that belong to somebody
};

// The feed's text.
std::string feedDocument(const FeedHead &head, FeedJson entries);

// One entry alone, as the answer to what was posted.
std::string entryDocument(FeedJson entry);
