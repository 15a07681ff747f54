#pragma once

#include <cstdint>
#include <filesystem>
#include <string>

// A folder of its own for one test, removed with everything in it.
class TemporaryFolder
{
public:
    TemporaryFolder();
    ~TemporaryFolder();

    std::string file(const std::string &name) const { return (mPath / name).string(); }

private:
    std::filesystem::path mPath;
};

struct Decoded
{
    int width = 0;
    int height = 0;
    bool hasMetadata = false;
    std::string quarters; // one digit each, in the order of writePicture(); ? is another grey
};

// Writes a picture with four quarters from black to white ("0123") from the top left to the bottom
// right, as it lies in the file. The ending decides the format.
void writePicture(const std::string &path, int width, int height, int orientation = 1);

// Sets an EXIF, IPTC or XMP value in the file; may be repeated for values that come in lists.
void addMetadata(const std::string &path, const std::string &key, const std::string &value);

void writeBytes(const std::string &path, const std::string &bytes = {});

// Number and total size of the files below a folder.
struct Contents
{
    int files = 0;
    std::int64_t bytes = 0;
};
Contents contentsOf(const std::string &folder);

Decoded decode(const std::string &bytes);
