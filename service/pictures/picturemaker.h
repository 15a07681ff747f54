#pragma once

#include "pictures/thumbnailstore.h"

#include <string>

// A picture as bytes, and whether these are the photo file's own.
struct MadePicture
{
    ThumbnailStore::Result result;
    bool isOriginal = false;
};

// Decodes the photo and makes an upright sRGB JPEG without metadata, at most `width` pixels wide; 0
// keeps the photo's size. Takes as long as decoding does. May be called from any thread.
MadePicture makePicture(const std::string &sourcePath, int width);
