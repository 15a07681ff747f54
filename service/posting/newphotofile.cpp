#include "posting/newphotofile.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "scan/folderlist.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <filesystem>

namespace {

constexpr std::size_t randomBytes = 12;
constexpr std::size_t longestName = 100;
const std::string hiddenStart = ".orvala-";
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

// File systems without renaming that spares what is there get an empty file first, which takes the
// name.
bool renameHidden(const std::string &path, const std::string &target)
{
    if (::renameat2(AT_FDCWD, path.c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE) == 0)
        return true;
    if (errno != EINVAL && errno != ENOSYS)
        return false;
    const int place = ::open(target.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (place < 0)
        return false;
    ::close(place);
    if (std::rename(path.c_str(), target.c_str()) == 0)
        return true;
    ::unlink(target.c_str());
    return false;
}

// Hidden files of a day ago belong to a process that was killed.
void removeLeftovers(const std::string &folder)
{
    namespace fs = std::filesystem;
    const auto oldest = fs::file_time_type::clock::now() - std::chrono::hours(24);
    std::error_code error;
    for (fs::directory_iterator at(folder, error), end; !error && at != end; at.increment(error)) {
        std::error_code ignored;
        if (at->path().filename().string().rfind(hiddenStart, 0) == 0 &&
            at->is_regular_file(ignored) && at->last_write_time(ignored) < oldest)
            fs::remove(at->path(), ignored);
    }
}

// As in "Sea (2)"; the first one goes without.
std::string numbered(const std::string &stem, int copy)
{
    return copy == 1 ? stem : stem + " (" + std::to_string(copy) + ")";
}

} // namespace

NewPhotoFile::NewPhotoFile(std::string folder)
    : mFolder(std::move(folder))
{
    open();
}

NewPhotoFile::~NewPhotoFile()
{
    if (!mKept && !mName.empty())
        ::unlink(path().c_str());
    if (mFile >= 0)
        ::close(mFile);
}

void NewPhotoFile::open()
{
    mFile = ::open(mFolder.c_str(), O_TMPFILE | O_WRONLY | O_CLOEXEC, 0666);
    if (mFile < 0 && (errno == EOPNOTSUPP || errno == EISDIR || errno == EINVAL)) {
        removeLeftovers(mFolder);
        mName = hiddenStart + randomText(randomBytes);
        mFile = ::open(path().c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    }
    if (mFile < 0)
        fail();
}

std::string NewPhotoFile::path() const
{
    return mName.empty() ? "/proc/self/fd/" + std::to_string(mFile) : mFolder + "/" + mName;
}

// Always false.
bool NewPhotoFile::fail()
{
    if (mProblem != Problem::None)
        return false;
    switch (errno) {
    case ENOSPC:
    case EDQUOT:
    case EFBIG:
        mProblem = Problem::NoRoom;
        break;
    case EACCES:
    case EPERM:
    case EROFS:
        mProblem = Problem::NoLeave;
        break;
    default:
        mProblem = Problem::Other;
    }
    return false;
}

void NewPhotoFile::write(std::string_view bytes)
{
    if (mProblem == Problem::None && !writeAll(mFile, bytes))
        fail();
}

bool NewPhotoFile::finish()
{
    return mProblem == Problem::None && (::fsync(mFile) == 0 || fail());
}

bool NewPhotoFile::publish(const std::string &title, const std::string &extension)
{
    const std::string stem = fileNameFor(title);
    for (int copy = 1; copy <= mostCopies; ++copy) {
        if (rename(numbered(stem, copy) + extension)) {
            syncFolder(mFolder);
            return true;
        }
        if (errno != EEXIST)
            return fail();
    }
    return fail();
}

// False with EEXIST when the name is taken.
bool NewPhotoFile::rename(const std::string &name)
{
    const std::string target = mFolder + "/" + name;
    const bool isDone = mName.empty() ? ::linkat(AT_FDCWD, path().c_str(), AT_FDCWD, target.c_str(),
                                                 AT_SYMLINK_FOLLOW) == 0
                                      : renameHidden(path(), target);
    if (isDone)
        mName = name;
    return isDone;
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
