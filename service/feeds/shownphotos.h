#pragma once

#include <cstdint>
#include <mutex>
#include <set>

class Database;

// Photos that have been on a screen for the first time. They are collected, so that no picture
// waits for the index to be written. May be used from any thread.
class ShownPhotos
{
public:
    explicit ShownPhotos(Database &database);
    // Writes what is left.
    ~ShownPhotos();

    void note(std::int64_t photoId);
    // So that the index knows all that has been noted.
    void write();

private:
    void writeNoted();

    Database &mDatabase;
    std::mutex mMutex;
    std::set<std::int64_t> mNoted;
};
