#pragma once

#include "http/router.h"
#include "index/records.h"

class Database;
class NewPhotoFile;
struct Asked;
struct AtomEntry;
struct FolderState;

// Writing to the service: comments and tags on photos, their deletion, and new photos. Everybody
// comments on what they may see; tags and photos are for one's own albums, and a comment goes by
// its author or by the owner of the photo. What is stored is answered with 201 and its entry.
class Posting
{
public:
    // `scheme` as for Feeds.
    Posting(Database &database, std::string scheme);
    void addRoutes(Router &router);

private:
    using Answer = void (Posting::*)(Asked &);

    Router::Handler withToken(Answer answer);
    std::size_t uploadLimit(const Router::Call &call, httplib::Response &response);

    void postRemark(Asked &asked);
    void postComment(Asked &asked, const PhotoRecord &photo, const AtomEntry &entry);
    void postTag(Asked &asked, const PhotoRecord &photo, const AtomEntry &entry);
    void deleteComment(Asked &asked);
    void deleteTag(Asked &asked);
    void postPhoto(Asked &asked);
    void storePhoto(Asked &asked, const FolderState &album, const AtomEntry &entry,
                    NewPhotoFile &file);

    Database &mDatabase;
    const std::string mScheme;
};
