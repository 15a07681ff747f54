#pragma once

#include <cstdint>
#include <optional>
#include <string>

// What the index holds, as its readers hand it out. Texts are as stored; names of files and folders
// may be any bytes.

struct UserRecord
{
    std::int64_t id = 0;
    std::string mail;
    std::string name;
    std::string photos; // absolute folder, empty when the user has none
};

struct PhotoRecord
{
    std::int64_t id = 0;
    std::int64_t albumId = 0;
    std::int64_t userId = 0;
    std::string userName;
    std::string key; // stands in picture addresses: cannot be guessed
    std::string fileName;
    std::int64_t fileSize = 0;
    int width = 0; // 0 with an unreadable file
    int height = 0;
    std::string title;
    std::string caption;
    std::string published; // local time without zone
    std::string keywords;  // separated by ", "
    int commentCount = 0;
    std::optional<double> latitude;
    std::optional<double> longitude;
};

struct AlbumRecord
{
    std::int64_t id = 0; // 0: gathered by the service, not a folder
    std::string feedId;  // what feeds call it
    std::int64_t userId = 0;
    std::string userName;
    std::string title;
    bool isPrivate = false;
    int photoCount = 0;
    std::string published; // that of the newest photo
    std::optional<std::int64_t> cover;
};

struct CommentRecord
{
    std::int64_t id = 0;
    std::int64_t userId = 0;
    std::string userName;
    std::string content;
    std::string published; // UTC
};

// Where a picture's file lies, and how the thumbnail store knows it.
struct PhotoFile
{
    std::string path;
    std::string identity; // changes with the file
    std::string folder;   // of its owner
    std::int64_t photoId = 0;
    bool isShown = false; // has been on a screen
};

// A part of a list: `start` counts from 1.
struct Page
{
    std::int64_t start = 1;
    std::int64_t count = 0;
};
