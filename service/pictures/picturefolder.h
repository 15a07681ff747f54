#pragma once

#include <condition_variable>
#include <cstdint>
#include <filesystem>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>

// A folder that keeps made pictures within a bound on its size. It holds no index: a picture's name
// is its key's hash, its last use is its file's time. A thread of the folder's own counts what is
// there at start and drops the longest unused pictures when the bound is passed; destruction waits
// for what that thread has to do. May be used from any thread.
class PictureFolder
{
public:
    PictureFolder(std::filesystem::path folder, std::int64_t maximumBytes);
    ~PictureFolder();

    // The picture kept under `key`, empty if there is none.
    std::string find(const std::string &key) const;

    // Keeps the picture, whole or not at all; a failure loses nothing but the keeping. A disk that
    // is nearly full is left to others.
    void keep(const std::string &key, std::string_view bytes);

private:
    std::filesystem::path pathOf(const std::string &key) const;
    std::filesystem::path temporaryPath();
    void tidyWhenAsked();
    std::int64_t dropLongestUnused() const;

    const std::filesystem::path mFolder;
    const std::int64_t mMaximumBytes;
    std::mutex mMutex;
    std::condition_variable mWake;
    std::int64_t mBytes = 0;
    std::uint64_t mTemporaries = 0;
    bool mShouldTidy = true; // what is there at start has to be counted
    bool mEnding = false;
    std::thread mTidier;
};
