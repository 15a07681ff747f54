#pragma once

#include "http/router.h"

class Database;
class ThumbnailStore;

// Answers the picture addresses: "photos/KEY/sWIDTH/NAME" and, for the full size,
// "photos/KEY/NAME". The key alone picks the photo; the name is for those who save it. Pictures
// take no token: the key is random and only stands in feeds, which do.
class PhotoPictures
{
public:
    PhotoPictures(Database &database, ThumbnailStore &store);
    void addRoutes(Router &router);

private:
    void answer(const std::string &key, int width, const httplib::Request &request,
                httplib::Response &response);

    Database &mDatabase;
    ThumbnailStore &mStore;
};
