#include "index/searchtext.h"

#include "base/texts.h"

#include <glib.h>

#include <algorithm>
#include <memory>
#include <utility>

namespace {

struct FreeText
{
    void operator()(char *text) const { g_free(text); }
};
using Text = std::unique_ptr<char, FreeText>;

bool isAscii(const std::string &text)
{
    return std::all_of(text.begin(), text.end(), [](char c) { return (c & 0x80) == 0; });
}

// Accents and vowel marks that people leave out; others belong to their letters.
bool isLeftOut(gunichar letter)
{
    const bool isMark = g_unichar_type(letter) == G_UNICODE_NON_SPACING_MARK;
    return letter == 0x0640 ||                                   // stretches Arabic words
           (isMark && ((letter >= 0x0300 && letter <= 0x036F) || // Latin, Greek, Cyrillic
                       (letter >= 0x0591 && letter <= 0x05C7) || // Hebrew
                       (letter >= 0x064B && letter <= 0x0670))); // Arabic
}

// Letters that are no plain letter with an accent, for keyboards that have plain letters only.
const char *plainForm(gunichar letter)
{
    static constexpr struct
    {
        gunichar letter;
        const char *plain;
    } forms[] = {{0xE6, "ae"}, {0xF0, "d"},  {0xF8, "o"},  {0xFE, "th"}, {0x111, "d"},
                 {0x127, "h"}, {0x131, "i"}, {0x142, "l"}, {0x153, "oe"}};
    for (const auto &form : forms) {
        if (form.letter == letter)
            return form.plain;
    }
    return nullptr;
}

bool standsAlone(gunichar letter)
{
    switch (g_unichar_get_script(letter)) {
    case G_UNICODE_SCRIPT_HAN:
    case G_UNICODE_SCRIPT_HIRAGANA:
    case G_UNICODE_SCRIPT_KATAKANA:
    case G_UNICODE_SCRIPT_BOPOMOFO:
    case G_UNICODE_SCRIPT_THAI:
    case G_UNICODE_SCRIPT_LAO:
    case G_UNICODE_SCRIPT_KHMER:
    case G_UNICODE_SCRIPT_MYANMAR:
        return true;
    default:
        return false;
    }
}

std::string_view bytesOf(const char *letter)
{
    return {letter, static_cast<std::size_t>(g_utf8_next_char(letter) - letter)};
}

std::string withoutAccents(const char *decomposed)
{
    std::string text;
    for (const char *at = decomposed; *at != '\0'; at = g_utf8_next_char(at)) {
        if (!isLeftOut(g_utf8_get_char(at)))
            text += bytesOf(at);
    }
    return text;
}

// One form for all spellings of the same text. NUL ends texts, so it becomes a blank.
std::string folded(const std::string &text)
{
    std::string valid = validUtf8(text);
    std::replace(valid.begin(), valid.end(), '\0', ' ');
    if (isAscii(valid)) {
        for (char &c : valid)
            c = g_ascii_tolower(c);
        return valid;
    }
    const Text apart(g_utf8_normalize(valid.c_str(), -1, G_NORMALIZE_ALL));
    const std::string plain = withoutAccents(apart.get());
    const Text together(g_utf8_normalize(plain.c_str(), -1, G_NORMALIZE_ALL_COMPOSE));
    const Text lower(g_utf8_casefold(together.get(), -1));
    return lower.get();
}

void endPiece(std::string &word)
{
    if (!word.empty() && word.back() != ' ')
        word += ' ';
}

void addLetter(std::string &word, const char *at, bool wasAlone)
{
    const gunichar letter = g_utf8_get_char(at);
    if (g_unichar_ismark(letter)) {
        word += bytesOf(at);
        return;
    }
    if (wasAlone || standsAlone(letter))
        endPiece(word);
    if (const char *plain = plainForm(letter))
        word += plain;
    else
        word += bytesOf(at);
}

struct Occasion
{
    const char *first;
    const char *last;
    const char *name;
};
constexpr Occasion occasions[] = {{"12-31", "12-31", "new year"},
                                  {"01-01", "01-01", "new year"},
                                  {"02-14", "02-14", "valentine"},
                                  {"10-31", "10-31", "halloween"},
                                  {"12-24", "12-26", "christmas"}};

} // namespace

std::vector<std::string> searchWords(const std::string &text)
{
    const std::string plain = folded(text);
    std::vector<std::string> words;
    std::string word;
    bool wasAlone = false;
    const auto finish = [&] {
        if (!word.empty())
            words.push_back(std::exchange(word, {}));
        wasAlone = false;
    };
    for (const char *at = plain.c_str(); *at != '\0'; at = g_utf8_next_char(at)) {
        const gunichar letter = g_utf8_get_char(at);
        const bool isMark = g_unichar_ismark(letter);
        if (!g_unichar_isalnum(letter) && (!isMark || word.empty())) {
            finish();
            continue;
        }
        addLetter(word, at, wasAlone);
        wasAlone = isMark ? wasAlone : standsAlone(letter);
    }
    finish();
    return words;
}

std::string searchText(const std::string &text)
{
    std::string result;
    for (const std::string &word : searchWords(text))
        result += (result.empty() ? "" : " ") + word;
    return result;
}

std::string searchDate(const std::string &time)
{
    if (time.size() < std::string("2019-12-24").size())
        return {};
    const std::string year = time.substr(0, 4), month = time.substr(5, 2), day = time.substr(8, 2);
    std::string text = year + " " + month + " " + day;
    if (const std::string name = monthName(parseNumber(month).value_or(0)); !name.empty())
        text += " " + searchText(name) + " " + day + " " + year;
    const std::string date = time.substr(5, 5);
    for (const Occasion &occasion : occasions) {
        if (occasion.first <= date && date <= occasion.last)
            text += std::string(" ") + occasion.name;
    }
    return text;
}
