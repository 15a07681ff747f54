#include "picturefiles.h"

#include "pictures/vipslibrary.h"

#include <cstdlib>
#include <exiv2/exiv2.hpp>
#include <fstream>
#include <gtest/gtest.h>
#include <vector>

namespace fs = std::filesystem;

// The encoder that writes the tests' HEIC files keeps a block of its own to the end.
extern "C" const char *__lsan_default_suppressions();
extern "C" const char *__lsan_default_suppressions()
{
    return "leak:libx265.so";
}

namespace {

GObjectPtr<VipsImage> quarters(int width, int height)
{
    std::vector<unsigned char> pixels;
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            pixels.insert(pixels.end(), 3, 85 * ((x >= width / 2) + 2 * (y >= height / 2)));
    return GObjectPtr<VipsImage>(vips_image_new_from_memory_copy(
        pixels.data(), pixels.size(), width, height, 3, VIPS_FORMAT_UCHAR));
}

// The number of the grey in the middle of a quarter; JPEG may change it a little.
char quarterOf(VipsImage *image, bool right, bool low)
{
    double *values = nullptr;
    int count = 0;
    vips_getpoint(image, &values, &count, image->Xsize * (right ? 3 : 1) / 4,
                  image->Ysize * (low ? 3 : 1) / 4, nullptr);
    const int grey = count == 3 ? static_cast<int>(values[1] + 8) : -85;
    g_free(values);
    return grey % 85 < 16 ? static_cast<char>('0' + grey / 85) : '?';
}

} // namespace

TemporaryFolder::TemporaryFolder()
{
    std::string pattern = (fs::temp_directory_path() / "pictures-XXXXXX").string();
    mPath = ::mkdtemp(pattern.data());
}

TemporaryFolder::~TemporaryFolder()
{
    std::error_code ignored;
    fs::remove_all(mPath, ignored);
}

void writePicture(const std::string &path, int width, int height, int orientation)
{
    startVips();
    const GObjectPtr<VipsImage> image = quarters(width, height);
    image->Type = VIPS_INTERPRETATION_sRGB;
    vips_image_set_int(image.get(), VIPS_META_ORIENTATION, orientation);
    ASSERT_EQ(vips_image_write_to_file(image.get(), path.c_str(), nullptr), 0) << takeVipsError();
}

void addMetadata(const std::string &path, const std::string &key, const std::string &value)
{
    const auto image = Exiv2::ImageFactory::open(path);
    image->readMetadata();
    if (key.rfind("Exif.", 0) == 0) {
        image->exifData()[key] = value;
    } else if (key.rfind("Xmp.", 0) == 0) {
        image->xmpData()[key] = value;
    } else {
        const auto text = Exiv2::Value::create(Exiv2::string);
        text->read(value);
        image->iptcData().add(Exiv2::IptcKey(key), text.get());
    }
    image->writeMetadata();
}

void writeBytes(const std::string &path, const std::string &bytes)
{
    std::ofstream(path, std::ios::binary) << bytes;
}

Contents contentsOf(const std::string &folder)
{
    Contents contents;
    for (const fs::directory_entry &entry : fs::recursive_directory_iterator(folder))
        if (entry.is_regular_file()) {
            ++contents.files;
            contents.bytes += static_cast<std::int64_t>(entry.file_size());
        }
    return contents;
}

Decoded decode(const std::string &bytes)
{
    const GObjectPtr<VipsImage> image(
        vips_image_new_from_buffer(bytes.data(), bytes.size(), "", nullptr));
    if (!image)
        return {};
    Decoded decoded;
    decoded.width = image->Xsize;
    decoded.height = image->Ysize;
    for (const char *block : {VIPS_META_EXIF_NAME, VIPS_META_XMP_NAME, VIPS_META_ORIENTATION})
        decoded.hasMetadata |= vips_image_get_typeof(image.get(), block) != 0;
    for (const bool low : {false, true})
        for (const bool right : {false, true})
            decoded.quarters += quarterOf(image.get(), right, low);
    return decoded;
}
