#include "support/testservice.h"

#include "feeds/featuredlist.h"
#include "index/tokens.h"

#include <gtest/gtest.h>

#include <set>

namespace {

class Feeds : public testing::Test, protected TestService
{
protected:
    void SetUp() override
    {
        addPhoto("Summer/one.jpg", {{"Exif.Photo.DateTimeOriginal", "2012:03:01 10:00:00"},
                                    {"Exif.Image.ImageDescription", "A <b>dog</b> & \"cat\" 🐕"},
                                    {"Iptc.Application2.Keywords", "Dogs"}});
        addTaken("Summer/two.jpg", "2013:03:01 10:00:00");
        addPhoto("Winter/three.jpg");
        addPhoto("../ben/portrait.jpg");
        addPhoto("../ben/Secret/hidden.jpg");
        writeBytes(file("ben/Secret/.private"));
        start();
        addUser("ben@orvala.example", "Ben", "ben");
        scan();
    }
};

} // namespace

TEST_F(Feeds, albumsAndPhotosCarryWhatTheirRecordsRead)
{
    const json summer = feed(feedBase + "user/default")["entry"][1];
    EXPECT_EQ(valueOf(summer, "published"), "2013-03-01T10:00:00.000Z");
    EXPECT_EQ(valueOf(summer, "gphoto$user"), "1");
    EXPECT_EQ(valueOf(summer, "gphoto$nickname"), "Anna");
    EXPECT_EQ(statusOf(pathOf(summer["media$group"]["media$content"][0]["url"])), 200);
    const json list = feed(pathOf(valueOf(summer, "id")));
    EXPECT_EQ(titlesOf(list), (Titles{"one", "two"}));
    const json photo = list["entry"][0];
    EXPECT_EQ(valueOf(photo, "summary"), "A <b>dog</b> & \"cat\" 🐕");
    EXPECT_EQ(valueOf(photo, "published"), "2012-03-01T10:00:00.000Z");
    EXPECT_EQ(valueOf(photo, "gphoto$width") + " " + valueOf(photo, "gphoto$height"), "48 32");
    EXPECT_EQ(valueOf(photo["author"][0], "gphoto$user"), "1");
    EXPECT_EQ(valueOf(photo["media$group"], "media$keywords"), "Dogs");
    EXPECT_EQ(feedBase + "user/1/albumid/" + valueOf(photo, "gphoto$albumid") + "/photoid/" +
                  valueOf(photo, "gphoto$id"),
              pathOf(valueOf(photo, "id")));
    const json thumbnails = photo["media$group"]["media$thumbnail"];
    ASSERT_EQ(thumbnails.size(), 3u);
    EXPECT_LE(thumbnails[0]["width"], thumbnails[2]["width"]);
}

TEST_F(Feeds, pagesKeepToTheirLimits)
{
    const struct
    {
        const char *query;
        int status;
        std::size_t entries;
    } rows[] = {{"start-index=1&max-results=3&v=2&alt=json&strict=true&kind=photo", 200, 3},
                {"start-index=4&max-results=8", 200, 1},
                {"start-index=5&max-results=8", 200, 0},
                {"start-index=0&max-results=2", 200, 2},
                {"start-index=999999999999999999&max-results=999999999999999999", 200, 0},
                {"max-results=0", 200, 0},
                {"start-index=-1", 400, 0},
                {"start-index=1x", 400, 0},
                {"max-results=", 400, 0},
                {"max-results=9999999999999999999999", 400, 0}};
    for (const auto &row : rows) {
        const auto answer = get(feedBase + "featured?" + row.query);
        ASSERT_EQ(answer->status, row.status) << row.query;
        const json document = json::parse(answer->body);
        if (row.status != 200) {
            EXPECT_EQ(document["error"]["code"], row.status);
            continue;
        }
        EXPECT_EQ(document["feed"]["entry"].size(), row.entries) << row.query;
        EXPECT_EQ(valueOf(document["feed"], "openSearch$totalResults"), "4");
    }
}

TEST_F(Feeds, addressesFollowTheHostThatWasAsked)
{
    const std::string local = "http://127.0.0.1:" + std::to_string(service().port());
    const std::pair<const char *, std::string> rows[] = {
        {"tv.example:8443", "http://tv.example:8443"},
        {"[::1]:8443", "http://[::1]:8443"},
        {"evil\"/x", local},
        {"a b", local}};
    for (const auto &[host, origin] : rows) {
        const auto answer = get(feedBase + "featured", {{"Host", host}});
        const std::string id = valueOf(json::parse(answer->body)["feed"], "id");
        EXPECT_EQ(id, origin + feedBase + "featured");
    }
}

TEST_F(Feeds, aRefreshTokenBuysAccess)
{
    const std::string client = "client_id=583920174652-abcdefghijklmnopqrstuvwxyz&client_secret="
                               "Qm7rT2vXk9LpZ4wHs1NdYb8E&refresh_token=";
    const std::string refresh = issueTokens(database(), 1, 60).refresh;
    const std::string good = client + refresh + "&grant_type=refresh_token";
    for (const char *type : {"", "application/x-www-form-urlencoded", "text/plain"}) {
        const json body = json::parse(post("/o/oauth2/token", good, type)->body);
        EXPECT_EQ(body.count("refresh_token"), 0u);
        EXPECT_GT(body["expires_in"].get<int>(), 0);
        EXPECT_EQ(statusOf(feedBase +
                           "user/default?access_token=" + body["access_token"].get<std::string>()),
                  200);
    }
    const std::pair<std::string, const char *> rows[] = {
        {good + "x", "unsupported_grant_type"},
        {"x" + good, "invalid_client"},
        {client + "no&grant_type=refresh_token", "invalid_grant"}};
    for (const auto &[body, error] : rows)
        EXPECT_EQ(json::parse(post("/o/oauth2/token", body, "")->body)["error"], error);
}

TEST_F(Feeds, featuredShowsEverythingBeforeItRepeats)
{
    EXPECT_EQ(sortedTitlesOf(publicFeed(feedBase + "featured")),
              (Titles{"one", "portrait", "three", "two"}));
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
    for (const char *day : {"2026-05-02", "2026-05-03", "2026-05-04", "2026-05-05"}) {
        const auto first = shownOn(day, 1);
        EXPECT_EQ(shownOn(day, 1), first); // the day keeps its order
        seen.insert(first.front());
    }
    EXPECT_EQ(seen.size(), 4u);
    std::set<std::vector<std::int64_t>> orders;
    for (const char *day : {"2026-05-06", "2026-05-07", "2026-05-08", "2026-05-09"})
        orders.insert(shownOn(day, 4));
    EXPECT_GT(orders.size(), 1u);
}

TEST_F(Feeds, aBurstIsThinned)
{
    for (int i = 10; i < 30; ++i)
        addTaken("Burst/" + std::to_string(i) + ".jpg", "2014:03:01 10:00:" + std::to_string(i));
    scan();
    const Titles titles = titlesOf(publicFeed(feedBase + "featured"));
    ASSERT_EQ(titles.size(), 24u);
    const auto isBurst = [](const std::string &title) { return std::isdigit(title[0]) != 0; };
    EXPECT_EQ(std::count_if(titles.begin(), titles.begin() + 5, isBurst), 1);
}
