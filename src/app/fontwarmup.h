#pragma once

#include <thread>

// Reads the system's font configuration, some forty files, on a thread of its own while the
// application object connects to the screen; the first text waits for the rest of it, if there is
// any. The thread touches nothing else, and has ended when the object goes.
class FontWarmUp
{
public:
    FontWarmUp();
    ~FontWarmUp();
    FontWarmUp(const FontWarmUp &) = delete;
    FontWarmUp &operator=(const FontWarmUp &) = delete;

private:
    std::thread mThread;
};
