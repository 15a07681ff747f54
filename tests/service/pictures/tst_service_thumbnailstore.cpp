#include "picturefiles.h"
#include "pictures/photometadata.h"
#include "pictures/thumbnailstore.h"
#include "pictures/wholefile.h"

#include <filesystem>
#include <future>
#include <gtest/gtest.h>
#include <vector>

namespace fs = std::filesystem;

namespace {

constexpr std::int64_t plenty = 100'000'000;
class ThumbnailStoreTest : public testing::Test
{
protected:
    TemporaryFolder folder;
    const std::string photo = folder.file("photo.jpg");
    const std::string cache = folder.file("cache");
};

TEST_F(ThumbnailStoreTest, TurnsEveryOrientationUpright)
{
    const char *const upright[] = {"0123", "1032", "3210", "2301", "0213", "2031", "3120", "1302"};
    ThumbnailStore store(cache, plenty);
    for (int orientation = 1; orientation <= 8; ++orientation)
        for (const int width : {0, 60}) {
            const bool swaps = orientation > 4;
            writePicture(photo, swaps ? 80 : 120, swaps ? 120 : 80, orientation);
            const auto result = store.picture(photo, std::to_string(orientation), width);
            EXPECT_EQ(result.isOriginal, orientation == 1 && width == 0);
            const Decoded shown = decode(result.isOriginal ? readWholeFile(photo) : result.bytes);
            EXPECT_EQ(shown.width, width ? 60 : 120) << orientation;
            EXPECT_EQ(shown.height, width ? 40 : 80) << orientation;
            EXPECT_EQ(shown.quarters, upright[orientation - 1]) << orientation << " at " << width;
            EXPECT_FALSE(shown.hasMetadata && width) << orientation;
            const auto metadata = readPhotoMetadata(photo, nullptr).value_or(PhotoMetadata());
            EXPECT_EQ(metadata.width, 120) << orientation;
            EXPECT_EQ(metadata.height, 80) << orientation;
        }
}

TEST_F(ThumbnailStoreTest, MakesTheWidthAskedForAndNeverEnlarges)
{
    writePicture(photo, 300, 600);
    ThumbnailStore store(cache, plenty);
    const std::vector<std::pair<int, int>> cases = {{-5, 1},    {1, 1},      {97, 97},
                                                    {300, 300}, {2000, 300}, {100000, 300}};
    for (const auto &[asked, width] : cases)
        EXPECT_EQ(decode(store.picture(photo, "a", asked).bytes).width, width) << asked;
}

TEST_F(ThumbnailStoreTest, KeepsWhatItMadeAndMakesAgainWhatWasDamaged)
{
    writePicture(photo, 120, 80);
    const std::string made = ThumbnailStore(cache, plenty).picture(photo, "a", 60).bytes;
    fs::rename(photo, photo + ".away");
    ThumbnailStore store(cache, plenty);
    EXPECT_EQ(store.picture(photo, "a", 60).bytes, made);
    EXPECT_FALSE(store.picture(photo, "a", 61).ok());
    EXPECT_FALSE(store.picture(photo, "b", 60).ok());
    fs::rename(photo + ".away", photo);
    for (const fs::directory_entry &entry : fs::recursive_directory_iterator(cache))
        if (entry.is_regular_file())
            fs::resize_file(entry.path(), entry.file_size() / 2);
    EXPECT_EQ(store.picture(photo, "a", 60).bytes, made);
}

TEST_F(ThumbnailStoreTest, AnswersManyThreadsAtOnce)
{
    writePicture(photo, 1200, 800);
    ThumbnailStore store(cache, plenty);
    std::vector<std::future<std::string>> answers(24);
    for (int i = 0; i < 24; ++i)
        answers[i] = std::async(std::launch::async, [&, i] {
            return store.picture(photo, "a", i % 3 == 0 ? 640 : 320).bytes;
        });
    for (int i = 0; i < 24; ++i)
        EXPECT_EQ(decode(answers[i].get()).width, i % 3 == 0 ? 640 : 320);
    EXPECT_EQ(contentsOf(cache).files, 2);
}

TEST_F(ThumbnailStoreTest, AnswersBadPhotosWithAnErrorAndDoesWithoutAFolder)
{
    writePicture(photo, 1200, 800);
    const std::string whole = readWholeFile(photo);
    writeBytes(cache, "a file where the folder should be");
    ThumbnailStore store(cache, plenty);
    for (int i = 0; i < 2; ++i)
        EXPECT_EQ(decode(store.picture(photo, "a", 60).bytes).width, 60);
    writeBytes(photo, whole.substr(0, whole.size() / 2));
    EXPECT_EQ(store.picture(photo, "cut", 320).error, "VipsJpeg: Premature end of input file");
    writeBytes(photo, std::string(5000, '\xff'));
    EXPECT_FALSE(store.picture(photo, "garbage", 320).ok());
    EXPECT_FALSE(store.picture(folder.file(""), "folder", 320).ok());
    EXPECT_EQ(readWholeFile(cache), "a file where the folder should be");
}

TEST_F(ThumbnailStoreTest, DropsTheLongestUnusedAndNothingElse)
{
    writePicture(photo, 1200, 800);
    std::int64_t size = 0;
    {
        ThumbnailStore store(cache, plenty);
        for (int width = 400; width < 420; ++width)
            size += static_cast<std::int64_t>(store.picture(photo, "a", width).bytes.size());
        store.picture(photo, "a", 400); // used again
    }
    { // counts what is there, and tidies before it goes
        ThumbnailStore store(cache, size / 2);
    }
    EXPECT_LE(contentsOf(cache).bytes, size / 2);
    EXPECT_GT(contentsOf(cache).bytes, size / 4);
    fs::rename(photo, photo + ".away");
    {
        ThumbnailStore store(cache, size / 2);
        EXPECT_TRUE(store.picture(photo, "a", 400).ok());
        EXPECT_TRUE(store.picture(photo, "a", 419).ok());
        EXPECT_FALSE(store.picture(photo, "a", 401).ok());
    }
    fs::rename(photo + ".away", photo);
    fs::create_directories(cache + "/ab/cd");
    writeBytes(cache + "/ab/cd/holiday.jpg", std::string(30'000, 'x'));
    {
        ThumbnailStore store(cache, 20'000);
        for (int width = 400; width < 440; ++width)
            EXPECT_TRUE(store.picture(photo, "a", width).ok());
    }
    EXPECT_TRUE(fs::exists(cache + "/ab/cd/holiday.jpg"));
    EXPECT_LE(contentsOf(cache).bytes, 50'000);
}

} // namespace
