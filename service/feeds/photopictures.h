#pragma once

#include "http/router.h"

class Database;
class ShownPhotos;
class ThumbnailStore;

// Answers the picture addresses: "photos/KEY/sWIDTH/NAME" and, for the full size,
// "photos/KEY/NAME". The key alone picks the photo; the name is for those who save it. Pictures
// take no token: the key is random and only stands in feeds, which do.
class PhotoPictures
{
public:
    // What is larger than a thumbnail goes to a screen, which `shown` is told.
    PhotoPictures(Database &database, ThumbnailStore &store, ShownPhotos &shown);
    void addRoutes(Router &router);

private:
    void answer(const std::string &key, int width, const httplib::Request &request,
                httplib::Response &response);

    Database &mDatabase;
    ThumbnailStore &mStore;
    ShownPhotos &mShown;
};
