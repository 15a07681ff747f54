#include "posting/newphotofile.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "scan/folderlist.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

namespace {

constexpr std::size_t randomBytes = 12;
constexpr std::size_t longestName = 100;
constexpr int mostCopies = 10'000;

bool writeAll(int file, std::string_view bytes)
{
    while (!bytes.empty()) {
        const ssize_t written = ::write(file, bytes.data(), bytes.size());
        if (written < 0 && errno == EINTR)
            continue;
        if (written <= 0)
            return false;
        bytes.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

void syncFolder(const std::string &folder)
{
    const int descriptor = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor < 0)
        return;
    ::fsync(descriptor);
    ::close(descriptor);
}

} // namespace

NewPhotoFile::NewPhotoFile(std::string folder)
    : mFolder(std::move(folder))
    , mName(".orvala-" + randomText(randomBytes))
{
}

NewPhotoFile::~NewPhotoFile()
{
    if (!mKept)
        ::unlink(path().c_str());
}

bool NewPhotoFile::write(std::string_view bytes)
{
    const int file = ::open(path().c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (file < 0)
        return false;
    const bool isWritten = writeAll(file, bytes) && ::fsync(file) == 0;
    return ::close(file) == 0 && isWritten;
}

bool NewPhotoFile::publish(const std::string &title, const std::string &extension)
{
    const std::string stem = fileNameFor(title);
    for (int copy = 1; copy <= mostCopies; ++copy) {
        const std::string number = copy == 1 ? "" : " (" + std::to_string(copy) + ")";
        if (rename(stem + number + extension)) {
            syncFolder(mFolder);
            return true;
        }
        if (errno != EEXIST)
            return false;
    }
    return false;
}

// False with EEXIST when the name is taken. File systems without this kind of renaming get an empty
// file first, which takes the name.
bool NewPhotoFile::rename(const std::string &name)
{
    const std::string target = mFolder + "/" + name;
    if (::renameat2(AT_FDCWD, path().c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE) != 0) {
        if (errno != EINVAL && errno != ENOSYS)
            return false;
        const int place = ::open(target.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
        if (place < 0)
            return false;
        ::close(place);
        if (std::rename(path().c_str(), target.c_str()) != 0) {
            ::unlink(target.c_str());
            return false;
        }
    }
    mName = name;
    return true;
}

std::string fileNameFor(const std::string &title)
{
    static const std::string unfit = "/\\:*?\"<>|";
    std::string name = hasPhotoName(title) ? withoutExtension(title) : title;
    for (char &c : name) {
        if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F || unfit.find(c) != std::string::npos)
            c = '_';
    }
    if (name.size() > longestName) {
        std::size_t end = longestName;
        while (end > 0 && (static_cast<unsigned char>(name[end]) & 0xC0) == 0x80)
            --end;
        name.resize(end);
    }
    const std::size_t first = name.find_first_not_of(". ");
    if (first == std::string::npos)
        return "Photo";
    return name.substr(first, name.find_last_not_of(". ") - first + 1);
}
