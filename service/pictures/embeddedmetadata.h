#pragma once

#include "pictures/photometadata.h"

#include <string_view>

// The three blocks of metadata that a photo file may hold, as they stand in it; empty if absent.
struct EmbeddedMetadata
{
    std::string_view exif;
    std::string_view iptc;
    std::string_view xmp;
};

// Fills in the texts, the time and the place. XMP wins over IPTC, and IPTC over EXIF; people who
// are named in XMP count as keywords. A damaged block is left out. May be called from any thread.
void readEmbeddedMetadata(const EmbeddedMetadata &blocks, PhotoMetadata *metadata);
