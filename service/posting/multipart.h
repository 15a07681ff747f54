#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

// A body of several parts, as in "multipart/related; boundary=B". Lines may end in "\n" or "\r\n".
struct BodyPart
{
    std::string contentType; // in small letters, without parameters
    std::string_view content;
};

// Empty when the type is another one or names no boundary. Some clients write more behind the
// boundary, in the same line: it ends at the first blank or semicolon, unless it is quoted.
std::string boundaryOf(const std::string &contentType);

// The parts, which look into `body`; nothing when the last boundary is missing, that is when the
// body has been cut.
std::optional<std::vector<BodyPart>> partsOf(std::string_view body, const std::string &boundary);
