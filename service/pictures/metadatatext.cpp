#include "pictures/metadatatext.h"

#include <cstdio>
#include <glib.h>

namespace {

constexpr std::size_t longestText = 10'000;

std::string convertedFrom(const char *codePage, const std::string &text)
{
    char *converted = g_convert(text.data(), static_cast<gssize>(text.size()), "UTF-8", codePage,
                                nullptr, nullptr, nullptr);
    std::string result = converted ? converted : "";
    g_free(converted);
    return result;
}

bool isUtf8(const std::string &text)
{
    return g_utf8_validate(text.data(), static_cast<gssize>(text.size()), nullptr);
}

std::string toUtf8(std::string text)
{
    if (isUtf8(text))
        return text;
    std::string converted = convertedFrom("WINDOWS-1252", text);
    return converted.empty() ? convertedFrom("ISO-8859-1", text) : converted;
}

void cutBetweenCharacters(std::string &text)
{
    if (text.size() <= longestText)
        return;
    std::size_t end = longestText;
    while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xc0) == 0x80)
        --end;
    text.resize(end);
}

std::string withoutControls(const std::string &text)
{
    std::string clean;
    clean.reserve(text.size());
    for (const char *at = text.data(), *end = at + text.size(); at < end;) {
        const char *next = g_utf8_next_char(at);
        const gunichar character = g_utf8_get_char(at);
        const bool endsLine = character == '\r' && (next == end || *next != '\n');
        if (endsLine)
            clean += '\n';
        else if (!g_unichar_iscntrl(character) || character == '\n' || character == '\t')
            clean.append(at, next);
        at = next;
    }
    return clean;
}

std::string trimmed(const std::string &text)
{
    const std::size_t first = text.find_first_not_of(" \t\n");
    if (first == std::string::npos)
        return {};
    return text.substr(first, text.find_last_not_of(" \t\n") - first + 1);
}

} // namespace

std::string cleanMetadataText(std::string text)
{
    // Fixed-length fields are filled up with zeros.
    text.erase(text.find_last_not_of('\0') + 1);
    for (char &character : text)
        if (character == '\0')
            character = ' ';
    text = trimmed(withoutControls(toUtf8(std::move(text))));
    cutBetweenCharacters(text);
    return text;
}

std::string isoPhotoTime(const std::string &text)
{
    int year = 0, month = 0, day = 0, hour = 0, minute = 0, second = 0;
    const int fields = std::sscanf(text.c_str(), "%4d%*1[:-]%2d%*1[:-]%2d%*1[ T]%2d:%2d:%2d", &year,
                                   &month, &day, &hour, &minute, &second);
    if (fields < 3 || year < 1 || month < 1 || day < 1 || hour < 0 || minute < 0 || second < 0)
        return {};
    if (!g_date_valid_dmy(static_cast<GDateDay>(day), static_cast<GDateMonth>(month),
                          static_cast<GDateYear>(year)) ||
        hour > 23 || minute > 59 || second > 59)
        return {};
    char iso[80];
    std::snprintf(iso, sizeof iso, "%04d-%02d-%02dT%02d:%02d:%02d", year, month, day, hour, minute,
                  second);
    return iso;
}
