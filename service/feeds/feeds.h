#pragma once

#include "feeds/featuredlist.h"
#include "http/router.h"
#include "index/gatheredalbums.h"

class Database;
class ShownPhotos;
struct Asked;

// Answers the feed addresses from the index. The origin of the addresses that the feeds name is
// the host that the client asked for.
class Feeds
{
public:
    struct Settings
    {
        std::string scheme; // of the addresses in the feeds: "https" or "http"
        GatheredKinds gathered;
        FeaturedList::Today today;
    };

    Feeds(Database &database, ShownPhotos &shown, Settings settings);
    void addRoutes(Router &router);

private:
    using Answer = void (Feeds::*)(Asked &);

    Router::Handler openToAll(Answer answer);
    Router::Handler withToken(Answer answer);

    void featured(Asked &asked);
    void search(Asked &asked);
    void albums(Asked &asked);
    void albumPhotos(Asked &asked);
    void gatheredPhotos(Asked &asked, const Page &page);
    Gathering gatheringFor(const Asked &asked) const;
    void aboutPhoto(Asked &asked);
    void comments(Asked &asked, const PhotoRecord &photo);
    void tags(Asked &asked, const PhotoRecord &photo);
    void contacts(Asked &asked);

    Database &mDatabase;
    ShownPhotos &mShown;
    const Settings mSettings;
    FeaturedList mFeatured;
};
