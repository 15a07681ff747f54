#pragma once

#include <string>

// The whole file in memory, empty when it cannot be read.
std::string readWholeFile(const std::string &path);
