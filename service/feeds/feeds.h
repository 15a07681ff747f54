#pragma once

#include "feeds/featuredlist.h"
#include "http/router.h"
#include "index/records.h"

class Database;
struct Asked;

// Answers the feed addresses from the index. `scheme` ("https" or "http") begins the addresses that
// the feeds name; the rest of their origin is the host that the client asked for.
class Feeds
{
public:
    Feeds(Database &database, std::string scheme);
    void addRoutes(Router &router);

private:
    using Answer = void (Feeds::*)(Asked &);

    Router::Handler openToAll(Answer answer);
    Router::Handler withToken(Answer answer);

    void featured(Asked &asked);
    void search(Asked &asked);
    void albums(Asked &asked);
    void albumPhotos(Asked &asked);
    void aboutPhoto(Asked &asked);
    void comments(Asked &asked, const PhotoRecord &photo);
    void tags(Asked &asked, const PhotoRecord &photo);
    void contacts(Asked &asked);

    Database &mDatabase;
    const std::string mScheme;
    FeaturedList mFeatured;
};
