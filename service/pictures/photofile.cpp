#include "pictures/photofile.h"

#include "pictures/photometadata.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr std::size_t largestFileInMemory = 256u << 20;

bool startsWith(std::string_view bytes, std::string_view prefix)
{
    return bytes.substr(0, prefix.size()) == prefix;
}

std::string containerMimeType(std::string_view brand)
{
    for (const char *known : {"heic", "heix", "heim", "heis", "hevc", "hevx", "mif1", "msf1"})
        if (brand == known)
            return "image/heic";
    return brand == "avif" ? "image/avif" : "";
}

// These decoders map the file, and a mapped file that shrinks while it is read ends the process.
bool isDecodedFromMemory(const std::string &mimeType)
{
    return mimeType == "image/webp" || mimeType == "image/gif";
}

int loadHeader(const std::string &mimeType, VipsSource *source, VipsImage **image)
{
    if (mimeType == "image/jpeg")
        return vips_jpegload_source(source, image, nullptr);
    if (mimeType == "image/png")
        return vips_pngload_source(source, image, nullptr);
    if (mimeType == "image/gif")
        return vips_gifload_source(source, image, nullptr);
    if (mimeType == "image/webp")
        return vips_webpload_source(source, image, nullptr);
    return vips_heifload_source(source, image, nullptr);
}

} // namespace

std::string pictureMimeType(std::string_view bytes)
{
    if (startsWith(bytes, "\xff\xd8\xff"))
        return "image/jpeg";
    if (startsWith(bytes, "\x89PNG\r\n\x1a\n"))
        return "image/png";
    if (startsWith(bytes, "GIF87a") || startsWith(bytes, "GIF89a"))
        return "image/gif";
    if (bytes.size() >= 12 && startsWith(bytes, "RIFF") && bytes.substr(8, 4) == "WEBP")
        return "image/webp";
    if (bytes.size() >= 12 && bytes.substr(4, 4) == "ftyp")
        return containerMimeType(bytes.substr(8, 4));
    return {};
}

PhotoFile::PhotoFile(const std::string &path)
{
    startVips();
    vips_error_clear(); // decoders leave texts behind even where they succeed
    // Opened without blocking: a pipe among the photos would hold the thread for ever.
    const int descriptor = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (descriptor < 0) {
        mError = std::string("the file cannot be opened: ") + std::strerror(errno);
        return;
    }
    open(descriptor);
    ::close(descriptor);
}

void PhotoFile::open(int descriptor)
{
    struct stat status = {};
    if (::fstat(descriptor, &status) != 0 || !S_ISREG(status.st_mode)) {
        mError = "not a plain file";
        return;
    }
    std::array<char, 32> start = {};
    const ssize_t count = ::pread(descriptor, start.data(), start.size(), 0);
    mMimeType = pictureMimeType({start.data(), count > 0 ? static_cast<std::size_t>(count) : 0});
    if (mMimeType.empty()) {
        mError = count == 0 ? "the file is empty" : "not a picture of a known format";
        return;
    }
    if (isDecodedFromMemory(mMimeType)) {
        if (!openInMemory(descriptor, static_cast<std::size_t>(status.st_size)))
            return;
    } else {
        mSource.reset(vips_source_new_from_descriptor(descriptor));
    }
    if (!mSource)
        mError = takeVipsError();
}

bool PhotoFile::openInMemory(int descriptor, std::size_t size)
{
    if (size > largestFileInMemory) {
        mError = "the file is too large";
        return false;
    }
    mContent.resize(size);
    std::size_t filled = 0;
    while (filled < size) {
        const ssize_t count =
            ::pread(descriptor, &mContent[filled], size - filled, static_cast<off_t>(filled));
        if (count <= 0)
            break;
        filled += static_cast<std::size_t>(count);
    }
    mContent.resize(filled);
    mSource.reset(vips_source_new_from_memory(mContent.data(), mContent.size()));
    return true;
}

GObjectPtr<VipsImage> PhotoFile::readHeader()
{
    if (!ok())
        return nullptr;
    VipsImage *opened = nullptr;
    if (loadHeader(mMimeType, source(), &opened) != 0) {
        mError = takeVipsError();
        return nullptr;
    }
    GObjectPtr<VipsImage> image(opened);
    const long long pixels = static_cast<long long>(vips_image_get_width(opened)) *
                             static_cast<long long>(vips_image_get_height(opened));
    if (pixels > maximumPhotoPixels) {
        mError = "the picture has more than 64 megapixels";
        return nullptr;
    }
    return image;
}
