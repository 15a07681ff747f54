#pragma once

#include "feeds/feedrequest.h"
#include "feeds/feedwriter.h"
#include "http/router.h"
#include "index/records.h"

class Session;

// One request to the feeds: its session, who asks and what its address names. A step that yields
// nothing has sent the answer that says why.
struct Asked
{
    Session &session;
    const Router::Call &call;
    httplib::Response &response;
    std::string origin;
    UserRecord asking; // after identify() only
    UserRecord owner;  // of the feed; after identify() only

    void refuse(int status, const std::string &message);
    // Who asks, by the access token, and whose feed it is, by the first piece of the address.
    bool identify();
    bool isOwn() const { return owner.id == asking.id; }
    std::optional<Page> page(const PageLimits &limits);
    // The album of the address' second piece, if the one who asks may see it.
    std::optional<AlbumRecord> album();
    // The photo of its third piece, in that album.
    std::optional<PhotoRecord> photo();
    void send(const std::string &title, const Page &page, std::int64_t total, FeedJson entries);
    // A list that is always sent whole.
    void sendAll(const std::string &title, FeedJson entries);
};
