#include "picturefiles.h"
#include "pictures/photometadata.h"
#include "pictures/wholefile.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

namespace {

std::string errorOf(const std::string &path)
{
    std::string error;
    return readPhotoMetadata(path, &error) ? "" : error;
}

TEST(PhotoMetadata, RecognisesFormatsByContent)
{
    const TemporaryFolder folder;
    for (const char *format : {"jpeg", "png", "gif", "webp", "heic"}) {
        const std::string path = folder.file(std::string("picture.") + format);
        writePicture(path, 64, 48);
        const std::string renamed = folder.file("holiday [page=2].jpg");
        writeBytes(renamed, readWholeFile(path));
        std::string error;
        const auto metadata = readPhotoMetadata(renamed, &error);
        ASSERT_TRUE(metadata) << format << ": " << error;
        EXPECT_EQ(metadata->mimeType, std::string("image/") + format);
        EXPECT_EQ(metadata->width, 64) << format;
        EXPECT_EQ(metadata->height, 48) << format;
    }
}

TEST(PhotoMetadata, ReadsTextsTimeAndPlace)
{
    const TemporaryFolder folder;
    for (const char *name : {"photo.jpg", "photo.webp"}) {
        const std::string path = folder.file(name);
        writePicture(path, 60, 40);
        addMetadata(path, "Xmp.dc.title", "Gl\u00fcck \U0001F3D4");
        addMetadata(path, "Xmp.dc.description", "lang=\"x-default\" Two lines\r\nof text\x01 ");
        addMetadata(path, "Xmp.dc.subject", "snow");
        addMetadata(path, "Xmp.dc.subject", "\u05e9\u05dc\u05d2");
        addMetadata(path, "Exif.Photo.DateTimeOriginal", "2026:05:01 10:20:30");
        addMetadata(path, "Exif.GPSInfo.GPSLatitude", "46/1 30/1 36/1");
        addMetadata(path, "Exif.GPSInfo.GPSLatitudeRef", "S");
        addMetadata(path, "Exif.GPSInfo.GPSLongitude", "8/1 15/1 0/1");
        addMetadata(path, "Exif.GPSInfo.GPSLongitudeRef", "E");
        const auto metadata = readPhotoMetadata(path, nullptr);
        ASSERT_TRUE(metadata) << name;
        EXPECT_EQ(metadata->title, "Gl\u00fcck \U0001F3D4") << name;
        EXPECT_EQ(metadata->caption, "Two lines\nof text") << name;
        EXPECT_EQ(metadata->keywords, (std::vector<std::string>{"snow", "\u05e9\u05dc\u05d2"}));
        EXPECT_EQ(metadata->taken, "2026-05-01T10:20:30") << name;
        ASSERT_TRUE(metadata->latitude && metadata->longitude) << name;
        EXPECT_DOUBLE_EQ(*metadata->latitude, -46.51);
        EXPECT_DOUBLE_EQ(*metadata->longitude, 8.25);
    }
}

TEST(PhotoMetadata, TurnsOldTextsIntoUtf8)
{
    const TemporaryFolder folder;
    const std::string path = folder.file("photo.jpg");
    writePicture(path, 60, 40);
    addMetadata(path, "Exif.Image.ImageDescription", "overruled");
    addMetadata(path, "Iptc.Application2.ObjectName", "Z\xfcrich \x96 See"); // Windows-1252
    addMetadata(path, "Iptc.Application2.Caption", "\x81\xe9t\xe9");         // Latin-1 only
    for (const char *keyword : {"\xe9glise", "\xe9glise", " ", "caf\u00e9"})
        addMetadata(path, "Iptc.Application2.Keywords", keyword);
    const auto metadata = readPhotoMetadata(path, nullptr);
    ASSERT_TRUE(metadata);
    EXPECT_EQ(metadata->title, "Z\u00fcrich \u2013 See");
    EXPECT_EQ(metadata->caption, "\u00e9t\u00e9");
    EXPECT_EQ(metadata->keywords, (std::vector<std::string>{"\u00e9glise", "caf\u00e9"}));
}

TEST(PhotoMetadata, LeavesOutWhatMakesNoSense)
{
    const TemporaryFolder folder;
    const std::string path = folder.file("photo.jpg");
    for (const char *time : {"0000:00:00 00:00:00", "2026:02:30 10:00:00", "2026:05:01 25:00:00",
                             "yesterday", "    :  :     :  :  "}) {
        writePicture(path, 60, 40);
        addMetadata(path, "Exif.Photo.DateTimeOriginal", time);
        addMetadata(path, "Exif.GPSInfo.GPSLatitude", "46/0 30/1 36/1");
        addMetadata(path, "Exif.GPSInfo.GPSLongitude", "8/1 15/1 0/1");
        addMetadata(path, "Exif.Image.ImageDescription", std::string(50'000, 'x'));
        const auto metadata = readPhotoMetadata(path, nullptr);
        ASSERT_TRUE(metadata) << time;
        EXPECT_EQ(metadata->taken, "") << time;
        EXPECT_FALSE(metadata->latitude || metadata->longitude);
        EXPECT_LE(metadata->caption.size(), 10'000u);
    }
}

TEST(PhotoMetadata, RefusesWhatIsNoPhoto)
{
    const TemporaryFolder folder;
    const std::string path = folder.file("photo.jpg");
    writePicture(path, 60, 40);
    const std::string whole = readWholeFile(path);
    writeBytes(folder.file("empty"), "");
    writeBytes(folder.file("text"), "<html>not a picture</html>");
    writeBytes(folder.file("cut"), whole.substr(0, 20));
    ASSERT_EQ(::mkfifo(folder.file("pipe").c_str(), 0600), 0);
    EXPECT_EQ(errorOf(folder.file("empty")), "the file is empty");
    EXPECT_EQ(errorOf(folder.file("text")), "not a picture of a known format");
    EXPECT_EQ(errorOf(folder.file("pipe")), "not a plain file");
    EXPECT_EQ(errorOf(folder.file("")), "not a plain file");
    EXPECT_NE(errorOf(folder.file("cut")), "");
    EXPECT_NE(errorOf(folder.file("missing")), "");
}

TEST(PhotoMetadata, RefusesMoreThan64Megapixels)
{
    const TemporaryFolder folder;
    const std::string path = folder.file("photo.jpg");
    writePicture(path, 60, 40);
    std::string bytes = readWholeFile(path);
    const std::size_t frame = bytes.find("\xff\xc0") + 5;        // height and width, two bytes each
    bytes.replace(frame, 4, std::string("\x1f\x40\x1f\x40", 4)); // 8000 x 8000
    writeBytes(path, bytes);
    EXPECT_EQ(errorOf(path), "");
    bytes.replace(frame, 4, std::string("\x1f\x41\x1f\x40", 4));
    writeBytes(path, bytes);
    EXPECT_EQ(errorOf(path), "the picture has more than 64 megapixels");
}

// Bytes all over the file are broken in turn: nothing may be worse than an error.
TEST(PhotoMetadata, SurvivesDamagedMetadata)
{
    const TemporaryFolder folder;
    const std::string path = folder.file("photo.jpg");
    writePicture(path, 60, 40);
    addMetadata(path, "Exif.GPSInfo.GPSLatitude", "46/1 30/1 36/1");
    addMetadata(path, "Iptc.Application2.Keywords", "snow");
    addMetadata(path, "Xmp.dc.title", "Title");
    const std::string whole = readWholeFile(path);
    int readable = 0;
    for (std::size_t at = 2; at < whole.size(); at += 5) {
        std::string damaged = whole;
        damaged[at] = static_cast<char>(~damaged[at]);
        writeBytes(path, damaged);
        readable += readPhotoMetadata(path, nullptr).has_value();
    }
    EXPECT_GT(readable, 0);
}

} // namespace
