#include "fuzz.h"
#include "pictures/photometadata.h"

#include <sys/mman.h>
#include <unistd.h>

// A whole photo file: its header, and what is written into it.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    static const int descriptor = ::memfd_create("fuzz", MFD_CLOEXEC);
    if (::ftruncate(descriptor, 0) != 0 || ::pwrite(descriptor, data, size, 0) != ssize_t(size))
        return 0;
    std::string error;
    const auto metadata = readPhotoMetadata("/proc/self/fd/" + std::to_string(descriptor), &error);
    if (!metadata && error.empty())
        broken();
    if (metadata && (metadata->width < 1 || metadata->height < 1 ||
                     metadata->width * 1LL * metadata->height > maximumPhotoPixels))
        broken();
    return 0;
}
