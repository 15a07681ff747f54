#include "pictures/photometadata.h"

#include "pictures/embeddedmetadata.h"
#include "pictures/photofile.h"

namespace {

std::string_view block(VipsImage *image, const char *name)
{
    const void *data = nullptr;
    std::size_t size = 0;
    if (!vips_image_get_typeof(image, name) || vips_image_get_blob(image, name, &data, &size) != 0)
        return {};
    return {static_cast<const char *>(data), size};
}

PhotoMetadata metadataOf(VipsImage *image)
{
    PhotoMetadata metadata;
    metadata.width = vips_image_get_width(image);
    metadata.height = vips_image_get_height(image);
    if (vips_image_get_orientation_swap(image))
        std::swap(metadata.width, metadata.height);
    readEmbeddedMetadata({block(image, VIPS_META_EXIF_NAME), block(image, VIPS_META_IPTC_NAME),
                          block(image, VIPS_META_XMP_NAME)},
                         &metadata);
    return metadata;
}

} // namespace

std::optional<PhotoMetadata> readPhotoMetadata(const std::string &path, std::string *error)
{
    PhotoFile file(path);
    const GObjectPtr<VipsImage> image = file.readHeader();
    if (!image) {
        if (error)
            *error = file.error();
        return {};
    }
    PhotoMetadata metadata = metadataOf(image.get());
    metadata.mimeType = file.mimeType();
    return metadata;
}
