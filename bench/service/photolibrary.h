#pragma once

#include <cstdint>
#include <string>
#include <vector>

// A tree of small photos as a family's disk holds them: folders of 200 JPEGs over twenty years,
// each file with its own EXIF time, caption and keywords.
struct PhotoLibrary
{
    std::string folder;
    int photos = 0;
};

// Writes the files; the same number makes the same files.
void writePhotos(const PhotoLibrary &library);

// Words of the captions and keywords, the most frequent one first.
const std::vector<std::string> &libraryWords();
