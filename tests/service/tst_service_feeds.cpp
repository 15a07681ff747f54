#include "support/testservice.h"

#include "feeds/featuredlist.h"
#include "index/tokens.h"

#include <gtest/gtest.h>

#include <set>

using Titles = std::vector<std::string>;

namespace {

const char base[] = "/data/feed/api";

class Feeds : public testing::Test, protected TestService
{
protected:
    void SetUp() override
    {
        addPhoto("Summer/one.jpg", {{"Exif.Photo.DateTimeOriginal", "2012:03:01 10:00:00"},
                                    {"Exif.Image.ImageDescription", "A <b>dog</b> & \"cat\" 🐕"},
                                    {"Iptc.Application2.Keywords", "Dogs"}});
        addPhoto("Summer/two.jpg", {{"Exif.Photo.DateTimeOriginal", "2013:03:01 10:00:00"}});
        addPhoto("Winter/three.jpg");
        start();
        addUser("ben@orvala.example", "Ben", "ben");
        writePicture(file("ben/portrait.jpg"), 32, 48);
        std::filesystem::create_directories(file("ben/Secret"));
        writePicture(file("ben/Secret/hidden.jpg"), 32, 48);
        writeBytes(file("ben/Secret/.private"), "");
        scan();
    }

    json album() { return feed(albumPath("Summer")); }
    std::string photoPath(int index) { return pathOf(valueOf(album()["entry"][index], "id")); }
};

} // namespace

TEST_F(Feeds, albumsAndPhotosCarryWhatTheirRecordsRead)
{
    const json summer = feed(std::string(base) + "/user/default")["entry"][1];
    EXPECT_EQ(valueOf(summer, "published"), "2013-03-01T10:00:00.000Z");
    EXPECT_EQ(valueOf(summer, "gphoto$numphotos"), "2");
    EXPECT_EQ(valueOf(summer, "gphoto$user"), "1");
    EXPECT_EQ(valueOf(summer, "gphoto$nickname"), "Anna");
    EXPECT_EQ(statusOf(pathOf(summer["media$group"]["media$content"][0]["url"])), 200);
    const json list = album();
    EXPECT_EQ(titlesOf(list), (Titles{"one", "two"}));
    const json photo = list["entry"][0];
    EXPECT_EQ(valueOf(photo, "summary"), "A <b>dog</b> & \"cat\" 🐕");
    EXPECT_EQ(valueOf(photo, "published"), "2012-03-01T10:00:00.000Z");
    EXPECT_EQ(valueOf(photo, "gphoto$width"), "48");
    EXPECT_EQ(valueOf(photo, "gphoto$height"), "32");
    EXPECT_EQ(valueOf(photo["author"][0], "gphoto$user"), "1");
    EXPECT_EQ(valueOf(photo["media$group"], "media$keywords"), "Dogs");
    EXPECT_EQ("/data/feed/api/user/1/albumid/" + valueOf(photo, "gphoto$albumid") + "/photoid/" +
                  valueOf(photo, "gphoto$id"),
              photoPath(0));
    const json thumbnails = photo["media$group"]["media$thumbnail"];
    ASSERT_EQ(thumbnails.size(), 3u);
    EXPECT_LE(thumbnails[0]["width"], thumbnails[2]["width"]);
}

TEST_F(Feeds, featuredPhotosAreAllPublicOnesInAStableOrder)
{
    const std::string path = std::string(base) +
                             "/featured?start-index=1&max-results=2&v=2"
                             "&prettyprint=true&alt=json&strict=true&kind=photo";
    const json first = publicFeed(path);
    EXPECT_EQ(valueOf(first, "openSearch$totalResults"), "4");
    EXPECT_EQ(valueOf(first, "openSearch$startIndex"), "1");
    EXPECT_EQ(valueOf(first, "openSearch$itemsPerPage"), "2");
    Titles titles = titlesOf(first);
    for (const auto &title :
         titlesOf(publicFeed(std::string(base) + "/featured?start-index=3&max-results=2")))
        titles.push_back(title);
    const std::set<std::string> all(titles.begin(), titles.end());
    EXPECT_EQ(all, (std::set<std::string>{"one", "two", "three", "portrait"}));
    EXPECT_EQ(titlesOf(publicFeed(std::string(base) + "/featured")), titles);
}

TEST_F(Feeds, pagesKeepToTheirLimits)
{
    const struct
    {
        const char *query;
        int status;
        std::size_t entries;
    } rows[] = {{"start-index=4&max-results=8", 200, 1},
                {"start-index=5&max-results=8", 200, 0},
                {"start-index=0&max-results=2", 200, 2},
                {"start-index=999999999999999999&max-results=999999999999999999", 200, 0},
                {"max-results=0", 200, 0},
                {"start-index=-1", 400, 0},
                {"start-index=1x", 400, 0},
                {"max-results=", 400, 0},
                {"max-results=9999999999999999999999", 400, 0}};
    for (const auto &row : rows) {
        const auto answer = get(std::string(base) + "/featured?" + row.query);
        ASSERT_EQ(answer->status, row.status) << row.query;
        const json document = json::parse(answer->body);
        if (row.status == 200)
            EXPECT_EQ(document["feed"]["entry"].size(), row.entries) << row.query;
        else
            EXPECT_EQ(document["error"]["code"], row.status);
    }
}

TEST_F(Feeds, addressesFollowTheHostThatWasAsked)
{
    const std::string local = "http://127.0.0.1:" + std::to_string(service().port());
    const struct
    {
        const char *host;
        std::string origin;
    } rows[] = {{"tv.example:8443", "http://tv.example:8443"},
                {"[::1]:8443", "http://[::1]:8443"},
                {"evil\"/x", local},
                {"a b", local}};
    for (const auto &row : rows) {
        const auto answer = get(std::string(base) + "/featured", {{"Host", row.host}});
        const std::string id = valueOf(json::parse(answer->body)["feed"], "id");
        EXPECT_EQ(id, row.origin + base + "/featured");
    }
}

TEST_F(Feeds, aRefreshTokenBuysAccess)
{
    httplib::Client client("127.0.0.1", service().port());
    const std::string known = "client_id=583920174652-abcdefghijklmnopqrstuvwxyz&client_secret="
                              "Qm7rT2vXk9LpZ4wHs1NdYb8E";
    const std::string refresh = issueTokens(database(), 1, 60).refresh;
    const auto post = [&](const std::string &body, const char *type) {
        return client.Post("/o/oauth2/token", body, type);
    };
    const std::string good = known + "&refresh_token=" + refresh + "&grant_type=refresh_token";
    for (const char *type : {"", "application/x-www-form-urlencoded", "text/plain"}) {
        const auto answer = post(good, type);
        ASSERT_EQ(answer->status, 200);
        const json body = json::parse(answer->body);
        EXPECT_EQ(body.count("refresh_token"), 0u);
        EXPECT_GT(body["expires_in"].get<int>(), 0);
        EXPECT_EQ(statusOf(std::string(base) +
                           "/user/default?access_token=" + body["access_token"].get<std::string>()),
                  200);
    }
    EXPECT_EQ(json::parse(post(good + "x", "")->body)["error"], "unsupported_grant_type");
    EXPECT_EQ(json::parse(post("x" + good, "")->body)["error"], "invalid_client");
    EXPECT_EQ(
        json::parse(post(known + "&refresh_token=no&grant_type=refresh_token", "")->body)["error"],
        "invalid_grant");
    EXPECT_EQ(statusOf(std::string(base) + "/user/default?access_token=" + refresh), 401);
}

TEST_F(Feeds, featuredShowsEverythingBeforeItRepeats)
{
    const auto shownOn = [&](const std::string &day, std::size_t count) {
        FeaturedList list(database(), [day] { return day; }); // as after a start of the service
        auto reader = database().read();
        std::vector<std::int64_t> ids = *list.photos(reader);
        EXPECT_EQ(std::set<std::int64_t>(ids.begin(), ids.end()).size(), 4u);
        ids.resize(count);
        list.noteShown(ids);
        return ids;
    };
    std::set<std::int64_t> seen;
    for (const char *day : {"2026-05-01", "2026-05-02", "2026-05-03", "2026-05-04"}) {
        const auto first = shownOn(day, 1);
        EXPECT_EQ(shownOn(day, 1), first); // the day keeps its order
        seen.insert(first.front());
    }
    EXPECT_EQ(seen.size(), 4u);
    std::set<std::vector<std::int64_t>> orders;
    for (int day = 10; day < 30; ++day)
        orders.insert(shownOn("2026-05-" + std::to_string(day), 4));
    EXPECT_GT(orders.size(), 3u);
}

TEST_F(Feeds, aBurstIsThinned)
{
    for (int i = 0; i < 20; ++i)
        addPhoto("Burst/" + std::to_string(i) + ".jpg",
                 {{"Exif.Photo.DateTimeOriginal", "2014:03:01 10:00:" + std::to_string(10 + i)}});
    scan();
    const Titles titles = titlesOf(publicFeed(std::string(base) + "/featured"));
    ASSERT_EQ(titles.size(), 24u);
    const auto isBurst = [](const std::string &title) { return std::isdigit(title[0]) != 0; };
    EXPECT_EQ(std::count_if(titles.begin(), titles.begin() + 5, isBurst), 1);
}
