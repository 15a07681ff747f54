#pragma once

#include "pictures/thumbnailstore.h"

#include <string>

// Decodes the photo and makes an upright sRGB JPEG without metadata, at most `width` pixels wide; 0
// keeps the photo's size, for which its own file may do. Takes as long as decoding does. May be
// called from any thread.
ThumbnailStore::Result makePicture(const std::string &sourcePath, int width);
