#include "scan/userscan.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/users.h"
#include "scan/contentmark.h"

#include <spdlog/spdlog.h>

#include <sys/stat.h>

#include <cerrno>
#include <cstring>

namespace {

constexpr std::size_t filesPerBatch = 500;
constexpr std::chrono::milliseconds batchTime{1000};
constexpr std::int64_t nanoseconds = 1'000'000'000;

bool isMissing(const std::string &path)
{
    struct stat status
    {
    };
    return ::lstat(path.c_str(), &status) != 0 && (errno == ENOENT || errno == ENOTDIR);
}

std::string joined(const std::string &folder, const std::string &name)
{
    return folder.empty() ? name : folder + "/" + name;
}

std::string lastPiece(const std::string &path)
{
    return path.substr(path.rfind('/') + 1); // the whole text without a slash
}

} // namespace

UserScan::UserScan(Database &database, const UserRecord &user, const std::atomic<bool> &stop)
    : mDatabase(database)
    , mUser(user)
    , mStop(stop)
    , mLastWrite(std::chrono::steady_clock::now())
{
}

bool UserScan::run()
{
    const auto root = listFolder(mUser.photos);
    if (!root || isLost(*root))
        return false;
    {
        auto reader = mDatabase.read();
        mKnownAlbums = knownAlbums(reader, mUser.id);
        mIsFirst = !isScanned(reader, mUser.id);
    }
    struct stat status
    {
    };
    if (::stat(mUser.photos.c_str(), &status) == 0)
        mEntered.emplace(status.st_dev, status.st_ino);
    walk({"", root->isMarkedPrivate}, *root);
    if (!mStop)
        dropUnseenAlbums();
    write();
    finishWriting();
    if (!mStop)
        writeLeftOut(mDatabase, mUser.id, mLeftOut);
    if (mIsFirst && !mStop)
        noteScanned(mDatabase, mUser.id);
    return true;
}

bool UserScan::isLost(const FolderListing &root)
{
    if (!root.files.empty() || !root.folders.empty())
        return false;
    auto reader = mDatabase.read();
    return presentPhotos(reader, mUser.id) > 0;
}

void UserScan::walk(const Place &place, const FolderListing &listing)
{
    ++mTotals.folders;
    mSeenFolders.insert(place.folder);
    compare(place, listing);
    for (const ListedFolder &folder : listing.folders) {
        if (mStop)
            return;
        enter(place, folder);
    }
}

// Links may lead in circles: each folder is entered once.
void UserScan::enter(const Place &parent, const ListedFolder &folder)
{
    const std::string path = joined(parent.folder, folder.name);
    if (leavesOutLink(folder.isLink, path) ||
        !mEntered.emplace(folder.device, folder.number).second)
        return;
    const auto listing = listFolder(pathOf(path));
    if (listing) {
        walk({path, parent.isPrivate || listing->isMarkedPrivate}, *listing);
        return;
    }
    const std::string reason = std::string("the folder cannot be read: ") + std::strerror(errno);
    spdlog::warn("{}: {}", validUtf8(pathOf(path)), reason);
    mLeftOut[path] = reason;
    mUnreadableFolders.insert(path);
}

void UserScan::compare(const Place &place, const FolderListing &listing)
{
    const auto album = mKnownAlbums.find(place.folder);
    const bool isKnown = album != mKnownAlbums.end();
    if (!isKnown && listing.files.empty())
        return;
    std::map<std::string, KnownFile> known;
    if (isKnown) {
        auto reader = mDatabase.read();
        known = knownFiles(reader, album->second.id);
    }
    FolderChanges changes{stateOf(place), {}, {}, {}};
    for (const ListedFile &file : listing.files) {
        if (mStop)
            return;
        if (leavesOutLink(file.isLink, joined(place.folder, file.name)))
            continue;
        const auto entry = known.find(file.name);
        compareFile(changes, place.folder, file, entry == known.end() ? nullptr : &entry->second);
        if (entry != known.end())
            known.erase(entry);
        if (changes.found.size() >= filesPerBatch)
            add(std::exchange(changes, {stateOf(place), {}, {}, {}}), true);
    }
    addGone(changes, known);
    add(std::move(changes), isKnown && album->second.isPrivate != place.isPrivate);
}

void UserScan::compareFile(FolderChanges &changes, const std::string &folder,
                           const ListedFile &file, const KnownFile *known)
{
    ++mTotals.files;
    if (!known || known->size != file.size || known->changed != file.changed) {
        FoundFile found = readFile(folder, file);
        if (!known || !known->isPresent)
            found.movedFrom = formerPhoto(found);
        changes.found.push_back(std::move(found));
    } else if (!known->isPresent) {
        changes.back.push_back(known->id);
    }
}

void UserScan::addGone(FolderChanges &changes, const std::map<std::string, KnownFile> &left) const
{
    for (const auto &[name, file] : left) {
        if (file.isPresent && mMoved.count(file.id) == 0)
            changes.gone.push_back(file.id);
    }
}

FoundFile UserScan::readFile(const std::string &folder, const ListedFile &file)
{
    const std::string path = pathOf(folder) + "/" + file.name;
    FoundFile found{file.name, file.size, file.changed, {}, {}, arrivalOf(file), contentMark(path)};
    auto metadata = readPhotoMetadata(path, &found.error);
    if (metadata)
        found.metadata = std::move(*metadata);
    else if (found.error.empty())
        found.error = "not a photo that can be read";
    ++mTotals.read;
    mTotals.unreadable += metadata ? 0 : 1;
    return found;
}

// The photo that lay elsewhere until now, 0 if there is none: moved and renamed files keep their
// comments and tags.
std::int64_t UserScan::formerPhoto(const FoundFile &file)
{
    if (mKnownAlbums.empty() || file.size == 0)
        return 0;
    auto reader = mDatabase.read();
    for (const LikePhoto &photo : photosLike(reader, mUser.id, file)) {
        if (hasLeft(photo, file.name) && mMoved.insert(photo.id).second)
            return photo.id;
    }
    return 0;
}

// Whether its old place is empty only the disk can tell, since the walk may come there later. A
// whole folder that is gone may come back with its disk: then the name has to be the same too.
bool UserScan::hasLeft(const LikePhoto &photo, const std::string &newName) const
{
    const std::string path = pathOf(photo.folder) + "/" + photo.name;
    return isMissing(path) && (photo.name == newName || !isMissing(pathOf(photo.folder)));
}

// When the photos of a folder came that the service has not known before only the files can tell.
std::int64_t UserScan::arrivalOf(const ListedFile &file) const
{
    const std::int64_t now = currentSeconds();
    return mIsFirst ? std::min(now, file.changed / nanoseconds) : now;
}

void UserScan::dropUnseenAlbums()
{
    for (const auto &[folder, album] : mKnownAlbums) {
        if (mSeenFolders.count(folder) > 0 || isBelowUnreadable(folder))
            continue;
        FolderChanges changes{stateOf({folder, album.isPrivate}), {}, {}, {}};
        auto reader = mDatabase.read();
        addGone(changes, knownFiles(reader, album.id));
        add(std::move(changes), false);
    }
}

bool UserScan::isBelowUnreadable(const std::string &folder) const
{
    for (const std::string &unreadable : mUnreadableFolders) {
        if (folder == unreadable || folder.rfind(unreadable + "/", 0) == 0)
            return true;
    }
    return false;
}

FolderState UserScan::stateOf(const Place &place) const
{
    const std::string &named = place.folder.empty() ? mUser.photos : place.folder;
    return {mUser.id, place.folder, validUtf8(lastPiece(named)), place.isPrivate};
}

std::string UserScan::pathOf(const std::string &folder) const
{
    return folder.empty() ? mUser.photos : mUser.photos + "/" + folder;
}

std::set<std::string> UserScan::walkedFolders() const
{
    std::set<std::string> folders;
    for (const std::string &folder : mSeenFolders)
        folders.insert(pathOf(folder));
    return folders;
}

// What is shown lies in the user's folder, whatever links say.
bool UserScan::leavesOutLink(bool isLink, const std::string &path)
{
    if (!isLink || liesWithin(mUser.photos, pathOf(path)))
        return false;
    mLeftOut[path] = "a link that leads out of the photo folder";
    return true;
}

void UserScan::add(FolderChanges changes, bool isChanged)
{
    if (changes.isEmpty() && !isChanged)
        return;
    mTotals.gone += changes.gone.size();
    mBatchFiles += changes.found.size() + changes.gone.size() + changes.back.size();
    mBatch.push_back(std::move(changes));
    if (mBatchFiles >= filesPerBatch || std::chrono::steady_clock::now() - mLastWrite > batchTime)
        write();
}

// Written while the walk reads on, one batch at a time and in their order.
void UserScan::write()
{
    finishWriting();
    if (!mBatch.empty())
        mWriting = std::async(std::launch::async, [this, batch = std::move(mBatch)] {
            writeChanges(mDatabase, batch);
        });
    mBatch.clear();
    mBatchFiles = 0;
    mLastWrite = std::chrono::steady_clock::now();
}

void UserScan::finishWriting()
{
    if (mWriting.valid())
        mWriting.get();
}
