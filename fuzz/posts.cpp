#include "base/texts.h"
#include "fuzz.h"
#include "posting/atomentry.h"
#include "posting/multipart.h"

// A posted body: the first line is its content type.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    const std::string text = textOf(data, size);
    const std::size_t line = text.find('\n');
    const std::string body = line == std::string::npos ? text : text.substr(line + 1);

    std::string error;
    const auto entry = parseAtomEntry(body, &error);
    if (!entry && error.empty())
        broken();
    if (entry &&
        (validUtf8(entry->title) != entry->title || validUtf8(entry->content) != entry->content ||
         validUtf8(entry->summary) != entry->summary))
        broken();

    const std::string boundary = boundaryOf(text.substr(0, line));
    if (boundary.empty())
        return 0;
    if (const auto parts = partsOf(body, boundary))
        for (const BodyPart &part : *parts)
            if (part.content.size() > body.size())
                broken();
    return 0;
}
