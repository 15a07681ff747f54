#include "picturefiles.h"

#include "pictures/vipslibrary.h"

#include <cstdlib>
#include <exiv2/exiv2.hpp>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <vector>

namespace fs = std::filesystem;

namespace {

VipsImage *quarters(int width, int height)
{
    std::vector<unsigned char> pixels;
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x) {
            const bool right = x >= width / 2, low = y >= height / 2;
            for (const bool lit : {right == low, right, low})
                pixels.push_back(lit ? 255 : 0);
        }
    VipsImage *image = vips_image_new_from_memory_copy(pixels.data(), pixels.size(), width, height,
                                                       3, VIPS_FORMAT_UCHAR);
    image->Type = VIPS_INTERPRETATION_sRGB;
    return image;
}

using Turn = VipsImage *(*)(VipsImage *);

template <VipsAngle angle>
VipsImage *rotated(VipsImage *image)
{
    VipsImage *result = nullptr;
    vips_rot(image, &result, angle, nullptr);
    return result;
}

template <VipsDirection direction, VipsAngle angle = VIPS_ANGLE_D0>
VipsImage *flipped(VipsImage *image)
{
    const GObjectPtr<VipsImage> turned(rotated<angle>(image));
    VipsImage *result = nullptr;
    vips_flip(turned.get(), &result, direction, nullptr);
    return result;
}

// How an upright picture is turned to lie in a file of each orientation.
constexpr Turn turns[] = {rotated<VIPS_ANGLE_D0>,
                          flipped<VIPS_DIRECTION_HORIZONTAL>,
                          rotated<VIPS_ANGLE_D180>,
                          flipped<VIPS_DIRECTION_VERTICAL>,
                          flipped<VIPS_DIRECTION_HORIZONTAL, VIPS_ANGLE_D90>,
                          rotated<VIPS_ANGLE_D270>,
                          flipped<VIPS_DIRECTION_HORIZONTAL, VIPS_ANGLE_D270>,
                          rotated<VIPS_ANGLE_D90>};

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
    const GObjectPtr<VipsImage> upright(quarters(width, height));
    const GObjectPtr<VipsImage> stored(turns[orientation - 1](upright.get()));
    vips_image_set_int(stored.get(), VIPS_META_ORIENTATION, orientation);
    ASSERT_EQ(vips_image_write_to_file(stored.get(), path.c_str(), nullptr), 0) << takeVipsError();
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

std::string readBytes(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

std::int64_t sizeOfFiles(const std::string &folder)
{
    std::int64_t size = 0;
    for (const fs::directory_entry &entry : fs::recursive_directory_iterator(folder))
        if (entry.is_regular_file())
            size += static_cast<std::int64_t>(entry.file_size());
    return size;
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
    const auto colourAt = [&](int x, int y) {
        double *values = nullptr;
        int count = 0;
        vips_getpoint(image.get(), &values, &count, image->Xsize * x / 4, image->Ysize * y / 4,
                      nullptr);
        const Colour colour = {static_cast<int>(values[0]), static_cast<int>(values[count / 2]),
                               static_cast<int>(values[count - 1])};
        g_free(values);
        return colour;
    };
    decoded.topLeft = colourAt(1, 1);
    decoded.topRight = colourAt(3, 1);
    decoded.bottomLeft = colourAt(1, 3);
    decoded.bottomRight = colourAt(3, 3);
    return decoded;
}

bool isNear(const Colour &a, const Colour &b)
{
    for (std::size_t i = 0; i < a.size(); ++i)
        if (std::abs(a[i] - b[i]) > 8)
            return false;
    return true;
}
