#pragma once

#include <sys/stat.h>

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

// What one folder holds, as far as the service is concerned: files whose names say that they are
// photos, and folders. Hidden names are left out.
struct ListedFile
{
    std::string name;
    std::int64_t size = 0;
    std::int64_t changed = 0; // nanoseconds since 1970
    bool isLink = false;
};

struct ListedFolder
{
    std::string name;
    // Device and number: the same folder under another name, as a link makes it, is the same here.
    std::uint64_t device = 0;
    std::uint64_t number = 0;
    bool isLink = false;
};

struct FolderListing
{
    std::vector<ListedFile> files;     // by name
    std::vector<ListedFolder> folders; // by name
    bool isMarkedPrivate = false;      // holds a file named ".private"
};

// Nothing when the folder cannot be read.
std::optional<FolderListing> listFolder(const std::string &path);

bool hasPhotoName(const std::string &name);

// As in ListedFile::changed.
std::int64_t timeOfChange(const struct stat &status);
