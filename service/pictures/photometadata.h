#pragma once

#include <optional>
#include <string>
#include <vector>

// What a photo file says about itself. Every text is valid UTF-8 without control characters other
// than line breaks and tabs; an absent field is empty.
struct PhotoMetadata
{
    int width = 0; // upright pixels: already swapped for the orientations that lie on a side
    int height = 0;
    std::string title;
    std::string caption;
    std::vector<std::string> keywords; // in the file's order, each once; then whom it shows
    std::string taken;                 // local time as 2026-05-01T10:00:00, empty if unknown
    std::optional<double> latitude;    // degrees, north positive
    std::optional<double> longitude;   // degrees, east positive
    std::string mimeType;              // by the content, whatever the file is called
};

// No photo has more pixels than this; a larger one counts as unreadable.
constexpr long long maximumPhotoPixels = 64'000'000;

// Reads a JPEG, PNG, GIF, WebP or HEIC file without decoding its pixels. A file that is none of
// these, is cut or is too large gives no value, and the reason in `error` (which may be null).
// Damaged metadata in a good picture only leaves its fields empty. May be called from any thread.
std::optional<PhotoMetadata> readPhotoMetadata(const std::string &path, std::string *error);
