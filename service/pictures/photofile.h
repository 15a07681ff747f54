#pragma once

#include "pictures/vipslibrary.h"

#include <string>
#include <string_view>

// A photo file, opened and recognised by its first bytes. Only plain files of the formats that the
// service shows come through: no pipe can block a reader, and no odd format reaches a decoder.
class PhotoFile
{
public:
    // On failure the file is not ok() and error() says why.
    explicit PhotoFile(const std::string &path);

    bool ok() const { return mError.empty(); }
    const std::string &error() const { return mError; }
    const std::string &mimeType() const { return mMimeType; }

    // The bytes, for a decoder. Valid as long as the file.
    VipsSource *source() const { return mSource.get(); }

    // The picture with its header read and no pixel decoded, or null with error() set; one that is
    // too large gives null. May be asked for once.
    GObjectPtr<VipsImage> readHeader();

private:
    void open(int descriptor);
    bool openInMemory(int descriptor, std::size_t size);

    std::string mError;
    std::string mMimeType;
    std::string mContent;
    GObjectPtr<VipsSource> mSource;
};

// The type of the picture that starts with `bytes` (32 are enough), empty if it is none of ours.
std::string pictureMimeType(std::string_view bytes);
