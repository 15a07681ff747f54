#include "base/texts.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <charconv>
#include <cstdio>
#include <ctime>
#include <filesystem>

namespace {

struct Sequence
{
    int length;
    std::uint32_t smallest; // what is smaller has a shorter form and is not valid in this one
    std::uint32_t firstBits;
};

std::optional<Sequence> sequenceOf(unsigned char first)
{
    if (first < 0x80)
        return Sequence{1, 0, first};
    if (first >= 0xC2 && first < 0xE0)
        return Sequence{2, 0x80, first & 0x1Fu};
    if (first >= 0xE0 && first < 0xF0)
        return Sequence{3, 0x800, first & 0x0Fu};
    if (first >= 0xF0 && first < 0xF5)
        return Sequence{4, 0x10000, first & 0x07u};
    return std::nullopt;
}

bool isScalarValue(std::uint32_t code)
{
    return code < 0xD800 || (code > 0xDFFF && code <= 0x10FFFF);
}

// Length of the valid character at the start of the text, 0 if there is none.
std::size_t validLength(std::string_view text)
{
    const auto sequence = sequenceOf(static_cast<unsigned char>(text.front()));
    if (!sequence || text.size() < static_cast<std::size_t>(sequence->length))
        return 0;
    std::uint32_t code = sequence->firstBits;
    for (int i = 1; i < sequence->length; ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        if ((byte & 0xC0) != 0x80)
            return 0;
        code = (code << 6) | (byte & 0x3F);
    }
    if (code < sequence->smallest || !isScalarValue(code))
        return 0;
    return sequence->length;
}

bool isUnreserved(unsigned char c)
{
    return c < 0x80 && (std::isalnum(c) || c == '-' || c == '.' || c == '_' || c == '~');
}

int hexValue(char c)
{
    if (c >= '0' && c <= '9')
        return c - '0';
    const char lower = static_cast<char>(c | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

std::string formatted(const std::tm &time)
{
    std::array<char, 32> text;
    const std::size_t length = std::strftime(text.data(), text.size(), "%Y-%m-%dT%H:%M:%S", &time);
    return std::string(text.data(), length);
}

// "Z", nothing or "+02:00" behind a time, in seconds.
std::optional<std::int64_t> zoneOffset(const std::string &text)
{
    if (text.empty() || text == "Z" || text == "z")
        return 0;
    int hours = 0, minutes = 0, read = 0;
    const bool isSigned = text[0] == '+' || text[0] == '-';
    if (!isSigned || std::sscanf(text.c_str() + 1, "%2d:%2d%n", &hours, &minutes, &read) != 2 ||
        read + 1 != static_cast<int>(text.size()))
        return std::nullopt;
    const std::int64_t seconds = hours * 3600 + minutes * 60;
    return text[0] == '-' ? -seconds : seconds;
}

} // namespace

std::string validUtf8(std::string_view text)
{
    std::string result;
    result.reserve(text.size());
    while (!text.empty()) {
        const std::size_t length = validLength(text);
        result += length > 0 ? text.substr(0, length) : std::string_view("\xEF\xBF\xBD");
        text.remove_prefix(length > 0 ? length : 1);
    }
    return result;
}

std::string percentEncoded(std::string_view text)
{
    static const char digits[] = "0123456789ABCDEF";
    std::string result;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (isUnreserved(byte))
            result += c;
        else
            result.append({'%', digits[byte >> 4], digits[byte & 15]});
    }
    return result;
}

std::string percentDecoded(std::string_view text)
{
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool escape = text[i] == '%' && i + 2 < text.size() && hexValue(text[i + 1]) >= 0 &&
                            hexValue(text[i + 2]) >= 0;
        if (!escape) {
            result += text[i];
            continue;
        }
        result += static_cast<char>(hexValue(text[i + 1]) * 16 + hexValue(text[i + 2]));
        i += 2;
    }
    return result;
}

std::optional<std::int64_t> parseNumber(std::string_view text)
{
    if (text.empty() || text.size() > 18 || !std::isdigit(static_cast<unsigned char>(text[0])))
        return std::nullopt;
    std::int64_t value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return value;
}

std::string utcTime(std::int64_t seconds)
{
    const std::time_t value = seconds;
    std::tm time{};
    gmtime_r(&value, &time);
    return formatted(time);
}

std::string localTime(std::int64_t seconds)
{
    const std::time_t value = seconds;
    std::tm time{};
    localtime_r(&value, &time);
    return formatted(time);
}

std::int64_t currentSeconds()
{
    return std::time(nullptr);
}

std::string localDay()
{
    return localTime(currentSeconds()).substr(0, std::string("2026-05-01").size());
}

std::string monthName(std::int64_t month)
{
    static const std::array<const char *, 12> names = {
        "January", "February", "March",     "April",   "May",      "June",
        "July",    "August",   "September", "October", "November", "December"};
    return month >= 1 && month <= 12 ? names[static_cast<std::size_t>(month - 1)] : "";
}

std::vector<std::string> tagsIn(std::string text)
{
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c == '\n' || c == '\t'; }, ' ');
    std::vector<std::string> tags;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find(", ", start), text.size());
        const std::size_t first = text.find_first_not_of(" ,", start);
        if (first < end)
            tags.push_back(text.substr(first, text.find_last_not_of(" ,", end - 1) + 1 - first));
        start = end + 2;
    }
    return tags;
}

std::string withoutExtension(const std::string &name)
{
    const std::size_t dot = name.rfind('.');
    return dot == std::string::npos || dot == 0 ? name : name.substr(0, dot);
}

std::optional<std::int64_t> parseTime(const std::string &text)
{
    std::tm time{};
    const char *end = strptime(text.c_str(), "%Y-%m-%dT%H:%M:%S", &time);
    if (!end)
        return std::nullopt;
    std::string rest = end;
    if (!rest.empty() && rest[0] == '.')
        rest.erase(0, std::min(rest.find_first_not_of("0123456789", 1), rest.size()));
    const auto offset = zoneOffset(rest);
    if (!offset)
        return std::nullopt;
    return timegm(&time) - *offset;
}

std::string absoluteFolder(const std::string &folder)
{
    std::error_code code;
    std::string path = std::filesystem::absolute(folder, code).lexically_normal();
    while (path.size() > 1 && path.back() == '/')
        path.pop_back();
    return path;
}

bool liesWithin(const std::string &folder, const std::string &path)
{
    std::error_code code, pathCode;
    const std::string start = std::filesystem::canonical(folder, code).string();
    const std::string end = std::filesystem::canonical(path, pathCode).string();
    if (code || pathCode)
        return false;
    return start == "/" || end == start || end.rfind(start + "/", 0) == 0;
}
