#include "common/ui/keyboardlayout.h"

#include <QStringList>

#include <algorithm>
#include <iterator>

namespace {

// The keys with the same text on every page, in the order of their tables.
constexpr int kSignKeys[] = {35, 36, 37, 38, 39, 40, 41, 42, 43};
constexpr int kDigitKeys[] = {9, 10, 11, 21, 22, 23, 32, 33, 34, 44, 45, 46};

const char *const kSigns[] = {"ABC", "#+=", u8"äöü", "@", ".", "-", "_", "!", ".com"};
const char *const kDigits[] = {"1", "2", "3", "4", "5", "6", "7", "8", "9", "+", "0", ","};

// What a page has on the 26 keys that are its own.
const char *const kPages[kPageCount] = {
    "a b c d e f g h i "
    "j k l m n o p q r "
    "s t u v w x y z",
    "A B C D E F G H I "
    "J K L M N O P Q R "
    "S T U V W X Y Z",
    "? ' \" : ; ( ) / & "
    "# $ % * = < > [ ] "
    "{ } \\ | ^ ~ ` www.",
    u8":) :( :D ;) :P <3 … – € "
    u8"£ $ § ° © « » „ “ "
    u8"¿ ¡ ì ò û ý .org .net",
    u8"ä ö ü ß é è ê ë ç "
    u8"à á â å æ ã ñ í î "
    u8"ï ó ô ø ú ù õ œ",
    u8"Ä Ö Ü ẞ É È Ê Ë Ç "
    u8"À Á Â Å Æ Ã Ñ Í Î "
    u8"Ï Ó Ô Ø Ú Ù Õ Œ",
};

const char *const kPageNames[kPageCount] = {"abc", "ABC", "#+=", ":-)", u8"äöü", u8"ÄÖÜ"};

// Where Up leads from the bottom row, and Down from the row above it.
constexpr int kUpFromBottom[] = {35, 37, 38, 40, 41, 43, 44, 45};
constexpr int kDownToBottom[] = {47, 47, 48, 49, 49, 50, 51, 51, 52, 53, 54, 54};

int rowOf(int index)
{
    return int(std::upper_bound(std::begin(kFirstKeyOfRow), std::end(kFirstKeyOfRow), index) -
               std::begin(kFirstKeyOfRow)) -
           1;
}

int besides(int index, int step)
{
    const int first = kFirstKeyOfRow[rowOf(index)];
    const int last = kFirstKeyOfRow[rowOf(index) + 1] - 1;
    const int moved = index + step;
    return moved < first ? last : moved > last ? first : moved;
}

int above(int index)
{
    if (index < 12)
        return index;
    if (index >= 47)
        return kUpFromBottom[index - 47];
    return index <= 31 || index >= 43 ? index - 12 : index - 11;
}

int below(int index)
{
    if (index >= 47)
        return index;
    if (index >= 35)
        return kDownToBottom[index - 35];
    return index <= 19 || index >= 32 ? index + 12 : index + 11;
}

// The place of a page's own key among the 26, -1 for any other key.
int placeOnPage(int index)
{
    if (index >= 0 && index <= 8)
        return index;
    if (index >= 12 && index <= 20)
        return index - 3;
    return index >= 24 && index <= 31 ? index - 6 : -1;
}

QString ownText(KeyboardPage page, int place)
{
    static const auto split = [] {
        QVector<QStringList> pages;
        for (const char *keys : kPages)
            pages << QString::fromUtf8(keys).split(QLatin1Char(' '));
        return pages;
    }();
    return split.at(int(page)).value(place);
}

template <std::size_t count>
QString textAt(const int (&keys)[count], const char *const (&texts)[count], int index)
{
    const auto key = std::find(std::begin(keys), std::end(keys), index);
    return key == std::end(keys) ? QString()
                                 : QString::fromUtf8(texts[std::distance(std::begin(keys), key)]);
}

} // namespace

int movedKeyFocus(int index, int arrow)
{
    if (index < 0 || index >= kKeyCount)
        return 0;
    switch (arrow) {
    case Qt::Key_Left:
        return besides(index, -1);
    case Qt::Key_Right:
        return besides(index, 1);
    case Qt::Key_Up:
        return above(index);
    case Qt::Key_Down:
        return below(index);
    default:
        return index;
    }
}

bool isPageKey(int index)
{
    return placeOnPage(index) >= 0;
}

QString keyLabel(KeyboardPage page, int index)
{
    if (index == DeleteKey)
        return QStringLiteral("DEL");
    if (index == EnterKey)
        return QStringLiteral("Enter");
    if (isPageKey(index))
        return ownText(page, placeOnPage(index));
    const QString sign = textAt(kSignKeys, kSigns, index);
    return sign.isEmpty() ? textAt(kDigitKeys, kDigits, index) : sign;
}

QString keyText(KeyboardPage page, int index)
{
    if (index == SpaceKey)
        return QStringLiteral(" ");
    const bool isFunction =
        index == LettersKey || index == SymbolsKey || index == AccentsKey || index >= CursorLeftKey;
    return isFunction ? QString() : keyLabel(page, index);
}

KeyboardPage otherOfPair(KeyboardPage page)
{
    return KeyboardPage(int(page) ^ 1);
}

KeyboardPage pageAfterKey(KeyboardPage page, int index)
{
    const auto first = KeyboardPage((index - LettersKey) * 2);
    return page == first ? otherOfPair(first) : first;
}

KeyboardPage turnedPage(KeyboardPage page, int steps)
{
    return KeyboardPage(((int(page) + steps) % kPageCount + kPageCount) % kPageCount);
}

QString pageName(KeyboardPage page)
{
    return QString::fromUtf8(kPageNames[int(page)]);
}
