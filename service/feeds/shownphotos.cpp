#include "feeds/shownphotos.h"

#include "index/albumwriter.h"
#include "index/database.h"

#include <spdlog/spdlog.h>

namespace {

constexpr std::size_t photosPerWrite = 20;

} // namespace

ShownPhotos::ShownPhotos(Database &database)
    : mDatabase(database)
{
}

ShownPhotos::~ShownPhotos()
{
    write();
}

void ShownPhotos::note(std::int64_t photoId)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    mNoted.insert(photoId);
    if (mNoted.size() >= photosPerWrite)
        writeNoted();
}

void ShownPhotos::write()
{
    const std::lock_guard<std::mutex> lock(mMutex);
    writeNoted();
}

// What cannot be written counts as not shown, no more.
void ShownPhotos::writeNoted()
{
    if (mNoted.empty())
        return;
    try {
        markShown(mDatabase, mNoted);
    } catch (const SQLite::Exception &exception) {
        spdlog::warn("what has been on a screen cannot be written down: {}", exception.what());
    }
    mNoted.clear();
}
