#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// Small helpers for texts: encodings, numbers and times as the feeds write them.

// The text with every byte that is no valid UTF-8 replaced by U+FFFD.
std::string validUtf8(std::string_view text);

// Every byte outside the unreserved set as %XX.
std::string percentEncoded(std::string_view text);
// A "%" that starts no escape stays as it is.
std::string percentDecoded(std::string_view text);

// A whole number without sign, blanks or anything behind it; at most 18 digits.
std::optional<std::int64_t> parseNumber(std::string_view text);

// Seconds since 1970 as 2026-05-01T10:00:00 in UTC, or in the server's zone.
std::string utcTime(std::int64_t seconds);
std::string localTime(std::int64_t seconds);
std::int64_t currentSeconds();
// Today in the server's zone, as 2026-05-01.
std::string localDay();
// "January" for 1; empty for what is no month.
std::string monthName(std::int64_t month);
// Seconds since 1970 of an ISO time with or without fraction and zone, UTC if it has none; nothing
// if it is no such time.
std::optional<std::int64_t> parseTime(const std::string &text);

// The tags of a list, whatever somebody or a file calls one tag: readers of feeds split lists of
// tags at ", ", so that none can hold it, nor a line end or a tab.
std::vector<std::string> tagsIn(std::string text);

// A file name without its extension; a name that is only an extension stays whole.
std::string withoutExtension(const std::string &name);

// Whether a file is below a folder when all links are followed; false when it is not there.
bool liesWithin(const std::string &folder, const std::string &path);

// The absolute form of a folder without a slash at its end.
std::string absoluteFolder(const std::string &folder);
