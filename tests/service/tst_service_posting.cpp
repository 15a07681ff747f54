#include "support/testservice.h"

#include "base/texts.h"
#include "pictures/wholefile.h"
#include "posting/atomentry.h"
#include "posting/multipart.h"

#include <gtest/gtest.h>

namespace {

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
        addTaken("Summer/one.jpg", "2012:03:01 10:00:00");
        start();
        addUser("ben@orvala.example", "Ben", "ben");
        writePicture(file("ben/two.jpg"), 32, 48);
        writePicture(file("picture.png"), 40, 30);
        mPicture = readWholeFile(file("picture.png"));
        mAnna = "?alt=json&access_token=" + token("anna@orvala.example");
        mBen = "?alt=json&access_token=" + token("ben@orvala.example");
        mAlbum = albumPath("Summer");
        mPhoto = pathOf(valueOf(feed(mAlbum)["entry"][0], "id"));
    }

    int erased(const std::string &entry, const std::string &access)
    {
        return erase(entryPathOf(mPhoto, entry) + access)->status;
    }
    int upload(const std::string &body) { return post(mAlbum + mAnna, body, uploadType)->status; }
    std::string lastComment()
    {
        const json entries = feed(mPhoto + "?kind=comment")["entry"];
        return entries.empty() ? "none" : valueOf(entries.back(), "content");
    }
    Titles tags() { return titlesOf(feed(mPhoto + "?kind=tag")); }

    std::string mPicture; // a PNG
    std::string mAnna, mBen, mAlbum, mPhoto;
};

} // namespace

TEST_F(Posting, commentsKeepEveryCharacter)
{
    const auto answer = post(mPhoto + mBen, commentOf("a &lt; b &amp; &quot;c&quot;"));
    ASSERT_EQ(answer->status, 201);
    EXPECT_EQ(answer->body.front(), '{');
    const json entry = json::parse(answer->body)["entry"];
    EXPECT_EQ(valueOf(entry, "content"), "a < b & \"c\"");
    EXPECT_EQ(valueOf(entry["author"][0], "gphoto$nickname"), "Ben");
    const std::pair<std::string, std::string> rows[] = {
        {commentOf("gr\xC3\xBC\xC3\x9F"), "gr\u00FC\u00DF"},
        {commentOf("gr\xFC\xDF"), "gr\u00FC\u00DF"}, // Latin-1
        {commentOf("&#1103;&#x1F600;"), "\u044F\U0001F600"},
        {"<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>" + commentOf("\xC3\xBC"), "\u00C3\u00BC"},
        {commentOf("<![CDATA[<b>]]>"), "<b>"},
        {commentOf("a&#7;&#13;&#10;b &unknown; "), "a\nb &unknown;"}};
    for (const auto &[body, text] : rows) {
        EXPECT_EQ(post(mPhoto + mAnna, body)->status, 201) << body;
        EXPECT_EQ(lastComment(), text);
    }
}

TEST_F(Posting, tagsComeAndGo)
{
    const auto answer = post(mPhoto + mAnna, tagOf("sea, gr\xFCn , what/a?tag#50%"));
    ASSERT_EQ(answer->status, 201);
    EXPECT_NE(answer->body.find("\"title\""), std::string::npos);
    EXPECT_EQ(post(mPhoto + mAnna, tagOf("sea"))->status, 201); // once is enough
    EXPECT_EQ(tags(), (Titles{"sea", "gr\u00FCn", "what/a?tag#50%"}));
    EXPECT_EQ(titlesOf(publicFeed(feedBase + "all?q=sea")).size(), 1u);
    EXPECT_EQ(erased("/tag/" + percentEncoded("what/a?tag#50%"), mBen), 403);
    EXPECT_EQ(erased("/tag/" + percentEncoded("what/a?tag#50%"), mAnna), 200);
    EXPECT_EQ(erased("/tag/sea", mAnna), 200);
    EXPECT_EQ(erased("/tag/sea", mAnna), 404);
    EXPECT_EQ(tags(), Titles{"gr\u00FCn"});
    EXPECT_EQ(titlesOf(publicFeed(feedBase + "all?q=sea")).size(), 0u);
}

TEST_F(Posting, commentsGoByTheirAuthorOrThePhotosOwner)
{
    addUser("cleo@orvala.example", "Cleo", "cleo");
    const std::string cleo = "?access_token=" + token("cleo@orvala.example");
    for (const std::string &remover : {mBen, mAnna}) {
        const auto answer = post(mPhoto + mBen, commentOf("x"));
        const std::string id = valueOf(json::parse(answer->body)["entry"], "gphoto$id");
        EXPECT_EQ(erased("/commentid/" + id, cleo), 403);
        EXPECT_EQ(erased("/commentid/" + id, remover), 200);
        EXPECT_EQ(erased("/commentid/" + id, remover), 404);
    }
}

TEST_F(Posting, refusalsSayWhy)
{
    const std::string secret = "<!DOCTYPE entry [<!ENTITY x SYSTEM \"file:///etc/passwd\">]>";
    std::string deep;
    for (int i = 0; i < 15'000; ++i)
        deep += "<a>";
    const struct
    {
        int status;
        std::string target, body;
    } rows[] = {{401, mPhoto, commentOf("x")},
                {401, mAlbum, std::string(3'000'000, 'x')},
                {404, mPhoto + "99" + mAnna, commentOf("x")},
                {403, mPhoto + mBen, tagOf("x")},
                {400, mPhoto + mAnna, commentOf(" ")},
                {400, mPhoto + mAnna, tagOf(", ")},
                {400, mPhoto + mAnna, tagOf(std::string(201, 'x'))},
                {400, mPhoto + mAnna, commentOf(std::string(10'001, 'x'))},
                {413, mPhoto + mAnna, commentOf(std::string(70'000, 'x'))},
                {400, mPhoto + mAnna, std::string(30'000, '<')},
                {400, mPhoto + mAnna, deep},
                {400, mPhoto + mAnna, commentOf("x").substr(0, 60)},
                {400, mPhoto + mAnna, secret + commentOf("&x;")},
                {400, mPhoto + mAnna, entryOf("", "photo")},
                {415, mAlbum + mAnna, commentOf("x")}};
    for (const auto &row : rows) {
        const auto answer = post(row.target, row.body);
        ASSERT_TRUE(answer);
        EXPECT_EQ(answer->status, row.status) << row.body.substr(0, 200);
        EXPECT_EQ(json::parse(answer->body)["error"]["code"], row.status);
    }
    EXPECT_EQ(lastComment(), "none");
}

TEST_F(Posting, anUploadIsInTheAlbumAtOnce)
{
    for (int copy = 0; copy < 2; ++copy) {
        const auto answer =
            post(mAlbum + mAnna, uploadOf("Our &amp; beach.png", mPicture), uploadType);
        ASSERT_EQ(answer->status, 201) << answer->body;
        EXPECT_EQ(answer->body.front(), '{');
    }
    for (int round = 0; round < 2; ++round) { // and it stays so after a scan
        const json entries = feed(mAlbum)["entry"];
        ASSERT_EQ(entries.size(), 3u);
        EXPECT_EQ(valueOf(entries[1], "title"), "Our & beach");
        EXPECT_EQ(valueOf(entries[1], "summary"), "At the sea");
        EXPECT_EQ(statusOf(pathOf(entries[1]["content"]["src"])), 200);
        scan();
    }
    EXPECT_EQ(readWholeFile(photo("Summer/Our & beach.png")), mPicture);
    EXPECT_TRUE(fs::exists(photo("Summer/Our & beach (2).png")));
    EXPECT_EQ(titlesOf(publicFeed(feedBase + "all?q=beach")).size(), 2u);
}

TEST_F(Posting, uploadsAreWholeOrLeaveNothing)
{
    const std::string good = uploadOf("x", mPicture);
    std::string large = mPicture, tooLarge = mPicture;
    large.append(3'000'000, '\n'); // behind the end of the picture
    tooLarge.append(70'000'000, '\n');
    EXPECT_EQ(upload(good.substr(0, good.size() - 20)), 400);
    EXPECT_EQ(upload(uploadOf("x", "no picture")), 415);
    EXPECT_EQ(upload(uploadOf("x", mPicture.substr(0, 20))), 415);
    EXPECT_EQ(upload(uploadOf("<a>", mPicture)), 400);
    EXPECT_EQ(upload(""), 400);
    EXPECT_EQ(upload(uploadOf("x", tooLarge)), 413);
    EXPECT_EQ(post(mAlbum + mBen, uploadOf("x", large), uploadType)->status, 403);
    EXPECT_EQ(contentsOf(photo("Summer")).files, 1);
    EXPECT_EQ(upload(uploadOf("large", large)), 201);
    EXPECT_EQ(fs::file_size(photo("Summer/large.png")), large.size());
    std::string umlauts;
    while (umlauts.size() < 120)
        umlauts += "\u00FC";
    const std::pair<std::string, std::string> names[] = {
        {"../a/b:c.JPG", "_a_b_c"},
        {"..", "Photo"},
        {".private", "private"},
        {"a" + umlauts, "a" + umlauts.substr(0, 98)}};
    for (const auto &[title, name] : names) {
        EXPECT_EQ(upload(uploadOf(title, mPicture)), 201);
        EXPECT_TRUE(fs::exists(photo("Summer/" + name + ".png"))) << name;
    }
}

// However the body is cut into pieces on its way.
TEST(Multipart, partsAreFound)
{
    const std::pair<std::string, std::string> rows[] = {
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
    for (const auto &[body, expected] : rows) {
        for (std::size_t size = 1; size <= body.size() + 1; size = size * 2 + 1) {
            std::string parts;
            MultipartReader reader(
                "B", [&](const std::string &type) { parts += "(" + type + ")"; },
                [&](std::string_view bytes) { parts += bytes; });
            for (std::size_t at = 0; at < body.size(); at += size)
                reader.feed(std::string_view(body).substr(at, size));
            if (!reader.isWhole()) // what was cut may have been handed over up to its end
                parts = parts.substr(0, 2) + "cut";
            EXPECT_EQ(parts, expected) << body << " by " << size;
        }
    }
}
