#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

// Each target defines this one function: it gives hostile bytes to a reader of the programs'. What
// the reader makes of them is mostly its own business; it must not crash, read beyond its bytes or
// run for ever, and where a target checks more, it calls broken().
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size);

// Ends the run as a find.
[[noreturn]] inline void broken()
{
    __builtin_trap();
}

inline std::string textOf(const std::uint8_t *data, std::size_t size)
{
    return std::string(reinterpret_cast<const char *>(data), size);
}
