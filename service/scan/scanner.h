#pragma once

#include "scan/folderwatch.h"

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <mutex>
#include <thread>

class Database;
struct UserRecord;

// Keeps the index true to the users' folders: on a thread of its own it walks them all at the
// start, then from time to time, when somebody asks, when users come or change and when something
// in the folders changes.
class Scanner
{
public:
    Scanner(Database &database, std::chrono::seconds pause);
    ~Scanner();
    Scanner(const Scanner &) = delete;
    Scanner &operator=(const Scanner &) = delete;

    void start();
    void stop();
    // Walks as soon as the running walk is done.
    void requestScan();
    // Blocks until a walk that began after this call has ended, or the scanner stops.
    void scanAndWait();

private:
    void run();
    void scanAll();
    bool scanUser(const UserRecord &user);
    bool haveUsersChanged();
    void waitUntilDue();

    Database &mDatabase;
    const std::chrono::seconds mPause;
    std::atomic<bool> mStop{false};
    std::mutex mMutex;
    std::condition_variable mChanged;
    std::uint64_t mRequested = 1; // walks asked for, the first by the start
    std::uint64_t mDone = 0;      // the last request that a finished walk has served
    std::int64_t mUsersRevision = -1;
    FolderWatch mWatch;
    std::thread mThread;
};
