#include "base/texts.h"
#include "fuzz.h"
#include "posting/atomentry.h"
#include "posting/multipart.h"

namespace {

constexpr std::size_t mostMarks = 100;

// What a body that arrives in pieces of this size has in its parts.
std::string partsOf(const std::string &body, const std::string &boundary, std::size_t size)
{
    std::string parts;
    MultipartReader reader(
        boundary, [&](const std::string &type) { parts += "\n" + type + ":"; },
        [&](std::string_view bytes) { parts += bytes; });
    for (std::size_t at = 0; at < body.size(); at += size)
        reader.feed(std::string_view(body).substr(at, size));
    return reader.isWhole() ? parts : std::string();
}

} // namespace

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
    const std::string parts = partsOf(body, boundary, body.size() + 1);
    if (parts.size() > body.size() + mostMarks || partsOf(body, boundary, 1) != parts)
        broken(); // however it is cut into pieces on its way, it says the same
    return 0;
}
