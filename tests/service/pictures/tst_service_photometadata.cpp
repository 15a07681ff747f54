#include "picturefiles.h"
#include "pictures/embeddedmetadata.h"
#include "pictures/photometadata.h"
#include "pictures/wholefile.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>

namespace fs = std::filesystem;

namespace {

std::string errorOf(const std::string &path)
{
    std::string error;
    return readPhotoMetadata(path, &error) ? "" : error;
}

PhotoMetadata metadataOf(const std::string &path)
{
    std::string error;
    const auto metadata = readPhotoMetadata(path, &error);
    EXPECT_EQ(error, "") << path;
    return metadata.value_or(PhotoMetadata());
}

TEST(PhotoMetadata, RecognisesFormatsByContent)
{
    const TemporaryFolder folder;
    const std::string renamed = folder.file("holiday [page=2].jpg");
    for (const char *format : {"jpeg", "png", "gif", "webp", "heic"}) {
        writePicture(folder.file(std::string("picture.") + format), 64, 48);
        fs::rename(folder.file(std::string("picture.") + format), renamed);
        const PhotoMetadata metadata = metadataOf(renamed);
        EXPECT_EQ(metadata.mimeType, std::string("image/") + format);
        EXPECT_EQ(metadata.width, 64) << format;
        EXPECT_EQ(metadata.height, 48) << format;
    }
}

TEST(PhotoMetadata, ReadsTextsTimeAndPlace)
{
    const TemporaryFolder folder;
    const std::pair<const char *, const char *> values[] = {
        {"Xmp.dc.title", "Gl\u00fcck \U0001F3D4"},
        {"Xmp.dc.description", "lang=\"x-default\" Two lines\r\nof text\x01 "},
        {"Xmp.dc.subject", "snow"},
        {"Xmp.dc.subject", "\u05e9\u05dc\u05d2"},
        {"Exif.Photo.DateTimeOriginal", "2026:05:01 10:20:30"},
        {"Exif.GPSInfo.GPSLatitude", "46/1 30/1 36/1"},
        {"Exif.GPSInfo.GPSLatitudeRef", "S"},
        {"Exif.GPSInfo.GPSLongitude", "8/1 15/1 0/1"},
        {"Exif.GPSInfo.GPSLongitudeRef", "E"}};
    for (const char *name : {"photo.jpg", "photo.webp"}) {
        const std::string path = folder.file(name);
        writePicture(path, 60, 40);
        for (const auto &[key, value] : values)
            addMetadata(path, key, value);
        const PhotoMetadata metadata = metadataOf(path);
        EXPECT_EQ(metadata.title, "Gl\u00fcck \U0001F3D4") << name;
        EXPECT_EQ(metadata.caption, "Two lines\nof text") << name;
        EXPECT_EQ(metadata.keywords, (std::vector<std::string>{"snow", "\u05e9\u05dc\u05d2"}));
        EXPECT_EQ(metadata.taken, "2026-05-01T10:20:30") << name;
        EXPECT_DOUBLE_EQ(metadata.latitude.value_or(0), -46.51);
        EXPECT_DOUBLE_EQ(metadata.longitude.value_or(0), 8.25);
    }
}

// As a list and as marked faces; pets and other regions are no people.
TEST(PhotoMetadata, NamesPeopleAsKeywords)
{
    const std::string xmp = R"(<x:xmpmeta xmlns:x="adobe:ns:meta/"><rdf:RDF
        xmlns:rdf="http://www.w3.org/1999/02/22-rdf-syntax-ns#"><rdf:Description rdf:about=""
        xmlns:e="http://iptc.org/std/Iptc4xmpExt/2008-02-29/"
        xmlns:r="http://www.metadataworkinggroup.com/schemas/regions/"
        xmlns:MP="http://ns.microsoft.com/photo/1.2/"
        xmlns:MPRI="http://ns.microsoft.com/photo/1.2/t/RegionInfo#"
        xmlns:MPReg="http://ns.microsoft.com/photo/1.2/t/Region#">
        <e:PersonInImage><rdf:Bag><rdf:li>Anna</rdf:li><rdf:li>Ben</rdf:li></rdf:Bag>
        </e:PersonInImage><r:Regions rdf:parseType="Resource"><r:RegionList><rdf:Bag>
        <rdf:li r:Name="Cleo" r:Type="Face"/><rdf:li r:Name="Rex" r:Type="Pet"/>
        <rdf:li r:Name="Anna" r:Type="Face"/></rdf:Bag></r:RegionList></r:Regions>
        <MP:RegionInfo rdf:parseType="Resource"><MPRI:Regions><rdf:Bag>
        <rdf:li MPReg:PersonDisplayName="Dan"/></rdf:Bag></MPRI:Regions></MP:RegionInfo>
        </rdf:Description></rdf:RDF></x:xmpmeta>)";
    PhotoMetadata metadata;
    readEmbeddedMetadata({"", "", xmp}, &metadata);
    std::sort(metadata.keywords.begin(), metadata.keywords.end());
    EXPECT_EQ(metadata.keywords, (std::vector<std::string>{"Anna", "Ben", "Cleo", "Dan"}));
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
    const PhotoMetadata metadata = metadataOf(path);
    EXPECT_EQ(metadata.title, "Z\u00fcrich \u2013 See");
    EXPECT_EQ(metadata.caption, "\u00e9t\u00e9");
    EXPECT_EQ(metadata.keywords, (std::vector<std::string>{"\u00e9glise", "caf\u00e9"}));
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
        const PhotoMetadata metadata = metadataOf(path);
        EXPECT_EQ(metadata.taken, "") << time;
        EXPECT_FALSE(metadata.latitude || metadata.longitude);
        EXPECT_LE(metadata.caption.size(), 10'000u);
    }
}

TEST(PhotoMetadata, RefusesWhatIsNoPhoto)
{
    const TemporaryFolder folder;
    const std::string path = folder.file("photo.jpg");
    writePicture(path, 60, 40);
    std::string bytes = readWholeFile(path);
    writeBytes(folder.file("empty"), "");
    writeBytes(folder.file("text"), "<html>not a picture</html>");
    writeBytes(folder.file("cut"), bytes.substr(0, 20));
    ASSERT_EQ(::mkfifo(folder.file("pipe").c_str(), 0600), 0);
    EXPECT_EQ(errorOf(folder.file("empty")), "the file is empty");
    EXPECT_EQ(errorOf(folder.file("text")), "not a picture of a known format");
    EXPECT_EQ(errorOf(folder.file("pipe")), "not a plain file");
    EXPECT_EQ(errorOf(folder.file("")), "not a plain file");
    EXPECT_NE(errorOf(folder.file("cut")), "");
    EXPECT_NE(errorOf(folder.file("missing")), "");
    const std::size_t frame = bytes.find("\xff\xc0") + 5;        // height and width, two bytes each
    bytes.replace(frame, 4, std::string("\x1f\x40\x1f\x40", 4)); // 8000 x 8000
    writeBytes(path, bytes);
    EXPECT_EQ(errorOf(path), "");
    bytes.replace(frame, 4, std::string("\x1f\x41\x1f\x40", 4));
    writeBytes(path, bytes);
    EXPECT_EQ(errorOf(path), "the picture has more than 64 megapixels");
}

} // namespace
