#include "fuzz.h"
#include "pictures/metadatatext.h"

// Texts and times from within a photo file.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    const std::string clean = cleanMetadataText(textOf(data, size));
    if (cleanMetadataText(clean) != clean)
        broken();
    const std::string time = isoPhotoTime(textOf(data, size));
    if (!time.empty() && time.size() != 19)
        broken();
    return 0;
}
