#include "app/fontwarmup.h"

#include <fontconfig/fontconfig.h>

#include <system_error>

FontWarmUp::FontWarmUp()
{
    try {
        mThread = std::thread([] { FcInit(); });
    } catch (const std::system_error &) {
        // No thread to be had: the first text does it all.
    }
}

FontWarmUp::~FontWarmUp()
{
    if (mThread.joinable())
        mThread.join();
}
