#pragma once

#include "feeds/feedwriter.h"
#include "index/database.h"
#include "pictures/picturefiles.h"
#include "scan/scanner.h"
#include "service.h"

#include <httplib.h>

#include <map>

using nlohmann::json;
using Titles = std::vector<std::string>;
namespace fs = std::filesystem;

inline const std::string feedBase = "/data/feed/api/";

// A running service with a folder of photos and a data folder of its own.
class TestService
{
public:
    // Photos below the folder "photos" belong to anna@orvala.example.
    TestService();

    // Without gathered albums, unless a test asks for them.
    GatheredKinds gathered = {};
    std::string today = "2026-05-01";
    int threads = 64;

    // And waits until the service knows the folders.
    void start(bool withTls = false);
    void stop() { mService.reset(); }
    Service &service() { return *mService; }
    Database &database() { return mService->database(); }
    // Walks through the folders and waits for the end.
    void scan() { mService->scanner().scanAndWait(); }

    std::string file(const std::string &name) const { return mFolder.file(name); }
    std::string photo(const std::string &name) const { return file("photos/" + name); }
    // A small picture below "photos", with the metadata that is given by key.
    void addPhoto(const std::string &name, const std::map<std::string, std::string> &metadata = {});
    // `time` as in "2012:03:01 10:00:00".
    void addTaken(const std::string &name, const std::string &time,
                  const std::string &caption = "");
    std::int64_t addUser(const std::string &mail, const std::string &name,
                         const std::string &folder);
    // An access token for the user, valid for the given time.
    std::string token(const std::string &mail, std::int64_t seconds = 3600);
    bool import(const json &document);

    httplib::Result get(const std::string &path, const httplib::Headers &headers = {});
    httplib::Result post(const std::string &path, const std::string &body,
                         const std::string &type = "application/atom+xml");
    httplib::Result erase(const std::string &path);
    // The feed with Anna's token, or without one; null with any other answer than 200.
    json feed(const std::string &path);
    json publicFeed(const std::string &path);
    int statusOf(const std::string &path);
    // The feed of the only album with this title, as in "/data/feed/api/user/1/albumid/2".
    std::string albumPath(const std::string &title);

private:
    TemporaryFolder mFolder;
    std::unique_ptr<Service> mService;
    std::string mToken;
};

// Titles of a feed's entries, as they come or by the alphabet.
Titles titlesOf(const json &feed);
Titles sortedTitlesOf(const json &feed);
// An entry as a client posts it.
std::string entryOf(const std::string &content, const std::string &kind);
// Where something that belongs to a photo is deleted.
std::string entryPathOf(std::string photo, const std::string &entry);
// The path of an address that the service has given.
std::string pathOf(const std::string &address);
// "feed" > name > "$t".
std::string valueOf(const json &feed, const std::string &name);
// False when the condition does not come true within half a minute.
bool waitFor(const std::function<bool()> &condition);
