#include "scan/folderlist.h"

#include <dirent.h>
#include <fcntl.h>
#include <strings.h>

#include <algorithm>
#include <memory>

namespace {

struct CloseFolder
{
    void operator()(DIR *folder) const { ::closedir(folder); }
};
using Folder = std::unique_ptr<DIR, CloseFolder>;

const char *const photoExtensions[] = {".jpg",  ".jpeg", ".jpe",  ".png",
                                       ".webp", ".heic", ".heif", ".gif"};
const char privateMark[] = ".private";
constexpr std::int64_t nanoseconds = 1'000'000'000;
constexpr std::int64_t latestSecond = 9'000'000'000; // in the year 2255

// Most entries are told apart without asking the file system about each.
bool mayMatter(const dirent &entry)
{
    if (entry.d_type == DT_REG)
        return hasPhotoName(entry.d_name);
    return entry.d_type == DT_DIR || entry.d_type == DT_LNK || entry.d_type == DT_UNKNOWN;
}

bool isLink(int folder, const dirent &entry)
{
    struct stat status
    {
    };
    if (entry.d_type != DT_UNKNOWN)
        return entry.d_type == DT_LNK;
    return ::fstatat(folder, entry.d_name, &status, AT_SYMLINK_NOFOLLOW) == 0 &&
           S_ISLNK(status.st_mode);
}

void addEntry(FolderListing &listing, const char *name, const struct stat &status, bool isLink)
{
    if (S_ISDIR(status.st_mode))
        listing.folders.push_back({name, status.st_dev, status.st_ino, isLink});
    else if (S_ISREG(status.st_mode) && hasPhotoName(name))
        listing.files.push_back({name, status.st_size, timeOfChange(status), isLink});
}

template <typename Entries>
void sortByName(Entries &entries)
{
    std::sort(entries.begin(), entries.end(),
              [](const auto &one, const auto &other) { return one.name < other.name; });
}

} // namespace

std::optional<FolderListing> listFolder(const std::string &path)
{
    const Folder folder(::opendir(path.c_str()));
    if (!folder)
        return std::nullopt;
    FolderListing listing;
    while (const dirent *entry = ::readdir(folder.get())) {
        const std::string name = entry->d_name;
        if (name == privateMark)
            listing.isMarkedPrivate = true;
        struct stat status
        {
        };
        if (name[0] != '.' && mayMatter(*entry) &&
            ::fstatat(::dirfd(folder.get()), entry->d_name, &status, 0) == 0)
            addEntry(listing, entry->d_name, status, isLink(::dirfd(folder.get()), *entry));
    }
    sortByName(listing.files);
    sortByName(listing.folders);
    return listing;
}

// File systems keep times that 64 bits of nanoseconds cannot hold.
std::int64_t timeOfChange(const struct stat &status)
{
    const std::int64_t seconds =
        std::clamp<std::int64_t>(status.st_mtim.tv_sec, -latestSecond, latestSecond);
    return seconds * nanoseconds + status.st_mtim.tv_nsec;
}

bool hasPhotoName(const std::string &name)
{
    const std::size_t dot = name.rfind('.');
    if (dot == std::string::npos || dot == 0)
        return false;
    return std::any_of(
        std::begin(photoExtensions), std::end(photoExtensions),
        [&](const char *extension) { return ::strcasecmp(name.c_str() + dot, extension) == 0; });
}
