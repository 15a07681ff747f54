#pragma once

#include <optional>
#include <string>

// What somebody posts: an Atom entry of one of three kinds.
struct AtomEntry
{
    enum class Kind { Comment, Tag, Photo };

    Kind kind = Kind::Comment;
    std::string title;   // of a tag: the tag; all texts are clean UTF-8
    std::string content; // of a comment
    std::string summary; // of a photo
};

// Reads an entry; nothing, with the reason in `error`, when the text is none. Without an XML
// declaration it is UTF-8 if it can be and Latin-1 otherwise. Document types are refused: nothing
// outside the text is ever read.
std::optional<AtomEntry> parseAtomEntry(const std::string &text, std::string *error);
