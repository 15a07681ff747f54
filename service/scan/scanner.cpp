#include "scan/scanner.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/imports.h"
#include "index/users.h"
#include "scan/userscan.h"

#include <spdlog/spdlog.h>

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::chrono::seconds lookPause{1}; // between looks whether users have changed

void logScan(const std::string &folder, const UserScan::Totals &totals, Clock::time_point start)
{
    const std::chrono::duration<double> took = Clock::now() - start;
    spdlog::info("scanned {}: {} folders, {} photos, {} read, {} unreadable, {} gone, {:.1f} s",
                 folder, totals.folders, totals.files, totals.read, totals.unreadable, totals.gone,
                 took.count());
}

} // namespace

Scanner::Scanner(Database &database, std::chrono::seconds pause)
    : mDatabase(database)
    , mPause(pause)
    , mWatch([this] { requestScan(); })
{
}

Scanner::~Scanner()
{
    stop();
}

void Scanner::start()
{
    mThread = std::thread([this] { run(); });
}

void Scanner::stop()
{
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mStop = true;
    }
    mChanged.notify_all();
    if (mThread.joinable())
        mThread.join();
}

void Scanner::requestScan()
{
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        ++mRequested;
    }
    mChanged.notify_all();
}

void Scanner::scanAndWait()
{
    std::unique_lock<std::mutex> lock(mMutex);
    const std::uint64_t mine = ++mRequested;
    mChanged.notify_all();
    mChanged.wait(lock, [&] { return mStop || mDone >= mine; });
}

void Scanner::run()
{
    while (!mStop) {
        std::uint64_t serving;
        {
            const std::lock_guard<std::mutex> lock(mMutex);
            serving = mRequested;
        }
        scanAll();
        {
            const std::lock_guard<std::mutex> lock(mMutex);
            mDone = serving;
        }
        mChanged.notify_all();
        waitUntilDue();
    }
}

// A full disk or a locked index passes: the next walk makes good what this one could not.
void Scanner::scanAll()
{
    try {
        std::vector<UserRecord> users;
        {
            auto reader = mDatabase.read();
            mUsersRevision = usersRevision(reader);
            users = allUsers(reader);
        }
        bool isNewlyWatched = false;
        for (const UserRecord &user : users) {
            if (!user.photos.empty() && !mStop)
                isNewlyWatched |= scanUser(user);
        }
        applyImports(mDatabase);
        if (isNewlyWatched)
            requestScan(); // for what has changed between the look and the watch
    } catch (const std::exception &exception) {
        spdlog::error("the scan was cut short: {}", exception.what());
    }
}

// True when folders are watched that were not before.
bool Scanner::scanUser(const UserRecord &user)
{
    const Clock::time_point start = Clock::now();
    UserScan scan(mDatabase, user, mStop);
    const std::string folder = validUtf8(user.photos);
    if (scan.run())
        logScan(folder, scan.totals(), start);
    else
        spdlog::warn("{} cannot be read or is empty; {}'s photos stay as they were", folder,
                     user.mail);
    return mWatch.add(scan.walkedFolders());
}

bool Scanner::haveUsersChanged()
{
    try {
        auto reader = mDatabase.read();
        return usersRevision(reader) != mUsersRevision;
    } catch (const SQLite::Exception &exception) {
        spdlog::error("the index cannot be read: {}", exception.what());
        return false;
    }
}

void Scanner::waitUntilDue()
{
    const auto due = std::chrono::steady_clock::now() + mPause;
    const auto isWanted = [this] { return mStop || mRequested > mDone; };
    while (std::chrono::steady_clock::now() < due) {
        {
            std::unique_lock<std::mutex> lock(mMutex);
            if (mChanged.wait_for(lock, lookPause, isWanted))
                return;
        }
        if (haveUsersChanged())
            return;
    }
}
