#pragma once

#include <string>

// A drawing of digits for people to read: strokes that lean and shift, with lines across, as an SVG
// element. It holds no text. It slows down programs that guess; what stops them is Attempts.
std::string digitPicture(const std::string &digits);

// So many random digits.
std::string randomDigits(int count);
