#pragma once

#include <functional>
#include <mutex>
#include <set>
#include <string>
#include <thread>

// Watches folders and says when something in one of them has changed: once for a row of changes,
// when it has been quiet for a moment or the changes go on for long. Where the system cannot watch
// (too many folders, a network disk) nothing is said, and the scans from time to time remain.
class FolderWatch
{
public:
    // `changed` is called on a thread of the watch's own.
    explicit FolderWatch(std::function<void()> changed);
    ~FolderWatch();
    FolderWatch(const FolderWatch &) = delete;
    FolderWatch &operator=(const FolderWatch &) = delete;

    // Adds folders; true if one of them was not watched before.
    bool add(const std::set<std::string> &folders);

private:
    void run();
    void readEvents();

    const std::function<void()> mChanged;
    const int mEvents;
    const int mWake;
    std::mutex mMutex;
    std::set<int> mWatches;
    bool mIsFull = false;
    std::thread mThread;
};
