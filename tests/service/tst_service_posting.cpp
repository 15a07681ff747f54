#include "support/testservice.h"

#include "base/texts.h"
#include "pictures/wholefile.h"
#include "posting/atomentry.h"
#include "posting/multipart.h"
#include "posting/newphotofile.h"

#include <gtest/gtest.h>

namespace fs = std::filesystem;

namespace {

const char base[] = "/data/feed/api/user/";
const char uploadType[] =
    "multipart/related; boundary=END_OF_PART Content-Length:4711 MIME-version:1.0";

std::string commentOf(const std::string &text)
{
    return entryOf("<content>" + text + "</content>", "comment");
}

std::string tagOf(const std::string &text)
{
    return entryOf("<title>" + text + "</title>", "tag");
}

std::string uploadOf(const std::string &title, const std::string &image)
{
    return "\nMedia multipart posting\n--END_OF_PART\nContent-Type:application/atom+xml\n\n" +
           entryOf("<title>" + title + "</title>   <summary>At the sea</summary>", "photo") +
           "\n--END_OF_PART\nContent-Type:image/png\n\n" + image + "\n--END_OF_PART--";
}

class Posting : public testing::Test, protected TestService
{
protected:
    void SetUp() override
    {
        addPhoto("Summer/one.jpg", {{"Exif.Photo.DateTimeOriginal", "2012:03:01 10:00:00"}});
        start();
        addUser("ben@orvala.example", "Ben", "ben");
        writePicture(file("ben/two.jpg"), 32, 48);
        writePicture(file("picture.png"), 40, 30);
        scan();
        mAnna = token("anna@orvala.example");
        mBen = token("ben@orvala.example");
        mAlbum = albumPath("Summer");
        mPhoto = pathOf(valueOf(feed(mAlbum)["entry"][0], "id"));
    }

    httplib::Result post(const std::string &path, const std::string &body, const std::string &token,
                         const std::string &type = "application/atom+xml")
    {
        httplib::Client client("127.0.0.1", service().port());
        return client.Post(path + "?access_token=" + token + "&alt=json", body, type);
    }
    int erase(const std::string &entry, const std::string &token)
    {
        std::string path = mPhoto + entry;
        path.replace(path.find("/feed/"), 6, "/entry/");
        httplib::Client client("127.0.0.1", service().port());
        return client.Delete(path + "?access_token=" + token)->status;
    }
    int upload(const std::string &body) { return post(mAlbum, body, mAnna, uploadType)->status; }
    std::string lastComment()
    {
        const json entries = feed(mPhoto + "?kind=comment")["entry"];
        return entries.empty() ? "none" : valueOf(entries.back(), "content");
    }
    std::vector<std::string> tags() { return titlesOf(feed(mPhoto + "?kind=tag")); }

    std::string mAnna, mBen, mAlbum, mPhoto;
};

} // namespace

TEST_F(Posting, commentsKeepEveryCharacter)
{
    const auto answer = post(mPhoto, commentOf("a &lt; b &amp; &quot;c&quot;"), mBen);
    ASSERT_EQ(answer->status, 201);
    EXPECT_EQ(answer->body.front(), '{');
    const json entry = json::parse(answer->body)["entry"];
    EXPECT_EQ(valueOf(entry, "content"), "a < b & \"c\"");
    EXPECT_EQ(valueOf(entry["author"][0], "gphoto$nickname"), "Ben");
    const struct
    {
        std::string body, text;
    } rows[] = {
        {commentOf("gr\xC3\xBC\xC3\x9F"), "gr\u00FC\u00DF"},
        {commentOf("gr\xFC\xDF"), "gr\u00FC\u00DF"}, // Latin-1
        {commentOf("&#1103;&#x1F600;"), "\u044F\U0001F600"},
        {"<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>" + commentOf("\xC3\xBC"), "\u00C3\u00BC"},
        {commentOf("<![CDATA[<b>]]>"), "<b>"},
        {commentOf("a&#7;&#13;&#10;b &unknown; "), "a\nb &unknown;"}};
    for (const auto &row : rows) {
        EXPECT_EQ(post(mPhoto, row.body, mAnna)->status, 201) << row.body;
        EXPECT_EQ(lastComment(), row.text);
    }
}

TEST_F(Posting, tagsComeAndGo)
{
    const auto answer = post(mPhoto, tagOf("sea, gr\xFCn , what/a?tag#50%"), mAnna);
    ASSERT_EQ(answer->status, 201);
    EXPECT_NE(answer->body.find("\"title\""), std::string::npos);
    EXPECT_EQ(post(mPhoto, tagOf("sea"), mAnna)->status, 201); // once is enough
    EXPECT_EQ(tags(), (std::vector<std::string>{"sea", "gr\u00FCn", "what/a?tag#50%"}));
    EXPECT_EQ(titlesOf(publicFeed("/data/feed/api/all?q=sea")).size(), 1u);
    EXPECT_EQ(erase("/tag/" + percentEncoded("what/a?tag#50%"), mBen), 403);
    EXPECT_EQ(erase("/tag/" + percentEncoded("what/a?tag#50%"), mAnna), 200);
    EXPECT_EQ(erase("/tag/sea", mAnna), 200);
    EXPECT_EQ(erase("/tag/sea", mAnna), 404);
    EXPECT_EQ(tags(), std::vector<std::string>{"gr\u00FCn"});
    EXPECT_EQ(titlesOf(publicFeed("/data/feed/api/all?q=sea")).size(), 0u);
}

TEST_F(Posting, commentsGoByTheirAuthorOrThePhotosOwner)
{
    const std::string cleo =
        (addUser("cleo@orvala.example", "Cleo", "cleo"), token("cleo@orvala.example"));
    std::vector<std::string> ids;
    for (int i = 0; i < 2; ++i) {
        const auto answer = post(mPhoto, commentOf("x"), mBen);
        ids.push_back("/commentid/" + valueOf(json::parse(answer->body)["entry"], "gphoto$id"));
    }
    EXPECT_EQ(erase(ids[0], cleo), 403);
    EXPECT_EQ(erase(ids[0], mBen), 200);
    EXPECT_EQ(erase(ids[0], mBen), 404);
    EXPECT_EQ(erase(ids[1], mAnna), 200);
    EXPECT_EQ(lastComment(), "none");
}

TEST_F(Posting, refusalsSayWhy)
{
    const std::string secret = "<!DOCTYPE entry [<!ENTITY x SYSTEM \"file:///etc/passwd\">]>";
    const std::string nested(30'000, '<');
    std::string deep;
    for (int i = 0; i < 15'000; ++i)
        deep += "<a>";
    const struct
    {
        std::string path, body, token;
        int status;
    } rows[] = {{mPhoto, commentOf("x"), "", 401},
                {mPhoto, commentOf("x"), mAnna + "x", 401},
                {mPhoto + "99", commentOf("x"), mAnna, 404},
                {mPhoto, tagOf("x"), mBen, 403},
                {mPhoto, commentOf(" "), mAnna, 400},
                {mPhoto, tagOf(", "), mAnna, 400},
                {mPhoto, tagOf(std::string(201, 'x')), mAnna, 400},
                {mPhoto, commentOf(std::string(10'001, 'x')), mAnna, 400},
                {mPhoto, commentOf(std::string(70'000, 'x')), mAnna, 413},
                {mPhoto, commentOf(std::string(2'000'000, 'x')), mAnna, 413},
                {mPhoto, "", mAnna, 400},
                {mPhoto, nested, mAnna, 400},
                {mPhoto, deep, mAnna, 400},
                {mPhoto, commentOf("x").substr(0, 60), mAnna, 400},
                {mPhoto, secret + commentOf("&x;"), mAnna, 400},
                {mPhoto, entryOf("", "photo"), mAnna, 400},
                {mPhoto, "<entry><content>x</content></entry>", mAnna, 400},
                {mAlbum, commentOf("x"), mAnna, 415},
                {mAlbum, std::string(3'000'000, 'x'), "", 401}};
    for (const auto &row : rows) {
        const auto answer = post(row.path, row.body, row.token);
        ASSERT_TRUE(answer);
        EXPECT_EQ(answer->status, row.status) << row.body.substr(0, 200);
        EXPECT_EQ(json::parse(answer->body)["error"]["code"], row.status);
    }
    EXPECT_EQ(lastComment(), "none");
}

TEST_F(Posting, anUploadIsInTheAlbumAtOnce)
{
    const std::string picture = readWholeFile(file("picture.png"));
    const auto answer = post(mAlbum, uploadOf("Our &amp; beach.png", picture), mAnna, uploadType);
    ASSERT_EQ(answer->status, 201) << answer->body;
    EXPECT_EQ(answer->body.front(), '{');
    EXPECT_EQ(upload(uploadOf("Our &amp; beach.png", picture)), 201);
    for (int round = 0; round < 2; ++round) { // and it stays so after a scan
        const json entries = feed(mAlbum)["entry"];
        ASSERT_EQ(entries.size(), 3u);
        EXPECT_EQ(valueOf(entries[1], "title"), "Our & beach");
        EXPECT_EQ(valueOf(entries[1], "summary"), "At the sea");
        EXPECT_EQ(valueOf(entries[1], "gphoto$width"), "40");
        EXPECT_EQ(statusOf(pathOf(entries[1]["content"]["src"])), 200);
        scan();
    }
    EXPECT_EQ(readWholeFile(photo("Summer/Our & beach.png")), picture);
    EXPECT_TRUE(fs::exists(photo("Summer/Our & beach (2).png")));
    EXPECT_EQ(titlesOf(publicFeed("/data/feed/api/all?q=beach")).size(), 2u);
}

TEST_F(Posting, aLargePhotoMayBeUploadedByItsOwnerOnly)
{
    std::string picture = readWholeFile(file("picture.png"));
    picture.append(3'000'000, '\n'); // behind the end of the picture
    EXPECT_EQ(upload(uploadOf("large", picture)), 201);
    EXPECT_EQ(fs::file_size(photo("Summer/large.png")), picture.size());
    EXPECT_EQ(post(mAlbum, uploadOf("x", picture), mBen, uploadType)->status, 403);
    picture.append(70'000'000, '\n');
    EXPECT_EQ(upload(uploadOf("x", picture)), 413);
}

TEST_F(Posting, aFailedUploadLeavesNothing)
{
    const std::string picture = readWholeFile(file("picture.png"));
    const std::string good = uploadOf("x", picture);
    EXPECT_EQ(upload(good.substr(0, good.size() - 20)), 400);
    EXPECT_EQ(upload(uploadOf("x", "no picture")), 415);
    EXPECT_EQ(upload(uploadOf("x", picture.substr(0, 20))), 415);
    EXPECT_EQ(upload(uploadOf("<a>", picture)), 400);
    EXPECT_EQ(upload(""), 400);
    EXPECT_EQ(contentsOf(photo("Summer")).files, 1);
    EXPECT_EQ(upload(uploadOf("../../../escaped", picture)), 201);
    EXPECT_EQ(contentsOf(photo("Summer")).files, 2);
}

TEST(Multipart, boundariesAreRead)
{
    EXPECT_EQ(boundaryOf(uploadType), "END_OF_PART");
    EXPECT_EQ(boundaryOf("Multipart/Related; type=x; boundary=\"a b\"; x=y"), "a b");
    EXPECT_EQ(boundaryOf("multipart/form-data; boundary=x"), "");
    EXPECT_EQ(boundaryOf("multipart/related"), "");
}

// However the body is cut into pieces on its way.
TEST(Multipart, partsAreFound)
{
    const struct
    {
        std::string body, parts;
    } rows[] = {
        {"--B\n\na\r\n--Bo\n--B--", "()a\r\n--Bo"},
        {"x\n--B\r\nCONTENT-TYPE: Image/PNG; x\r\n\r\na--B\r\n--B \n\nb\n--B--\n",
         "(image/png)a--B()b"},
        {"--B\n\n\n--B\n\n\r\n--B--", "()()"},
        {"--B\n\n--B-\n--B x\n--B--\n--B\n\nc", "()--B-\n--B x"},
        {"", "cut"},
        {"--B", "cut"},
        {"--B\n", "cut"},
        {"--B\n\nx\n--", "()cut"},
        {"--B\n" + std::string(9000, 'h') + "\n\nx\n--B--", "cut"},
    };
    for (const auto &row : rows) {
        for (std::size_t size = 1; size <= row.body.size() + 1; size = size * 2 + 1) {
            std::string parts;
            MultipartReader reader(
                "B", [&](const std::string &type) { parts += "(" + type + ")"; },
                [&](std::string_view bytes) { parts += bytes; });
            for (std::size_t at = 0; at < row.body.size(); at += size)
                reader.feed(std::string_view(row.body).substr(at, size));
            // What was cut may have been handed over up to its end.
            const std::string whole = reader.isWhole() ? parts : parts.substr(0, 2) + "cut";
            EXPECT_EQ(parts.empty() ? "cut" : whole, row.parts) << row.body << " by " << size;
        }
    }
}

TEST(NewPhotoFile, namesFitEveryFileSystem)
{
    EXPECT_EQ(fileNameFor("Our beach.JPG"), "Our beach");
    EXPECT_EQ(fileNameFor("../a/b\n:c"), "_a_b__c");
    EXPECT_EQ(fileNameFor(".."), "Photo");
    EXPECT_EQ(fileNameFor(".private"), "private");
    std::string longer;
    for (int i = 0; i < 60; ++i)
        longer += "\u00FC";
    EXPECT_EQ(fileNameFor(longer).size(), 100u);
    EXPECT_EQ(fileNameFor("a" + longer).size(), 99u);
}
