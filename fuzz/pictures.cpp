#include "data/picturecheck.h"
#include "fuzz.h"

// What is read of a picture before a decoder sees it.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    const QByteArray bytes(reinterpret_cast<const char *>(data), int(size));
    pictureFormat(bytes);
    if (withoutTextChunks(bytes).size() > bytes.size())
        broken();
    jpegWorkBytes(bytes);
    return 0;
}
