#pragma once

#include <string>
#include <vector>

// How texts are searched, whatever letters they are written in. A word counts without case, accents
// and the difference between wide and narrow letters; where a script writes no blanks between words
// (Chinese, Japanese, Thai and others) each letter is a word, and what was typed without a blank
// has to stand together.

// The words of a text, each as the index holds it: its pieces with a blank between them.
std::vector<std::string> searchWords(const std::string &text);

// The whole text as the index holds it.
std::string searchText(const std::string &text);

// What a photo's time, as 2019-12-24T18:00:00, is found by: "2019 12 24 december 24 2019
// christmas".
std::string searchDate(const std::string &time);
