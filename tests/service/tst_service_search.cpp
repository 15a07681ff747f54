#include "support/testservice.h"

#include "index/remarks.h"
#include "index/searchtext.h"
#include "index/users.h"

#include <gtest/gtest.h>

namespace {

class Search : public testing::Test, protected TestService
{
protected:
    json found(const std::string &text, const std::string &more = "&max-results=100")
    {
        return publicFeed(feedBase + "all?q=" + percentEncoded(text) + more);
    }
    Titles titles(const std::string &text)
    {
        const json feed = found(text);
        EXPECT_EQ(valueOf(feed, "openSearch$totalResults"), std::to_string(feed["entry"].size()));
        return sortedTitlesOf(feed);
    }
};

} // namespace

TEST_F(Search, findsWhatIsWrittenAboutAPhotoByTheBeginningsOfWords)
{
    addTaken("Summer/one.jpg", "2012:03:01 10:00:00", "A <b>dog</b> & \"cat\"");
    addTaken("Summer/two.jpg", "2019:06:05 10:00:00");
    addTaken("Winter/three.jpg", "2018:12:25 10:00:00", "At home");
    addTaken("Winter/four.jpg", "2019:01:01 00:10:00", "At home");
    addPhoto("Secret/hidden.jpg");
    writeBytes(photo("Secret/.private"));
    start();
    const json dog = found("dog")["entry"][0];
    addTag(database(), std::stoll(valueOf(dog, "gphoto$id")), 1, "Good boy");
    const std::pair<const char *, Titles> rows[] = {{"dog", {"one"}},
                                                    {"DO SUM", {"one"}},
                                                    {"summ", {"one", "two"}},
                                                    {"boy cat", {"one"}},
                                                    {"hidden", {}},
                                                    {"", {}},
                                                    {"2019", {"four", "two"}},
                                                    {"june 2019", {"two"}},
                                                    {"2019-06-05", {"two"}},
                                                    {"christmas", {"three"}},
                                                    {"new year", {"four"}},
                                                    {"anna", {"four", "one", "three", "two"}},
                                                    {"ann thr", {"three"}},
                                                    {"u1", {}}, // how the index writes people
                                                    {"\" OR *", {}},
                                                    {"NEAR(one", {}},
                                                    {"one\xFF", {"one"}},
                                                    {"-", {}}};
    for (const auto &[text, expected] : rows)
        EXPECT_EQ(titles(text), expected) << text;
    EXPECT_EQ(titles(std::string("one\0x", 5)), Titles{});
    EXPECT_EQ(titles("one" + std::string(400, ' ') + "two"), Titles{"one"}); // cut
    const UserRecord anna{0, "anna@orvala.example", "Bea Lindqvist", ""};
    saveUser(database(), anna);
    EXPECT_EQ(titles("anna"), Titles{});
    EXPECT_EQ(titles("lind bea thr"), Titles{"three"});
    EXPECT_TRUE(removeUser(database(), anna.mail));
    EXPECT_EQ(titles("dog"), Titles{});
    EXPECT_EQ(titlesOf(publicFeed(feedBase + "featured")), Titles{});
    EXPECT_TRUE(fs::exists(photo("Summer/one.jpg")));
}

TEST_F(Search, readsAnyScript)
{
    const std::pair<std::string, Titles> rows[] = {
        {"Caf\u00E9 Z\u00FCrich", {"cafe zurich", "CAFE\u0301"}},
        {"Troms\u00F8 im Fjord", {"tromso"}},
        {"Stra\u00DFe", {"STRASSE"}},
        // The beginning, a word within, and apart.
        {"\u6771\u4EAC\u30BF\u30EF\u30FC\u306E\u591C",
         {"\u6771\u4EAC", "\u30BF\u30EF\u30FC", "\u591C \u6771"}},
        {"\uC11C\uC6B8\uC5ED \uC55E", {"\uC11C\uC6B8"}},
        {"\u041C\u043E\u0441\u043A\u0432\u0430", {"\u043C\u043E\u0441\u043A"}},
        {"\u0939\u093F\u0928\u094D\u0926\u0940", {"\u0939\u093F\u0928\u094D"}},
        {"\u0E40\u0E0A\u0E35\u0E22\u0E07\u0E43\u0E2B\u0E21\u0E48", {"\u0E43\u0E2B\u0E21\u0E48"}},
        // Without its vowel marks; wide, and in one piece.
        {"\u0645\u064F\u062D\u064E\u0645\u0651\u0644", {"\u0645\u062D\u0645\u0644"}},
        {"\uFF26\uFF35\uFF2A\uFF29 \uFF8C\uFF9E", {"fuji", "\u30D6"}}};
    addPhoto("a/first.jpg");
    for (const auto &[name, texts] : rows)
        fs::copy_file(photo("a/first.jpg"), photo("a/" + name + ".jpg"));
    start();
    for (const auto &[name, texts] : rows) {
        for (const std::string &text : texts)
            EXPECT_EQ(titles(text), Titles{name}) << text;
    }
    EXPECT_EQ(titles("\u4EAC\u6771"), Titles{}); // the letters, but not together
}

TEST_F(Search, theBestComeFirstOnAllPages)
{
    addTaken("x/lakeside.jpg", "2019:01:01 10:00:00");
    addTaken("lake/unnamed.jpg", "2019:01:01 10:00:00");
    addTaken("x/morning.jpg", "2019:01:01 10:00:00", "The lake before the others are awake");
    addTaken("x/lake.jpg", "2019:01:01 10:00:00");
    start();
    const Titles all = titlesOf(found("lake"));
    EXPECT_EQ(all.front(), "lake");
    EXPECT_EQ(all.back(), "lakeside"); // only begins with the word
    for (std::size_t first = 0; first < 5; ++first) {
        const json page = found("lake", "&max-results=2&start-index=" + std::to_string(first + 1));
        const std::size_t start = std::min(first, all.size()),
                          end = std::min(first + 2, all.size());
        EXPECT_EQ(titlesOf(page), Titles(all.begin() + start, all.begin() + end)) << first;
    }
}
