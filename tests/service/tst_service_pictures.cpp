#include "pictures/wholefile.h"
#include "support/testservice.h"

#include <gtest/gtest.h>

namespace {

class Pictures : public testing::Test, protected TestService
{
protected:
    void SetUp() override
    {
        addPhoto("one.jpg");
        start();
        scan();
        mAddress = pathOf(publicFeed("/data/feed/api/featured")["entry"][0]["content"]["src"]);
    }
    std::string sized(const std::string &piece) const
    {
        return std::string(mAddress).insert(mAddress.rfind('/'), "/" + piece);
    }

    std::string mAddress;
};

} // namespace

TEST_F(Pictures, onlyKeysAndSizesLeadToFiles)
{
    for (const char *piece : {"s24", "s16384", "s%32"})
        EXPECT_EQ(statusOf(sized(piece)), 200) << piece;
    for (const char *piece : {"s16385", "s0", "s-1", "s", "24", "s99999999999999999999", "s2x",
                              "..", "%2e%2e/s24", "s24/s24"})
        EXPECT_EQ(statusOf(sized(piece)), 404) << piece;
    for (const std::string path :
         {"/photos/../one.jpg", "/photos/%2e%2e/one.jpg", "/photos/..%2f..%2fetc/passwd",
          "/../../../../etc/passwd", "/photos//one.jpg", "/photos/1/one.jpg", "/photos/%00/one.jpg",
          "/photos/%25/one.jpg", "/photos/'%20OR%201=1--/one.jpg"})
        EXPECT_EQ(statusOf(path), 404) << path;
    // What stands behind the key is only a name.
    for (const std::string name : {"/..%2f..%2fetc%2fpasswd", "/x", "/"})
        EXPECT_EQ(decode(get("/photos/" + mAddress.substr(8, 22) + name)->body).width, 48) << name;
}

TEST_F(Pictures, areNotSentAgainWhileTheyAreTheSame)
{
    const auto first = get(sized("s24"));
    const std::string tag = first->get_header_value("ETag");
    EXPECT_EQ(first->get_header_value("Content-Type"), "image/jpeg");
    EXPECT_NE(first->get_header_value("Cache-Control"), "");
    const auto again = get(sized("s24"), {{"If-None-Match", "\"x\", " + tag}});
    EXPECT_EQ(again->status, 304);
    EXPECT_EQ(again->body, "");
    EXPECT_EQ(get(sized("s16"), {{"If-None-Match", tag}})->status, 200);

    writePicture(photo("one.jpg"), 64, 32);
    std::string large = readWholeFile(photo("one.jpg"));
    large.append(3'000'000, '\n'); // behind the end of the picture
    writeBytes(photo("one.jpg"), large);
    scan();
    EXPECT_EQ(get(sized("s24"), {{"If-None-Match", tag}})->status, 200);
    const auto original = get(mAddress);
    EXPECT_EQ(original->body, large);
    EXPECT_EQ(original->get_header_value("Content-Type"), "image/jpeg");
}

TEST_F(Pictures, aFileThatVanishedIsNotFound)
{
    fs::remove(photo("one.jpg"));
    EXPECT_EQ(statusOf(sized("s20")), 404);
    writeBytes(photo("one.jpg"), "something else");
    EXPECT_EQ(statusOf(sized("s20")), 415);
}
