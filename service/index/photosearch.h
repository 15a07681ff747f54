#pragma once

#include <cstdint>

class Session;

// Keeps the search texts true: a photo that everybody may see is found by its title, caption, tags
// and album, any other photo is not found. To be called whenever one of them changes.
void refreshPhotoSearch(Session &session, std::int64_t photoId);
void refreshAlbumSearch(Session &session, std::int64_t albumId);
