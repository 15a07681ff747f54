#include "pictures/embeddedmetadata.h"

#include "pictures/metadatatext.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <exiv2/exiv2.hpp>
#include <mutex>

namespace {

const Exiv2::byte *bytesOf(std::string_view block)
{
    return reinterpret_cast<const Exiv2::byte *>(block.data());
}

void setUpExiv2()
{
    static const bool done = (Exiv2::LogMsg::setLevel(Exiv2::LogMsg::mute), true);
    (void)done;
}

// Runs one step of reading; the library throws on damaged data, which then is left out.
template <typename Step>
void guarded(Step step)
{
    try {
        step();
    } catch (const std::exception &) {
    }
}

Exiv2::ExifData parseExif(std::string_view block)
{
    constexpr std::string_view prefix("Exif\0\0", 6);
    if (block.substr(0, prefix.size()) == prefix)
        block.remove_prefix(prefix.size());
    Exiv2::ExifData data;
    if (!block.empty())
        guarded([&] {
            Exiv2::ExifParser::decode(data, bytesOf(block), static_cast<uint32_t>(block.size()));
        });
    return data;
}

// JPEG keeps IPTC inside the resource blocks of Photoshop, other formats keep it bare.
std::string_view bareIptc(std::string_view block)
{
    constexpr std::string_view prefix("Photoshop 3.0\0", 14);
    if (block.substr(0, prefix.size()) != prefix)
        return block;
    block.remove_prefix(prefix.size());
    const Exiv2::byte *record = nullptr;
    uint32_t header = 0, size = 0;
    if (Exiv2::Photoshop::locateIptcIrb(bytesOf(block), static_cast<long>(block.size()), &record,
                                        &header, &size) != 0)
        return {};
    const std::size_t start = static_cast<std::size_t>(record - bytesOf(block)) + header;
    return start <= block.size() ? block.substr(start, size) : std::string_view();
}

Exiv2::IptcData parseIptc(std::string_view block)
{
    Exiv2::IptcData data;
    guarded([&] {
        const std::string_view bare = bareIptc(block);
        if (!bare.empty())
            Exiv2::IptcParser::decode(data, bytesOf(bare), static_cast<uint32_t>(bare.size()));
    });
    return data;
}

Exiv2::XmpData parseXmp(std::string_view block)
{
    static std::mutex mutex; // the parser's tables are shared by all threads
    Exiv2::XmpData data;
    if (block.empty())
        return data;
    const std::lock_guard<std::mutex> lock(mutex);
    guarded([&] { Exiv2::XmpParser::decode(data, std::string(block)); });
    return data;
}

template <typename Data, typename Key>
std::string text(const Data &data, const char *key)
{
    std::string value;
    guarded([&] {
        const auto found = data.findKey(Key(key));
        if (found != data.end() && found->count() > 0)
            value = found->toString(0);
    });
    return cleanMetadataText(value);
}

// The text in the file's default language, else in its first one.
std::string xmpText(const Exiv2::XmpData &data, const char *key)
{
    std::string value;
    guarded([&] {
        const auto found = data.findKey(Exiv2::XmpKey(key));
        if (found == data.end())
            return;
        const auto *texts = dynamic_cast<const Exiv2::LangAltValue *>(&found->value());
        if (!texts)
            value = found->toString();
        else if (!texts->value_.empty())
            value = texts->value_.count("x-default") ? texts->toString("x-default")
                                                     : texts->value_.begin()->second;
    });
    return cleanMetadataText(value);
}

std::string exifText(const Exiv2::ExifData &data, const char *key)
{
    std::string value;
    guarded([&] {
        const auto found = data.findKey(Exiv2::ExifKey(key));
        if (found != data.end())
            value = found->toString();
    });
    return cleanMetadataText(value);
}

template <typename... Texts>
std::string firstOf(std::string first, Texts... others)
{
    for (const std::string &other : {std::string(others)...})
        if (first.empty())
            first = other;
    return first;
}

constexpr std::size_t mostKeywords = 1000;

void addKeyword(const std::string &raw, std::vector<std::string> *keywords)
{
    const std::string keyword = cleanMetadataText(raw);
    if (!keyword.empty() && keywords->size() < mostKeywords &&
        std::find(keywords->begin(), keywords->end(), keyword) == keywords->end())
        keywords->push_back(keyword);
}

void addSubjects(const Exiv2::XmpData &xmp, std::vector<std::string> *keywords)
{
    const auto subjects = xmp.findKey(Exiv2::XmpKey("Xmp.dc.subject"));
    for (long i = 0; subjects != xmp.end() && i < subjects->count(); ++i)
        addKeyword(subjects->toString(i), keywords);
}

void addIptcKeywords(const Exiv2::IptcData &iptc, std::vector<std::string> *keywords)
{
    for (const Exiv2::Iptcdatum &datum : iptc)
        if (datum.key() == "Iptc.Application2.Keywords")
            addKeyword(datum.toString(), keywords);
}

bool isWithin(const std::string &key, const std::string &start, const std::string &end)
{
    return key.rfind(start, 0) == 0 && key.size() >= start.size() + end.size() &&
           key.compare(key.size() - end.size(), end.size(), end) == 0;
}

// Programs mark the parts of a photo in two ways. What is below a structure has the prefixes that
// the file gives it.
bool isNameOfPart(const std::string &key)
{
    return isWithin(key, "Xmp.MP.RegionInfo/", ":PersonDisplayName") ||
           isWithin(key, "Xmp.mwg-rs.Regions/", ":Name");
}

// One of the two marks pets and other things as well.
bool isFace(const Exiv2::XmpData &xmp, const std::string &nameOfPart)
{
    const std::string part = nameOfPart.substr(0, nameOfPart.size() - std::strlen("Name"));
    const auto type = xmp.findKey(Exiv2::XmpKey(part + "Type"));
    return type == xmp.end() || type->toString() == "Face";
}

void addPeople(const Exiv2::XmpData &xmp, std::vector<std::string> *keywords)
{
    const auto listed = xmp.findKey(Exiv2::XmpKey("Xmp.iptcExt.PersonInImage"));
    for (long i = 0; listed != xmp.end() && i < listed->count(); ++i)
        addKeyword(listed->toString(i), keywords);
    std::size_t parts = 0;
    for (const Exiv2::Xmpdatum &datum : xmp) {
        const std::string key = datum.key();
        if (isNameOfPart(key) && ++parts <= mostKeywords && isFace(xmp, key))
            addKeyword(datum.toString(), keywords);
    }
}

std::vector<std::string> keywordsOf(const Exiv2::XmpData &xmp, const Exiv2::IptcData &iptc)
{
    std::vector<std::string> keywords;
    guarded([&] { addSubjects(xmp, &keywords); });
    if (keywords.empty())
        guarded([&] { addIptcKeywords(iptc, &keywords); });
    guarded([&] { addPeople(xmp, &keywords); });
    return keywords;
}

std::optional<double> degrees(const Exiv2::ExifData &exif, const char *key, const char *negative)
{
    const auto found = exif.findKey(Exiv2::ExifKey(key));
    if (found == exif.end())
        return {};
    double sum = 0, unit = 1;
    for (long i = 0; i < std::min(found->count(), 3L); ++i, unit *= 60) {
        const Exiv2::Rational part = found->toRational(i);
        if (part.second == 0)
            return {};
        sum += static_cast<double>(part.first) / part.second / unit;
    }
    const std::string direction = exifText(exif, (std::string(key) + "Ref").c_str());
    return direction.substr(0, 1) == negative ? -sum : sum;
}

void readPlace(const Exiv2::ExifData &exif, PhotoMetadata *metadata)
{
    std::optional<double> latitude, longitude;
    guarded([&] {
        latitude = degrees(exif, "Exif.GPSInfo.GPSLatitude", "S");
        longitude = degrees(exif, "Exif.GPSInfo.GPSLongitude", "W");
    });
    if (!latitude || !longitude || std::abs(*latitude) > 90 || std::abs(*longitude) > 180)
        return;
    // Cameras that do not know where they are write zeros.
    if (*latitude == 0 && *longitude == 0)
        return;
    metadata->latitude = latitude;
    metadata->longitude = longitude;
}

} // namespace

void readEmbeddedMetadata(const EmbeddedMetadata &blocks, PhotoMetadata *metadata)
{
    setUpExiv2();
    const Exiv2::ExifData exif = parseExif(blocks.exif);
    const Exiv2::IptcData iptc = parseIptc(blocks.iptc);
    const Exiv2::XmpData xmp = parseXmp(blocks.xmp);
    const auto iptcText = text<Exiv2::IptcData, Exiv2::IptcKey>;
    metadata->title =
        firstOf(xmpText(xmp, "Xmp.dc.title"), iptcText(iptc, "Iptc.Application2.ObjectName"));
    metadata->caption =
        firstOf(xmpText(xmp, "Xmp.dc.description"), iptcText(iptc, "Iptc.Application2.Caption"),
                exifText(exif, "Exif.Image.ImageDescription"));
    metadata->keywords = keywordsOf(xmp, iptc);
    metadata->taken = firstOf(isoPhotoTime(exifText(exif, "Exif.Photo.DateTimeOriginal")),
                              isoPhotoTime(xmpText(xmp, "Xmp.exif.DateTimeOriginal")),
                              isoPhotoTime(xmpText(xmp, "Xmp.photoshop.DateCreated")),
                              isoPhotoTime(exifText(exif, "Exif.Photo.DateTimeDigitized")));
    readPlace(exif, metadata);
}
