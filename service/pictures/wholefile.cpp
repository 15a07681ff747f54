#include "pictures/wholefile.h"

#include <fstream>

std::string readWholeFile(const std::string &path)
{
    std::ifstream file(path, std::ios::binary | std::ios::ate);
    const std::streamoff size = file.tellg();
    if (!file || size <= 0)
        return {};
    std::string bytes(static_cast<std::size_t>(size), '\0');
    file.seekg(0);
    file.read(bytes.data(), size);
    return file ? bytes : std::string();
}
