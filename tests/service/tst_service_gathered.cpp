#include "support/testservice.h"

#include "index/remarks.h"

#include <gtest/gtest.h>

namespace {

const std::string own = feedBase + "user/default";

class GatheredAlbums : public testing::Test, protected TestService
{
protected:
    void SetUp() override { gathered = allGatheredKinds(); }

    Titles photosIn(const std::string &album) { return titlesOf(feed(own + "/albumid/" + album)); }
};

} // namespace

TEST_F(GatheredAlbums, standAroundTheFoldersAndCountAsAlbumsDo)
{
    addTaken("Alps/peak.jpg", "2012:03:01 10:00:00");
    addTaken("Alps/hut.jpg", "2012:07:02 10:00:00");
    addTaken("Home/cat.jpg", "2011:05:01 23:59:59");
    addPhoto("Home/bad.jpg");
    writeBytes(photo("Home/bad.jpg"), "no picture");
    start();
    const json list = feed(own);
    const Titles all = {"On this day", "Recently added", "Never shown", "Home", "Alps",
                        "2012",        "July 2012",      "March 2012",  "2011", "May 2011"};
    EXPECT_EQ(titlesOf(list), all);
    EXPECT_EQ(valueOf(list, "openSearch$totalResults"), std::to_string(all.size()));
    for (const json &album : list["entry"]) {
        const json photos = feed(pathOf(valueOf(album, "id")));
        EXPECT_EQ(valueOf(album, "gphoto$numphotos"), valueOf(photos, "openSearch$totalResults"));
        EXPECT_EQ(valueOf(album, "gphoto$numphotos"), std::to_string(photos["entry"].size()));
        EXPECT_EQ(statusOf(pathOf(album["media$group"]["media$thumbnail"][0]["url"])), 200);
        EXPECT_EQ(valueOf(photos, "title"), valueOf(album, "title"));
    }
    EXPECT_EQ(photosIn("year-2012"), (Titles{"peak", "hut"}));
    EXPECT_EQ(photosIn("month-2012-07"), Titles{"hut"});
    // Any cut through the list is the same as that part of the whole.
    for (std::size_t first = 0; first < all.size(); ++first) {
        const json part = feed(own + "?max-results=3&start-index=" + std::to_string(first + 1));
        const auto end = std::min(first + 3, all.size());
        EXPECT_EQ(titlesOf(part), Titles(all.begin() + first, all.begin() + end));
    }
    EXPECT_EQ(photosIn("year-2013"), Titles{});
    for (const char *missing :
         {"year-12", "month-2012-13", "month-", "recent/", "year-2012'", "%00", "-1", "years"})
        EXPECT_EQ(feed(own + "/albumid/" + missing), nullptr) << missing;
}

TEST_F(GatheredAlbums, onThisDayKnowsTheLeapDay)
{
    for (const char *taken : {"2008:02:29", "2009:02:28", "2012:02:28", "2012:02:29", "2013:03:01",
                              "2016:02:29", "2026:02:28"})
        addTaken(std::string("a/") + taken + ".jpg", std::string(taken) + " 12:00:00");
    start();
    const std::pair<const char *, Titles> rows[] = {
        {"2026-02-28", {"2016:02:29", "2012:02:28", "2012:02:29", "2009:02:28", "2008:02:29"}},
        {"2016-02-28", {"2012:02:28", "2009:02:28"}},
        {"2016-02-29", {"2012:02:29", "2008:02:29"}},
        {"2026-03-01", {"2013:03:01"}},
        {"2013-03-01", {}}};
    for (const auto &[day, photos] : rows) {
        today = day;
        EXPECT_EQ(photosIn("on-this-day"), photos) << day;
    }
}

TEST_F(GatheredAlbums, recentlyAddedGoesByArrival)
{
    addTaken("a/old.jpg", "2001:01:01 10:00:00");
    addTaken("a/older.jpg", "2000:01:01 10:00:00");
    const auto hourAgo = fs::file_time_type::clock::now() - std::chrono::hours(1);
    fs::last_write_time(photo("a/old.jpg"), hourAgo);
    fs::last_write_time(photo("a/older.jpg"), hourAgo + std::chrono::minutes(1));
    start();
    EXPECT_EQ(photosIn("recent"), (Titles{"older", "old"}));
    addTaken("b/scanned slide.jpg", "1975:01:01 10:00:00");
    fs::last_write_time(photo("b/scanned slide.jpg"), hourAgo - std::chrono::hours(9));
    scan();
    EXPECT_EQ(photosIn("recent"), (Titles{"scanned slide", "older", "old"}));
}

TEST_F(GatheredAlbums, likedAndNeverShownFollowWhatPeopleDo)
{
    addTaken("a/one.jpg", "2001:01:01 10:00:00");
    addTaken("a/two.jpg", "2002:01:01 10:00:00");
    start();
    const json photos = feed(albumPath("a"))["entry"];
    const std::int64_t second = std::stoll(valueOf(photos[1], "gphoto$id"));
    addTag(database(), second, 1, "LIKED");
    EXPECT_EQ(photosIn("liked"), Titles{"two"});
    removeTag(database(), second, "LIKED");
    EXPECT_EQ(photosIn("liked"), Titles{});
    statusOf(pathOf(photos[0]["media$group"]["media$thumbnail"][2]["url"]));
    EXPECT_EQ(photosIn("never-shown"), (Titles{"one", "two"}));
    statusOf(pathOf(photos[0]["content"]["src"]));
    EXPECT_EQ(photosIn("never-shown"), Titles{"two"});
    statusOf(pathOf(photos[1]["content"]["src"]));
    stop(); // which writes it down
    start();
    EXPECT_EQ(photosIn("never-shown"), Titles{});
}

TEST_F(GatheredAlbums, areTheirOwnersAloneAndOnlyThoseThatAreWanted)
{
    addTaken("secret/one.jpg", "2001:05:01 10:00:00");
    writeBytes(photo("secret/.private"));
    gathered = {Gathered::Recent, Gathered::Months};
    start();
    addUser("ben@orvala.example", "Ben", "ben");
    scan();
    EXPECT_EQ(titlesOf(feed(own)), (Titles{"Recently added", "secret", "May 2001"}));
    EXPECT_EQ(photosIn("month-2001-05"), Titles{"one"});
    EXPECT_EQ(feed(own + "/albumid/year-2001"), nullptr);
    const std::string access = "?access_token=" + token("ben@orvala.example");
    EXPECT_EQ(titlesOf(publicFeed(feedBase + "user/1" + access)), Titles{});
    EXPECT_EQ(statusOf(feedBase + "user/1/albumid/month-2001-05" + access), 404);
}
