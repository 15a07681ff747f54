#include "posting/multipart.h"

#include <algorithm>
#include <cctype>

namespace {

const std::string_view relatedType = "multipart/related";
constexpr int mostParts = 10;
constexpr std::size_t longestHead = 8 * 1024;
constexpr std::size_t longestBlanks = 200; // behind a boundary, in its line

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

} // namespace

MultipartReader::MultipartReader(const std::string &boundary, Begin begin, Content content)
    : mDelimiter("\n--" + boundary)
    , mBegin(std::move(begin))
    , mContent(std::move(content))
{
}

void MultipartReader::feed(std::string_view bytes)
{
    if (mState == State::Behind || mState == State::Broken)
        return;
    mBytes.append(bytes);
    while (step())
        continue;
}

// True when there is more to do with the bytes that are here.
bool MultipartReader::step()
{
    switch (mState) {
    case State::Head:
        return readHead();
    case State::Before:
    case State::Content:
        return readContent();
    default:
        return false;
    }
}

bool MultipartReader::readHead()
{
    const std::size_t end = mBytes.find('\n');
    if (std::min(end, mBytes.size()) > longestHead)
        mState = State::Broken;
    if (mState == State::Broken || end == std::string::npos)
        return false;
    const std::string_view line = trimmed(std::string_view(mBytes).substr(0, end));
    const std::size_t colon = std::min(line.find(':'), line.size());
    if (line.empty()) {
        mBegin(mType);
        mState = State::Content;
        mBytes.erase(0, end); // this very line end stands before the boundary of an empty part
        mHasLineEnd = true;
        return true;
    }
    if (lowered(line.substr(0, colon)) == "content-type" && colon < line.size()) {
        const std::string_view value = line.substr(colon + 1);
        mType = lowered(trimmed(value.substr(0, value.find(';'))));
    }
    mBytes.erase(0, end + 1);
    return true;
}

bool MultipartReader::readContent()
{
    const std::size_t at = mBytes.find(mDelimiter);
    if (at == std::string::npos) {
        const std::size_t kept = mDelimiter.size() + 1; // may be its start, behind a "\r"
        give(mBytes.size() - std::min(kept, mBytes.size()));
        return false;
    }
    const Line line = lineAt(at + mDelimiter.size());
    if (line == Line::Unknown)
        return false;
    if (line == Line::Content) {
        give(at + 1);
        return true;
    }
    const std::size_t end = at > 0 && mBytes[at - 1] == '\r' ? at - 1 : at;
    give(end);
    mBytes.erase(0, at - end + mDelimiter.size());
    if (line == Line::Last) {
        mState = State::Behind;
        return false;
    }
    mBytes.erase(0, mBytes.find('\n') + 1);
    mType.clear();
    mState = ++mParts > mostParts ? State::Broken : State::Head;
    return true;
}

// What the line is whose first bytes look like a boundary and whose rest starts at the place.
MultipartReader::Line MultipartReader::lineAt(std::size_t place) const
{
    const std::string_view rest = std::string_view(mBytes).substr(place);
    if (rest.substr(0, 2) == "--")
        return Line::Last;
    const std::size_t end = rest.find_first_not_of(" \t\r");
    if (rest == "-" || (end == std::string_view::npos && rest.size() < longestBlanks))
        return Line::Unknown;
    return end != std::string_view::npos && rest[end] == '\n' ? Line::Delimiter : Line::Content;
}

// Hands over the first bytes that wait, except the line end of the part's head.
void MultipartReader::give(std::size_t bytes)
{
    const std::size_t start = std::min<std::size_t>(mHasLineEnd ? 1 : 0, bytes);
    if (mState == State::Content && bytes > start)
        mContent(std::string_view(mBytes).substr(start, bytes - start));
    mBytes.erase(0, bytes);
    mHasLineEnd = mHasLineEnd && bytes == 0;
}

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
