#pragma once

#include <cstdint>
#include <memory>
#include <string>

// Makes pictures of photos in any size, upright and in sRGB, and keeps them on disk, so that each
// is made once. May be used from any thread: threads that ask for the same picture at once share
// one making. When the folder cannot be written, or is full, pictures are still made, only not
// kept.
class ThumbnailStore
{
public:
    struct Result
    {
        std::string bytes;
        std::string mimeType;
        std::string error; // why there is no picture; empty when there is one
        // The photo's own file is the picture: it is for the caller to read, `bytes` is empty.
        bool isOriginal = false;

        bool ok() const { return error.empty(); }
    };

    // Keeps at most `maximumBytes` in `folder`, dropping what was not asked for the longest. The
    // folder is made when missing and belongs to the store alone.
    ThumbnailStore(std::string folder, std::int64_t maximumBytes);
    ~ThumbnailStore();

    // The photo at `sourcePath` as a JPEG `width` pixels wide, or its own width if that is less; 0
    // asks for its full size. `identity` names the photo's content: it must change when the file
    // does (path, size and time of change will do).
    Result picture(const std::string &sourcePath, const std::string &identity, int width);

private:
    class Private;
    std::unique_ptr<Private> d;
};
