#include "support/testservice.h"

#include "base/texts.h"
#include "index/tokens.h"
#include "index/users.h"

#include <gtest/gtest.h>

namespace {

const std::string user = feedBase + "user/";

// Every address that takes a token, with everybody who may come: Ben owns an open and a private
// album, Anna is another user.
class Rights : public testing::Test, protected TestService
{
protected:
    struct Row
    {
        std::string method, path, body;
        int annas; // what Anna gets
    };

    void SetUp() override
    {
        for (const char *name : {"own.jpg", "../ben/Open/one.jpg", "../ben/Secret/one.jpg"})
            addPhoto(name);
        writeBytes(file("ben/Secret/.private"));
        start();
        addUser("ben@orvala.example", "Ben", "ben");
        addUser("cleo@orvala.example", "Cleo", "cleo");
        scan();
        mAnna = token("anna@orvala.example");
        mBen = token("ben@orvala.example");
        const json albums = publicFeed(user + "default?access_token=" + mBen);
        for (const json &album : albums["entry"]) {
            const std::string title = valueOf(album, "title");
            mAlbums[title] = pathOf(valueOf(album, "id"));
            const json photos = publicFeed(mAlbums[title] + "?access_token=" + mBen);
            mPhotos[title] = pathOf(valueOf(photos["entry"][0], "id"));
            const auto answer =
                ask({"POST", mPhotos[title], entryOf("<content>x</content>", "comment"), 0}, mBen);
            mComments[title] = valueOf(json::parse(answer->body)["entry"], "gphoto$id");
            ask({"POST", mPhotos[title], entryOf("<title>t</title>", "tag"), 0}, mBen);
        }
    }

    httplib::Result ask(const Row &row, const std::string &token)
    {
        const char mark = row.path.find('?') == std::string::npos ? '?' : '&';
        const std::string target =
            row.path + (token.empty() ? "" : mark + ("access_token=" + percentEncoded(token)));
        if (row.method == "POST")
            return post(target, row.body, "multipart/related; boundary=B");
        return row.method == "DELETE" ? erase(target) : get(target);
    }
    std::vector<Row> rowsFor(const std::string &album, bool isPrivate)
    {
        const int seen = isPrivate ? 403 : 200;
        const std::string photo = mPhotos[album];
        return {{"GET", mAlbums[album], "", seen},
                {"GET", photo + "?kind=comment", "", seen},
                {"GET", photo + "?kind=tag", "", seen},
                {"POST", photo, entryOf("<content>y</content>", "comment"), isPrivate ? 403 : 201},
                {"POST", photo, entryOf("<title>u</title>", "tag"), 403},
                {"POST", mAlbums[album], "--B\n\nx\n--B--", 403},
                {"DELETE", entryPathOf(photo, "/commentid/" + mComments[album]), "", 403},
                {"DELETE", entryPathOf(photo, "/tag/t"), "", 403}};
    }

    std::string mAnna, mBen;
    std::map<std::string, std::string> mAlbums, mPhotos, mComments; // by the album's title
};

} // namespace

TEST_F(Rights, everyAddressLooksAtTheToken)
{
    std::vector<Row> rows = {{"GET", user + "default", "", 200},
                             {"GET", user + "2", "", 200},
                             {"GET", user + "ben@orvala.example", "", 200},
                             {"GET", user + "2/contacts", "", 200},
                             {"GET", user + "2/albumid/recent", "", 404}, // gathered for Ben alone
                             {"POST", user + "1/albumid/recent", "--B--", 404}};
    for (const bool isPrivate : {false, true}) {
        for (const Row &row : rowsFor(isPrivate ? "Secret" : "Open", isPrivate))
            rows.push_back(row);
    }
    const Tokens expired = issueTokens(database(), 1, 0);
    const std::string cleo = token("cleo@orvala.example");
    ASSERT_TRUE(removeUser(database(), "cleo@orvala.example"));
    for (const Row &row : rows) {
        for (const std::string &token :
             {std::string(), mBen + "x", mBen.substr(1), expired.access, expired.refresh, cleo,
              std::string("' OR 1=1--"), std::string(5000, 'x')}) {
            const auto answer = ask(row, token);
            ASSERT_TRUE(answer) << row.method << row.path;
            EXPECT_EQ(answer->status, 401) << row.method << row.path << " with " << token;
            EXPECT_EQ(json::parse(answer->body)["error"]["code"], 401);
        }
        EXPECT_EQ(ask(row, mAnna)->status, row.annas) << row.method << row.path << row.body;
    }
    const json tags = publicFeed(mPhotos["Secret"] + "?kind=tag&access_token=" + mBen);
    EXPECT_EQ(titlesOf(tags), Titles{"t"});
    EXPECT_EQ(get(user + "1", {{"Authorization", "Bearer " + mAnna}})->status, 200);
}

TEST_F(Rights, nothingIsReachedThroughSomethingElse)
{
    const auto idOf = [](const std::string &path) { return path.substr(path.rfind('/') + 1); };
    const std::string secret = idOf(mPhotos["Secret"]), open = idOf(mPhotos["Open"]);
    const Row rows[] = {
        {"GET", mAlbums["Open"] + "/photoid/" + secret + "?kind=comment", "", 404},
        {"GET", user + "default/albumid/" + idOf(mAlbums["Secret"]), "", 404},
        {"GET", user + "1/albumid/" + idOf(mAlbums["Secret"]) + "/photoid/" + secret, "", 404},
        {"DELETE", entryPathOf(mPhotos["Open"], "/commentid/" + mComments["Secret"]), "", 404},
        {"POST", mAlbums["Open"] + "/photoid/" + secret, "", 404},
        {"GET", user + "9", "", 404},
        {"GET", user + "2/albumid/x", "", 404},
        {"GET", user + "2/albumid/%00", "", 404},
        {"GET", user + "%2e%2e/albumid/1", "", 404},
        {"GET", mPhotos["Open"] + "9999?kind=tag", "", 404},
        {"GET", mPhotos["Open"] + "?kind=user", "", 400}};
    for (const Row &row : rows)
        EXPECT_EQ(ask(row, mAnna)->status, row.annas) << row.method << row.path;
    EXPECT_EQ(titlesOf(publicFeed(feedBase + "featured")).size(), 2u);
    EXPECT_EQ(titlesOf(publicFeed(user + "2?access_token=" + mAnna)), Titles{"Open"});
}
