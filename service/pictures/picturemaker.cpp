#include "pictures/picturemaker.h"

#include "pictures/photofile.h"

namespace {

constexpr int jpegQuality = 88;
// Behind transparent parts: the dark of the television's screens.
constexpr double backgroundLevel = 24;

using Result = ThumbnailStore::Result;

Result failure(std::string error)
{
    return {{}, {}, std::move(error), false};
}

// Whether the file's own bytes are what a full-size picture has to be.
bool isUprightSrgbJpeg(const PhotoFile &file, VipsImage *header)
{
    return file.mimeType() == "image/jpeg" && vips_image_get_orientation(header) == 1 &&
           vips_image_get_bands(header) == 3 &&
           vips_image_get_typeof(header, VIPS_META_ICC_NAME) == 0;
}

// Colours are converted only where the file names them: converting plain sRGB would shift them.
bool needsColourConversion(VipsImage *header)
{
    return vips_image_get_typeof(header, VIPS_META_ICC_NAME) != 0 ||
           vips_image_get_interpretation(header) == VIPS_INTERPRETATION_CMYK;
}

// A cut file is an error: half a photo over grey would be kept for good.
GObjectPtr<VipsImage> shrunkUpright(VipsSource *source, VipsImage *header, int width)
{
    const char *profile = needsColourConversion(header) ? "srgb" : nullptr;
    VipsImage *shrunk = nullptr;
    const int result = vips_thumbnail_source(source, &shrunk, width > 0 ? width : VIPS_MAX_COORD,
                                             "height", VIPS_MAX_COORD, "size", VIPS_SIZE_DOWN,
                                             "import_profile", "cmyk", "export_profile", profile,
                                             "option_string", "fail_on=truncated", nullptr);
    return GObjectPtr<VipsImage>(result == 0 ? shrunk : nullptr);
}

// Eight bits a channel, without transparency.
GObjectPtr<VipsImage> flattened(VipsImage *image)
{
    VipsImage *opaque = nullptr;
    VipsImage *bytes = nullptr;
    if (vips_image_hasalpha(image)) {
        VipsArrayDouble *background = vips_array_double_new(&backgroundLevel, 1);
        const int result = vips_flatten(image, &opaque, "background", background, nullptr);
        vips_area_unref(VIPS_AREA(background));
        if (result != 0)
            return nullptr;
    } else {
        opaque = image;
        g_object_ref(opaque);
    }
    const GObjectPtr<VipsImage> owner(opaque);
    return GObjectPtr<VipsImage>(vips_cast_uchar(opaque, &bytes, nullptr) == 0 ? bytes : nullptr);
}

Result encoded(VipsImage *image)
{
    void *buffer = nullptr;
    std::size_t size = 0;
    if (vips_jpegsave_buffer(image, &buffer, &size, "Q", jpegQuality, "strip", TRUE,
                             "optimize_coding", TRUE, "interlace", FALSE, "subsample_mode",
                             VIPS_FOREIGN_SUBSAMPLE_ON, nullptr) != 0)
        return failure(takeVipsError());
    Result made;
    made.bytes.assign(static_cast<const char *>(buffer), size);
    made.mimeType = "image/jpeg";
    g_free(buffer);
    return made;
}

} // namespace

ThumbnailStore::Result makePicture(const std::string &sourcePath, int width)
{
    PhotoFile file(sourcePath);
    const GObjectPtr<VipsImage> header = file.readHeader();
    if (!header)
        return failure(file.error());
    if (width == 0 && isUprightSrgbJpeg(file, header.get()))
        return {{}, "image/jpeg", {}, true};
    const GObjectPtr<VipsImage> shrunk = shrunkUpright(file.source(), header.get(), width);
    const GObjectPtr<VipsImage> opaque = shrunk ? flattened(shrunk.get()) : nullptr;
    return opaque ? encoded(opaque.get()) : failure(takeVipsError());
}
