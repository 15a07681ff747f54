#pragma once

#include "index/albumwriter.h"
#include "scan/folderlist.h"

#include <atomic>
#include <chrono>
#include <future>
#include <set>

class Database;

// One walk through one user's folder, which brings the index up to date with it. Only files that
// are new or have changed are opened. Changes are written in batches, so that pictures appear while
// the walk goes on, and a walk that is cut short has done what it did.
class UserScan
{
public:
    struct Totals
    {
        std::int64_t folders = 0;
        std::int64_t files = 0;
        std::int64_t read = 0; // new or changed
        std::int64_t unreadable = 0;
        std::int64_t gone = 0;
    };

    // `stop` ends the walk early.
    UserScan(Database &database, const UserRecord &user, const std::atomic<bool> &stop);

    // False when the user's folder cannot be read or lies there empty although it held photos: its
    // disk is likely to be away, so everything stays as it was.
    bool run();
    const Totals &totals() const { return mTotals; }
    // With their whole paths.
    std::set<std::string> walkedFolders() const;

private:
    struct Place
    {
        std::string folder; // below the user's folder
        bool isPrivate;
    };

    bool isLost(const FolderListing &root);
    void walk(const Place &place, const FolderListing &listing);
    void enter(const Place &parent, const ListedFolder &folder);
    void compare(const Place &place, const FolderListing &listing);
    void compareFile(FolderChanges &changes, const std::string &folder, const ListedFile &file,
                     const KnownFile *known);
    void addGone(FolderChanges &changes, const std::map<std::string, KnownFile> &left) const;
    FoundFile readFile(const std::string &folder, const ListedFile &file);
    std::int64_t formerPhoto(const FoundFile &file);
    bool hasLeft(const LikePhoto &photo, const std::string &newName) const;
    std::int64_t arrivalOf(const ListedFile &file) const;
    void dropUnseenAlbums();
    bool isBelowUnreadable(const std::string &folder) const;
    FolderState stateOf(const Place &place) const;
    std::string pathOf(const std::string &folder) const;
    bool leavesOutLink(bool isLink, const std::string &path);
    void add(FolderChanges changes, bool isChanged);
    void write();
    void finishWriting();

    Database &mDatabase;
    const UserRecord mUser;
    const std::atomic<bool> &mStop;
    Totals mTotals;
    std::set<std::int64_t> mMoved; // photos that lie elsewhere now
    bool mIsFirst = false;         // no walk through this folder has ended yet
    std::map<std::string, KnownAlbum> mKnownAlbums;
    std::set<std::string> mSeenFolders;
    std::set<std::string> mUnreadableFolders;
    LeftOut mLeftOut;
    std::set<std::pair<std::uint64_t, std::uint64_t>> mEntered;
    std::vector<FolderChanges> mBatch;
    std::size_t mBatchFiles = 0;
    std::chrono::steady_clock::time_point mLastWrite;
    std::future<void> mWriting;
};
