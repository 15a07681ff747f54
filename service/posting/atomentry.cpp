#include "posting/atomentry.h"

#include "base/texts.h"
#include "pictures/metadatatext.h"

#include <pugixml.hpp>

#include <string_view>

namespace {

const std::string_view kindScheme = "https://schemas.orvala.example/2005#kind";
const std::string_view kindTerm = "https://schemas.orvala.example/photos/2007#";

std::string fromLatin1(const std::string &text)
{
    std::string utf8;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte < 0x80) {
            utf8 += c;
        } else {
            utf8 += static_cast<char>(0xC0 | (byte >> 6));
            utf8 += static_cast<char>(0x80 | (byte & 0x3F));
        }
    }
    return utf8;
}

bool isDeclared(const std::string &text)
{
    return text.rfind("<?xml", 0) == 0 || text.rfind("\xEF\xBB\xBF", 0) == 0 ||
           text.find('\0') != std::string::npos; // UTF-16 or UTF-32
}

pugi::xml_parse_result load(pugi::xml_document &document, const std::string &text)
{
    constexpr unsigned options = pugi::parse_default | pugi::parse_doctype;
    if (isDeclared(text))
        return document.load_buffer(text.data(), text.size(), options);
    const std::string utf8 = validUtf8(text) == text ? text : fromLatin1(text);
    return document.load_buffer(utf8.data(), utf8.size(), options, pugi::encoding_utf8);
}

std::string_view localName(const pugi::xml_node &node)
{
    const std::string_view name = node.name();
    return name.substr(name.find(':') + 1); // from the start without a colon
}

constexpr std::size_t longestText = 10'000;

std::string textOf(const pugi::xml_node &entry, std::string_view name)
{
    for (const pugi::xml_node &child : entry.children()) {
        if (localName(child) == name)
            return cleanMetadataText(validUtf8(child.text().get()));
    }
    return {};
}

std::optional<AtomEntry::Kind> kindOf(const pugi::xml_node &entry)
{
    for (const pugi::xml_node &child : entry.children()) {
        if (localName(child) != "category" || child.attribute("scheme").value() != kindScheme)
            continue;
        const std::string_view term = child.attribute("term").value();
        if (term.substr(0, kindTerm.size()) != kindTerm)
            continue;
        const std::string_view kind = term.substr(kindTerm.size());
        if (kind == "comment")
            return AtomEntry::Kind::Comment;
        if (kind == "tag")
            return AtomEntry::Kind::Tag;
        if (kind == "photo")
            return AtomEntry::Kind::Photo;
    }
    return std::nullopt;
}

bool hasLongText(const pugi::xml_node &entry)
{
    for (const pugi::xml_node &child : entry.children()) {
        if (std::string_view(child.text().get()).size() > longestText)
            return true;
    }
    return false;
}

bool hasDocumentType(const pugi::xml_document &document)
{
    for (const pugi::xml_node &node : document.children()) {
        if (node.type() == pugi::node_doctype)
            return true;
    }
    return false;
}

} // namespace

std::optional<AtomEntry> parseAtomEntry(const std::string &text, std::string *error)
{
    pugi::xml_document document;
    const pugi::xml_parse_result result = load(document, text);
    const pugi::xml_node root = document.document_element();
    if (!result || hasDocumentType(document) || localName(root) != "entry") {
        *error = result ? "this is no Atom entry" : result.description();
        return std::nullopt;
    }
    const auto kind = kindOf(root);
    const AtomEntry entry{kind.value_or(AtomEntry::Kind::Comment), textOf(root, "title"),
                          textOf(root, "content"), textOf(root, "summary")};
    if (!kind)
        *error = "the entry has no category that says what it is";
    else if (hasLongText(root))
        *error = "a text of the entry is too long";
    else
        return entry;
    return std::nullopt;
}
