#include "signin/digitpicture.h"

#include <sodium.h>

#include <array>

namespace {

// Each digit as one stroke in a box of 20 x 32 units.
constexpr std::array<const char *, 10> strokes = {
    "M10 1C2 1 1 8 1 16S2 31 10 31S19 24 19 16S18 1 10 1",
    "M4 8L12 1V31M4 31H19",
    "M2 8C3 0 18 0 18 8C18 15 4 21 1 31H19",
    "M2 3C10 -1 18 2 17 8C17 13 12 15 7 15C14 15 19 18 18 24C17 32 6 32 1 28",
    "M14 31V1L1 22H19",
    "M17 1H4L3 14C9 11 18 12 18 21C18 31 7 33 1 28",
    "M16 2C7 2 1 12 2 22C3 34 19 33 18 22C17 13 5 13 2 22",
    "M1 1H19C12 10 8 20 7 31",
    "M10 15C1 14 2 1 10 1S19 14 10 15C-1 16 0 31 10 31S21 16 10 15",
    "M18 11C17 20 4 19 3 11C2 0 17 -1 18 11C18 22 13 31 5 31"};

constexpr int advance = 30;
constexpr int height = 48;

int between(int lowest, int highest)
{
    return lowest +
           static_cast<int>(randombytes_uniform(static_cast<std::uint32_t>(highest - lowest + 1)));
}

std::string drawn(char digit, int place)
{
    const int x = 8 + place * advance + between(-3, 3), y = 8 + between(-5, 5);
    return "<path transform=\"translate(" + std::to_string(x) + " " + std::to_string(y) +
           ") rotate(" + std::to_string(between(-18, 18)) + " 10 16)\" d=\"" +
           strokes[static_cast<std::size_t>(digit - '0')] + "\"/>";
}

std::string lineAcross(int width)
{
    return "<path stroke-width=\"1.5\" d=\"M0 " + std::to_string(between(4, height - 4)) + "Q" +
           std::to_string(width / 2) + " " + std::to_string(between(-10, height + 10)) + " " +
           std::to_string(width) + " " + std::to_string(between(4, height - 4)) + "\"/>";
}

} // namespace

std::string digitPicture(const std::string &digits)
{
    const int width = 6 + static_cast<int>(digits.size()) * advance;
    std::string svg = "<svg xmlns=\"http://www.w3.org/2000/svg\" viewBox=\"0 0 " +
                      std::to_string(width) + " " + std::to_string(height) +
                      "\" fill=\"none\" stroke=\"#f2f6f9\" stroke-width=\"3\">";
    for (std::size_t i = 0; i < digits.size(); ++i)
        svg += drawn(digits[i], static_cast<int>(i));
    for (int line = 0; line < 3; ++line)
        svg += lineAcross(width);
    return svg + "</svg>";
}

std::string randomDigits(int count)
{
    std::string digits;
    for (int i = 0; i < count; ++i)
        digits += static_cast<char>('0' + between(0, 9));
    return digits;
}
