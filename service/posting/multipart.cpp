#include "posting/multipart.h"

#include <algorithm>
#include <cctype>

namespace {

const std::string_view relatedType = "multipart/related";
constexpr std::size_t mostParts = 10;

std::string lowered(std::string_view text)
{
    std::string result(text);
    std::transform(result.begin(), result.end(), result.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return result;
}

std::string_view trimmed(std::string_view text)
{
    const std::size_t first = text.find_first_not_of(" \t\r");
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(" \t\r") - first + 1);
}

// Takes the first line, without its end, off the text.
std::string_view takeLine(std::string_view &text)
{
    const std::size_t end = std::min(text.find('\n'), text.size());
    const std::string_view line = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    return trimmed(line);
}

BodyPart partOf(std::string_view text)
{
    BodyPart part;
    for (std::string_view line = takeLine(text); !line.empty(); line = takeLine(text)) {
        const std::size_t colon = std::min(line.find(':'), line.size());
        if (lowered(line.substr(0, colon)) == "content-type" && colon < line.size()) {
            const std::string_view value = line.substr(colon + 1);
            part.contentType = lowered(trimmed(value.substr(0, value.find(';'))));
        }
    }
    part.content = text;
    return part;
}

// A line that goes on in another way is content.
bool endsDelimiter(std::string_view rest)
{
    const std::size_t end = rest.find_first_not_of(" \t\r");
    return rest.substr(0, 2) == "--" || (end != std::string_view::npos && rest[end] == '\n');
}

// Where the next line that is a delimiter starts.
std::size_t findDelimiter(std::string_view body, std::string_view delimiter, std::size_t from)
{
    for (std::size_t at = from; (at = body.find(delimiter, at)) != std::string_view::npos; ++at) {
        if ((at == 0 || body[at - 1] == '\n') && endsDelimiter(body.substr(at + delimiter.size())))
            return at;
    }
    return std::string_view::npos;
}

std::string_view withoutLineEnd(std::string_view text)
{
    for (const char end : {'\n', '\r'}) {
        if (!text.empty() && text.back() == end)
            text.remove_suffix(1);
    }
    return text;
}

} // namespace

std::string boundaryOf(const std::string &contentType)
{
    const std::string low = lowered(contentType);
    const std::size_t found = low.find("boundary=");
    if (low.rfind(relatedType, 0) != 0 || found == std::string::npos)
        return {};
    std::string value = contentType.substr(found + std::string_view("boundary=").size());
    if (!value.empty() && value.front() == '"')
        return value.substr(1, value.find('"', 1) - 1);
    return value.substr(0, value.find_first_of(" \t;"));
}

std::optional<std::vector<BodyPart>> partsOf(std::string_view body, const std::string &boundary)
{
    const std::string delimiter = "--" + boundary;
    std::vector<BodyPart> parts;
    std::size_t start = findDelimiter(body, delimiter, 0);
    while (start != std::string_view::npos && parts.size() <= mostParts) {
        std::string_view rest = body.substr(start + delimiter.size());
        if (rest.substr(0, 2) == "--")
            return parts;
        takeLine(rest);
        const std::size_t begin = body.size() - rest.size();
        start = findDelimiter(body, delimiter, begin);
        if (start != std::string_view::npos)
            parts.push_back(partOf(withoutLineEnd(body.substr(begin, start - begin))));
    }
    return std::nullopt;
}
