#include "support/testservice.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "index/albumwriter.h"
#include "index/catalogue.h"
#include "index/photosearch.h"
#include "index/remarks.h"
#include "index/schema.h"
#include "index/tokens.h"
#include "index/users.h"

#include <gtest/gtest.h>

namespace {

class Scan : public testing::Test, protected TestService
{
protected:
    Titles featured() { return sortedTitlesOf(publicFeed(feedBase + "featured")); }
    Titles albums() { return sortedTitlesOf(feed(feedBase + "user/default")); }
    Titles found(const std::string &text)
    {
        return titlesOf(publicFeed(feedBase + "all?q=" + text));
    }
    json firstOf(const std::string &album) { return feed(albumPath(album))["entry"][0]; }
    // The address of its picture.
    std::string pictureOfFirst()
    {
        return pathOf(publicFeed(feedBase + "featured")["entry"][0]["content"]["src"]);
    }
};

} // namespace

TEST_F(Scan, followsWhatHappensInTheFolder)
{
    addPhoto("a/one.jpg");
    addPhoto("a/two.jpg");
    addPhoto("b/three.jpg");
    writeBytes(photo("a/note.txt"), "no photo");
    start();
    EXPECT_EQ(featured(), (Titles{"one", "three", "two"}));
    const std::string album = albumPath("a");
    const std::string address = valueOf(feed(album)["entry"][0], "id");

    fs::remove(photo("a/two.jpg"));
    fs::remove_all(photo("b"));
    addPhoto("c/d/four.jpg");
    addPhoto("a/one.jpg", {{"Exif.Image.ImageDescription", "Now with a caption"}});
    fs::last_write_time(photo("a/one.jpg"),
                        fs::file_time_type::clock::now() + std::chrono::hours(1));
    scan();
    EXPECT_EQ(featured(), (Titles{"four", "one"}));
    EXPECT_EQ(albums(), (Titles{"a", "d"}));
    EXPECT_EQ(valueOf(feed(album)["entry"][0], "id"), address);
    EXPECT_EQ(valueOf(feed(album)["entry"][0], "summary"), "Now with a caption");
    EXPECT_EQ(found("capt"), Titles{"one"});
    EXPECT_EQ(found("three"), Titles{});
}

TEST_F(Scan, movedFilesStayTheSamePhotos)
{
    const char *const names[] = {"m/rename", "m/later", "m/earlier", "old/one",
                                 "m/two",    "m/taken", "m/kept"};
    for (const std::string name : names)
        addPhoto(name + ".jpg", {{"Exif.Image.ImageDescription", name}});
    start();
    const auto places = [&] { // by the photos' ids
        std::map<std::string, std::string> placeOf;
        const json own = feed(feedBase + "user/default");
        for (const json &album : own["entry"]) {
            const json photos = feed(pathOf(valueOf(album, "id")))["entry"];
            EXPECT_EQ(valueOf(album, "gphoto$numphotos"), std::to_string(photos.size()));
            for (const json &photo : photos)
                placeOf[valueOf(photo, "gphoto$id")] =
                    valueOf(album, "title") + "/" + valueOf(photo, "title");
        }
        return placeOf;
    };
    const auto before = places();
    fs::remove(photo("m/taken.jpg"));
    scan();
    stop(); // what happens meanwhile counts too
    for (const char *folder : {"a", "z"})
        fs::create_directories(photo(folder));
    fs::rename(photo("old"), photo("new"));
    const std::map<std::string, std::string> moves = {{"m/rename", "m/a new name"},
                                                      {"m/later", "z/later"},
                                                      {"m/earlier", "a/other"},
                                                      {"m/two", "m/taken"}};
    for (const auto &[from, to] : moves)
        fs::rename(photo(from + ".jpg"), photo(to + ".jpg"));
    fs::copy_file(photo("m/kept.jpg"), photo("z/copy.jpg"));
    start();
    auto after = places();
    EXPECT_EQ(after.size(), 7u); // with the copy, which is a photo of its own
    for (const auto &[id, place] : before) {
        const auto move = moves.find(place);
        const std::string stayed = place == "m/taken" ? "" : place == "old/one" ? "new/one" : place;
        EXPECT_EQ(after[id], move == moves.end() ? stayed : move->second) << place;
    }
    EXPECT_EQ(found("new+one"), Titles{"one"});
}

TEST_F(Scan, aRemovedKeywordStaysAway)
{
    addPhoto("a/one.jpg", {{"Iptc.Application2.Keywords", "Dogs, Paris"}});
    start();
    const auto tags = [&] { return valueOf(firstOf("a")["media$group"], "media$keywords"); };
    const auto touch = [&] {
        addMetadata(photo("a/one.jpg"), "Exif.Image.ImageDescription", "Changed");
        fs::last_write_time(photo("a/one.jpg"),
                            fs::last_write_time(photo("a/one.jpg")) + std::chrono::hours(1));
        scan();
    };
    EXPECT_EQ(tags(), "Dogs, Paris");
    EXPECT_TRUE(removeTag(database(), 1, "Dogs"));
    touch();
    EXPECT_EQ(tags(), "Paris");
    addTag(database(), 1, 1, "Dogs");
    touch();
    EXPECT_EQ(tags(), "Dogs, Paris");
}

TEST_F(Scan, whatIsUnchangedIsNotReadAgain)
{
    addPhoto("a/one.jpg");
    start();
    stop();
    const auto time = fs::last_write_time(photo("a/one.jpg"));
    writeBytes(photo("a/one.jpg"), std::string(fs::file_size(photo("a/one.jpg")), 'x'));
    fs::last_write_time(photo("a/one.jpg"), time);
    start();
    EXPECT_EQ(featured(), Titles{"one"}); // whoever reads it finds no picture
}

TEST_F(Scan, aLostDiskLosesNothing)
{
    addPhoto("a/one.jpg");
    start();
    ASSERT_TRUE(import(
        {{"comments",
          {{{"photo", "a/one.jpg"}, {"author", "anna@orvala.example"}, {"text", "Nice"}}}}}));
    const std::string id = valueOf(firstOf("a"), "id");
    fs::rename(file("photos"), file("away"));
    scan();
    EXPECT_EQ(featured(), Titles{"one"});
    fs::create_directories(file("photos")); // an empty mount point
    scan();
    EXPECT_EQ(featured(), Titles{"one"});
    // A folder that goes and comes back keeps its photos' comments.
    fs::remove(file("photos"));
    fs::rename(file("away"), file("photos"));
    addPhoto("b/two.jpg");
    fs::rename(photo("a"), file("a"));
    scan();
    EXPECT_EQ(featured(), Titles{"two"});
    fs::rename(file("a"), photo("a"));
    scan();
    const json back = firstOf("a");
    EXPECT_EQ(valueOf(back, "id"), id);
    EXPECT_EQ(valueOf(back, "gphoto$commentCount"), "1");
}

TEST_F(Scan, unreadableFilesStayInTheirAlbumOnly)
{
    addPhoto("a/good.jpg");
    writeBytes(photo("a/bad.jpg"), "no picture");
    writeBytes(photo("a/empty.png"));
    fs::create_directory_symlink("/", photo("b"));
    start();
    EXPECT_EQ(featured(), Titles{"good"});
    const json entries = feed(albumPath("a"))["entry"];
    ASSERT_EQ(entries.size(), 3u);
    for (const json &entry : entries)
        EXPECT_EQ(statusOf(pathOf(entry["content"]["src"])),
                  valueOf(entry, "title") == "good" ? 200 : 415);
    auto reader = database().read();
    Titles paths;
    for (const UnreadablePhoto &unreadable : unreadablePhotos(reader)) {
        paths.push_back(unreadable.path);
        EXPECT_NE(unreadable.error, "");
    }
    EXPECT_EQ(paths, (Titles{photo("a/bad.jpg"), photo("a/empty.png"), photo("b")}));
}

TEST_F(Scan, oddNamesAreServed)
{
    addPhoto("odd \xFF&<x>/plain.jpg");
    for (const char *name :
         {"per%cent #1?.jpg", "quote\"&<b>.jpg", "caf\xC3\xA9 \xF0\x9F\x90\x95.jpg",
          "latin\xE9.jpg", "line\nbreak.jpg", "dot.dot.JPEG"})
        fs::copy_file(photo("odd \xFF&<x>/plain.jpg"), photo("odd \xFF&<x>/") + name);
    start();
    EXPECT_EQ(albums(), Titles{"odd \xEF\xBF\xBD&<x>"});
    const json list = feed(albumPath("odd \xEF\xBF\xBD&<x>"));
    ASSERT_EQ(list["entry"].size(), 7u);
    for (const json &entry : list["entry"])
        EXPECT_EQ(statusOf(pathOf(entry["media$group"]["media$thumbnail"][0]["url"])), 200);
    const Titles titles = titlesOf(list);
    EXPECT_EQ(std::count(titles.begin(), titles.end(), "latin\xEF\xBF\xBD"), 1);
}

TEST_F(Scan, linksAndHiddenNames)
{
    addPhoto("a/one.jpg");
    addPhoto(".trash/gone.jpg");
    addPhoto("a/.hidden.jpg");
    fs::create_directory_symlink(photo(""), photo("a/circle"));
    fs::create_symlink(photo("a/missing.jpg"), photo("a/broken.jpg"));
    writePicture(file("foreign.jpg"), 16, 16); // what leads out of the folder is left out
    fs::create_symlink(file("foreign.jpg"), photo("a/out.jpg"));
    fs::create_directory_symlink(file(""), photo("a/outside"));
    start();
    EXPECT_EQ(featured(), Titles{"one"});
    const std::string picture = pictureOfFirst();
    EXPECT_EQ(statusOf(picture), 200);
    fs::remove(photo("a/one.jpg"));
    fs::create_symlink(file("foreign.jpg"), photo("a/one.jpg"));
    EXPECT_EQ(statusOf(picture), 404);
}

TEST_F(Scan, aWatchedFolderNeedsNoScan)
{
    addPhoto("a/one.jpg");
    start();
    addPhoto("b/two.jpg");
    EXPECT_TRUE(waitFor([&] { return featured() == Titles{"one", "two"}; }));
    EXPECT_EQ(json::parse(get("/health")->body)["photos"], 2);
}

TEST_F(Scan, privacyFollowsItsMark)
{
    addPhoto("a/b/one.jpg");
    fs::create_directories(photo("c"));
    start();
    const std::string address = pictureOfFirst();
    EXPECT_EQ(statusOf(address), 200);
    writeBytes(photo("a/.private"));
    scan();
    EXPECT_EQ(featured(), Titles{});
    EXPECT_EQ(statusOf(address), 404); // whoever knew it
    EXPECT_EQ(found("one"), Titles{});
    EXPECT_EQ(albums(), Titles{"b"});
    fs::remove(photo("a/.private"));
    scan();
    EXPECT_EQ(found("one"), Titles{"one"});
    const std::string open = pictureOfFirst();
    writeBytes(photo("c/.private"));
    fs::rename(photo("a/b/one.jpg"), photo("c/one.jpg"));
    scan();
    EXPECT_EQ(featured(), Titles{});
    EXPECT_EQ(statusOf(open), 404); // moving hides as well
}

TEST_F(Scan, importsWaitForTheirPhotos)
{
    start();
    const auto remark = [](const char *author, const char *kind) {
        return json::array({{{"photo", "later.jpg"}, {"author", author}, {kind, "late"}}});
    };
    const json document = {{"users", {{{"mail", "cleo@orvala.example"}, {"name", "Cleo"}}}},
                           {"comments", remark("cleo@orvala.example", "text")},
                           {"tags", remark("cleo@orvala.example", "tag")}};
    ASSERT_TRUE(import(document));
    addPhoto("later.jpg");
    scan();
    ASSERT_TRUE(import(document)); // changes nothing
    const json photo = firstOf("photos");
    EXPECT_EQ(valueOf(photo, "gphoto$commentCount"), "1");
    EXPECT_EQ(valueOf(photo["media$group"], "media$keywords"), "late");
    for (const json &bad : {json::array(), json({{"users", {1}}}), json({{"users", 1}}),
                            json({{"tags", remark("nobody", "tag")}})})
        EXPECT_FALSE(import(bad)) << bad;
}

// The oldest index that was in use: version 3.
TEST_F(Scan, anOlderIndexIsUpgraded)
{
    writeBytes(file("index.db"), "");
    std::string error;
    {
        Session session(file("index.db"), false);
        ASSERT_TRUE(upgradeSchema(session, &error, 3)) << error;
        session.database().exec(
            "INSERT INTO users VALUES (1, 'anna@orvala.example', 'Anna', '/photos', 'hash');"
            "INSERT INTO tokens VALUES ('" +
            fingerprint("secret") +
            "', 1, 1, 99999999999);"
            "INSERT INTO albums VALUES (1, 1, 'a', 'Alps', 0, 1, '2012-03-01T10:00:00', 1);"
            "INSERT INTO photos VALUES (1, 1, 'one.jpg', 'key', 9, 1330596000000000000, 1, '', "
            "'image/jpeg', 4, 3, 'one', '', '2012-03-01T10:00:00', NULL, NULL, '', '');"
            "INSERT INTO tags VALUES (1, 1, 'Z\u00FCrich', NULL);"
            "INSERT INTO comments VALUES (1, 1, 1, 'Nice', '2012-03-02T10:00:00');"
            "INSERT INTO featuredShown VALUES (1, '2026-05-01')");
    }
    const auto database = openIndex(file(""), &error);
    ASSERT_TRUE(database) << error;
    auto reader = database->read();
    EXPECT_EQ(userOfToken(reader, "secret").value_or(UserRecord()).id, 1);
    EXPECT_EQ(commentsOf(reader, 1).size(), 1u);
    for (const char *text : {"zurich alps", "march", "anna"})
        EXPECT_EQ(searchPhotos(reader, text, {1, 9}).total, 1) << text;
    const Gathering gathering{1, "2026-03-01"};
    EXPECT_EQ(gatheredAlbums(reader, gathering).size(), 3u);
    EXPECT_TRUE(isScanned(reader, 1));
    FoundFile moved;
    moved.size = 9;
    moved.changed = 1330596000000000000;
    EXPECT_EQ(photosLike(reader, 1, moved).size(), 1u);
}

TEST_F(Scan, aNewerIndexIsRefused)
{
    std::string error;
    SQLite::Database(file("data/index.db"), SQLite::OPEN_READWRITE)
        .exec("PRAGMA user_version = 99");
    EXPECT_FALSE(openIndex(file("data"), &error));
    EXPECT_NE(error.find("newer"), std::string::npos);
    writeBytes(file("data/index.db"), "this is no database, whatever its name says");
    EXPECT_FALSE(openIndex(file("data"), &error));
}

TEST(Texts, timesAndBytes)
{
    const std::pair<const char *, const char *> rows[] = {
        {"2012-03-01T10:00:00.000Z", "2012-03-01T10:00:00"},
        {"2012-03-01T01:30:00+02:00", "2012-02-29T23:30:00"},
        {"2012-03-01T10:00:00.5-01:00", "2012-03-01T11:00:00"}};
    for (const auto &[text, utc] : rows)
        EXPECT_EQ(utcTime(parseTime(text).value_or(0)), utc) << text;
    for (const char *bad : {"", "2012", "2012-03-01 10:00:00", "2012-03-01T10:00:00X",
                            "2012-03-01T10:00:00+2", "2012-03-01T10:00:00+02:00x"})
        EXPECT_FALSE(parseTime(bad)) << bad;
    const std::string mark = "\xEF\xBF\xBD"; // for what is no UTF-8
    EXPECT_EQ(validUtf8("a\xC3\xA9\xF0\x9F\x90\x95\xE9x"),
              "a\xC3\xA9\xF0\x9F\x90\x95" + mark + "x");
    EXPECT_EQ(validUtf8("\xC0\xAF"), mark + mark);            // a slash in a longer form
    EXPECT_EQ(validUtf8("\xED\xA0\x80"), mark + mark + mark); // half of a pair
    EXPECT_EQ(validUtf8("\xF0\x9F\x90"), mark + mark + mark); // cut
    EXPECT_EQ(percentDecoded("%41%4" + percentEncoded("\xE9 /%")), "A%4\xE9 /%");
}
