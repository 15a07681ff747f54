#pragma once

#include <array>
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

using Colour = std::array<int, 3>;

// What a decoded picture shows in the middle of its quarters.
struct Decoded
{
    int width = 0;
    int height = 0;
    bool hasMetadata = false;
    Colour topLeft = {}, topRight = {}, bottomLeft = {}, bottomRight = {};
};

// Writes a picture with a red, a green, a blue and a white quarter, from the top left to the bottom
// right. The ending decides the format. Seen upright it is `width` x `height`; its pixels are
// turned for `orientation`, which the file's EXIF data then names.
void writePicture(const std::string &path, int width, int height, int orientation = 1);

// Sets an EXIF, IPTC or XMP value in the file; may be repeated for values that come in lists.
void addMetadata(const std::string &path, const std::string &key, const std::string &value);

void writeBytes(const std::string &path, const std::string &bytes);
std::string readBytes(const std::string &path);

// The total size of the files below the folder.
std::int64_t sizeOfFiles(const std::string &folder);

Decoded decode(const std::string &bytes);

// Whether the channels differ by no more than what JPEG loses.
bool isNear(const Colour &a, const Colour &b);
