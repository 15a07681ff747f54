#include "photolibrary.h"

#include <vips/vips.h>

#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>

namespace fs = std::filesystem;

namespace {

constexpr int photosPerFolder = 200;
constexpr int pictures = 200; // distinct ones; what is written around them differs for each file
constexpr int years = 20;

std::string smallJpeg(int seed)
{
    VipsImage *noise = nullptr, *image = nullptr;
    void *bytes = nullptr;
    std::size_t size = 0;
    vips_gaussnoise(&noise, 32, 24, "mean", double(40 + seed % 160), nullptr);
    vips_cast_uchar(noise, &image, nullptr);
    vips_jpegsave_buffer(image, &bytes, &size, nullptr);
    std::string jpeg(static_cast<const char *>(bytes), size);
    g_free(bytes);
    g_object_unref(image);
    g_object_unref(noise);
    return jpeg;
}

std::string little(std::uint32_t number, int bytes)
{
    std::string text;
    for (int i = 0; i < bytes; ++i)
        text += static_cast<char>(number >> (8 * i));
    return text;
}

std::string segment(const std::string &body)
{
    const std::size_t size = body.size() + 2;
    return std::string("\xFF\xE1") + static_cast<char>(size >> 8) + static_cast<char>(size) + body;
}

std::string field(int tag, int type, const std::string &value, std::uint32_t place)
{
    return little(tag, 2) + little(type, 2) + little(type == 4 ? 1 : value.size(), 4) +
           little(place, 4);
}

// Two directories: the first holds the caption and leads to the second, which holds the time.
std::string exif(const std::string &caption, const std::string &taken)
{
    constexpr std::uint32_t first = 8, second = first + 2 + 2 * 12 + 4, texts = second + 2 + 12 + 4;
    const std::string text = caption + std::string(1, '\0'), time = taken + std::string(1, '\0');
    return segment(std::string("Exif\0\0II*\0", 10) + little(first, 4) + little(2, 2) +
                   field(0x010E, 2, text, texts) + field(0x8769, 4, "", second) + little(0, 4) +
                   little(1, 2) +
                   field(0x9003, 2, time, texts + static_cast<std::uint32_t>(text.size())) +
                   little(0, 4) + text + time);
}

std::string xmp(const std::vector<std::string> &keywords)
{
    std::string list;
    for (const std::string &keyword : keywords)
        list += "<rdf:li>" + keyword + "</rdf:li>";
    return segment(
        std::string("http://ns.adobe.com/xap/1.0/\0", 29) +
        "<x:xmpmeta xmlns:x='adobe:ns:meta/'><rdf:RDF "
        "xmlns:rdf='http://www.w3.org/1999/02/22-rdf-syntax-ns#'><rdf:Description "
        "rdf:about='' xmlns:dc='http://purl.org/dc/elements/1.1/'><dc:subject><rdf:Bag>" +
        list + "</rdf:Bag></dc:subject></rdf:Description></rdf:RDF></x:xmpmeta>");
}

std::string takenAt(int photo, int count)
{
    const std::int64_t seconds =
        1'104'537'600 + std::int64_t(photo) * years * 365 * 24 * 3600 / count;
    const std::time_t time = seconds;
    std::tm parts{};
    gmtime_r(&time, &parts);
    std::array<char, 32> text;
    std::strftime(text.data(), text.size(), "%Y:%m:%d %H:%M:%S", &parts);
    return text.data();
}

// Some words are much more frequent than others.
const std::string &wordOf(std::uint32_t random)
{
    const auto &words = libraryWords();
    const std::size_t bits = random % 11;
    return words[(random >> 8) % std::min(words.size(), std::size_t(1) << bits)];
}

std::string photoFile(const std::string &jpeg, int photo, int count)
{
    std::uint32_t random = static_cast<std::uint32_t>(photo) * 2654435761u + 12345;
    const auto word = [&random] { return wordOf(random = random * 1664525u + 1013904223u); };
    std::string caption = word();
    for (int i = 0; i < 5; ++i)
        caption += ' ' + word();
    return jpeg.substr(0, 2) + exif(caption, takenAt(photo, count)) + xmp({word(), word()}) +
           jpeg.substr(2);
}

} // namespace

const std::vector<std::string> &libraryWords()
{
    static const std::vector<std::string> words = [] {
        static const char *const syllables[] = {"ba",  "den", "kul", "mor", "sa",  "tin",
                                                "ve",  "lop", "gri", "ne",  "fas", "hol",
                                                "jun", "ket", "pra", "wi"};
        std::vector<std::string> list;
        for (unsigned i = 0; i < 1024; ++i)
            list.push_back(std::string(syllables[i * 7 % 16]) + syllables[i / 16 % 16] +
                           syllables[i / 256 % 16]);
        return list;
    }();
    return words;
}

void writePhotos(const PhotoLibrary &library)
{
    std::vector<std::string> jpegs;
    jpegs.reserve(pictures);
    for (int i = 0; i < pictures; ++i)
        jpegs.push_back(smallJpeg(i));
    for (int photo = 0; photo < library.photos; ++photo) {
        const fs::path album =
            fs::path(library.folder) / ("Album " + std::to_string(photo / photosPerFolder));
        if (photo % photosPerFolder == 0)
            fs::create_directories(album);
        std::array<char, 32> name;
        std::snprintf(name.data(), name.size(), "IMG_%05d.jpg", photo);
        std::ofstream(album / name.data(), std::ios::binary)
            << photoFile(jpegs[photo % pictures], photo, library.photos);
    }
}
