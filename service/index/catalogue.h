#pragma once

#include "index/records.h"

#include <vector>

class Session;

// What the feeds read from the index. Lists hold present photos only; a list for everybody
// (featured, search) leaves out private albums and unreadable files.
struct AlbumFilter
{
    std::int64_t userId;
    bool withPrivate;
};

std::vector<AlbumRecord> albumsOf(Session &session, const AlbumFilter &filter, const Page &page);
std::int64_t albumCount(Session &session, const AlbumFilter &filter);
std::optional<AlbumRecord> albumWithId(Session &session, std::int64_t userId, std::int64_t albumId);

// The album's folder below its user's; nothing if there is no such album.
std::optional<std::string> folderOfAlbum(Session &session, std::int64_t albumId);

// In the order in which they were taken.
std::vector<PhotoRecord> photosOf(Session &session, std::int64_t albumId, const Page &page);
std::optional<PhotoRecord> photoWithId(Session &session, std::int64_t photoId);
std::vector<PhotoRecord> photosWithIds(Session &session, const std::vector<std::int64_t> &ids);

std::vector<CommentRecord> commentsOf(Session &session, std::int64_t photoId);
std::vector<std::string> tagsOf(Session &session, std::int64_t photoId);
// A public photo that may stand for the user.
std::optional<PhotoRecord> portraitOf(Session &session, std::int64_t userId);

std::optional<PhotoFile> fileWithKey(Session &session, const std::string &key);

// A file that is no photo, or anything else in the folders that the scan left out.
struct UnreadablePhoto
{
    std::string path;
    std::string error;
};
std::vector<UnreadablePhoto> unreadablePhotos(Session &session);
