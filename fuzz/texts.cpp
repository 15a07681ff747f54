#include "data/htmlentities.h"
#include "data/publishedtime.h"
#include "fuzz.h"

// The small texts of a feed: entities and times.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    const QString text = QString::fromUtf8(reinterpret_cast<const char *>(data), int(size));
    if (unescapeHtml(text).size() > text.size())
        broken();
    localTimeAsWritten(text);
    isoTime(text);
    return 0;
}
