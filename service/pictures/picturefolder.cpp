#include "pictures/picturefolder.h"

#include "pictures/wholefile.h"

#include <algorithm>
#include <fcntl.h>
#include <fstream>
#include <glib.h>
#include <sys/stat.h>
#include <vector>

namespace fs = std::filesystem;

namespace {

constexpr const char *temporariesName = ".incoming";

// What others write to the same disk, as comments, counts more than pictures that can be made
// again.
constexpr std::uintmax_t sparedBytes = 64u << 20;

struct KeptFile
{
    fs::path path;
    std::int64_t size;
    fs::file_time_type used;
};

// Whether the path is as pathOf() makes them. Nothing else is ever dropped, not even when somebody
// points the store at a folder of photos.
bool isKeptFile(const fs::directory_entry &entry)
{
    constexpr std::size_t nameLength = 60 + 4; // the hash without its two folders, and ".jpg"
    const fs::path &path = entry.path();
    const fs::path folder = path.parent_path();
    std::error_code ignored;
    return path.filename().native().size() == nameLength &&
           folder.filename().native().size() == 2 &&
           folder.parent_path().filename().native().size() == 2 && entry.is_regular_file(ignored);
}

std::vector<KeptFile> keptFiles(const fs::path &folder)
{
    std::vector<KeptFile> files;
    std::error_code error;
    fs::recursive_directory_iterator at(folder, error), end;
    for (; !error && at != end; at.increment(error)) {
        if (!isKeptFile(*at))
            continue;
        std::error_code ignored;
        const auto size = static_cast<std::int64_t>(at->file_size(ignored));
        if (!ignored)
            files.push_back({at->path(), size, at->last_write_time(ignored)});
    }
    return files;
}

std::string hashOf(const std::string &key)
{
    char *text = g_compute_checksum_for_data(
        G_CHECKSUM_SHA256, reinterpret_cast<const guchar *>(key.data()), key.size());
    std::string hash = text;
    g_free(text);
    return hash;
}

// A power cut may leave a file without its content.
bool isWholeJpeg(std::string_view bytes)
{
    return bytes.size() > 4 && bytes.substr(0, 2) == "\xff\xd8" &&
           bytes.substr(bytes.size() - 2) == "\xff\xd9";
}

bool writeFile(const fs::path &path, std::string_view bytes)
{
    std::ofstream file(path, std::ios::binary);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    file.close();
    return !file.fail();
}

} // namespace

PictureFolder::PictureFolder(fs::path folder, std::int64_t maximumBytes)
    : mFolder(std::move(folder))
    , mMaximumBytes(maximumBytes)
{
    std::error_code ignored;
    fs::remove_all(mFolder / temporariesName, ignored); // what a killed process left behind
    fs::create_directories(mFolder / temporariesName, ignored);
    mTidier = std::thread([this] { tidyWhenAsked(); });
}

PictureFolder::~PictureFolder()
{
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mEnding = true;
    }
    mWake.notify_one();
    mTidier.join();
}

fs::path PictureFolder::pathOf(const std::string &key) const
{
    const std::string hash = hashOf(key);
    return mFolder / hash.substr(0, 2) / hash.substr(2, 2) / (hash.substr(4) + ".jpg");
}

fs::path PictureFolder::temporaryPath()
{
    const std::lock_guard<std::mutex> lock(mMutex);
    return mFolder / temporariesName / std::to_string(mTemporaries++);
}

std::string PictureFolder::find(const std::string &key) const
{
    const fs::path path = pathOf(key);
    std::string bytes = readWholeFile(path);
    if (!isWholeJpeg(bytes))
        return {};
    ::utimensat(AT_FDCWD, path.c_str(), nullptr, 0);
    return bytes;
}

void PictureFolder::keep(const std::string &key, std::string_view bytes)
{
    const fs::path path = pathOf(key);
    const fs::path temporary = temporaryPath();
    std::error_code error;
    if (fs::space(mFolder, error).available < sparedBytes && !error)
        return;
    fs::create_directories(path.parent_path(), error);
    if (!writeFile(temporary, bytes)) {
        fs::remove(temporary, error);
        return;
    }
    fs::rename(temporary, path, error);
    if (error) {
        fs::remove(temporary, error);
        return;
    }
    const std::lock_guard<std::mutex> lock(mMutex);
    mBytes += static_cast<std::int64_t>(bytes.size());
    if (mBytes > mMaximumBytes) {
        mShouldTidy = true;
        mWake.notify_one();
    }
}

void PictureFolder::tidyWhenAsked()
{
    std::unique_lock<std::mutex> lock(mMutex);
    while (true) {
        mWake.wait(lock, [this] { return mShouldTidy || mEnding; });
        if (!mShouldTidy)
            return;
        mShouldTidy = false;
        const std::int64_t before = mBytes;
        lock.unlock();
        const std::int64_t left = dropLongestUnused();
        lock.lock();
        // What was kept meanwhile may be counted twice: too much is tidied early, never too late.
        mBytes += left - before;
    }
}

// Goes a little below the bound, so that the next pictures do not set it off again.
std::int64_t PictureFolder::dropLongestUnused() const
{
    std::vector<KeptFile> files = keptFiles(mFolder);
    std::int64_t total = 0;
    for (const KeptFile &file : files)
        total += file.size;
    if (total <= mMaximumBytes)
        return total;
    std::sort(files.begin(), files.end(),
              [](const KeptFile &a, const KeptFile &b) { return a.used < b.used; });
    for (const KeptFile &file : files) {
        if (total <= mMaximumBytes / 10 * 9)
            break;
        std::error_code error;
        if (fs::remove(file.path, error))
            total -= file.size;
    }
    return total;
}
