#pragma once

#include <thread>

// The fonts that texts are drawn with and fall back to. They are looked up by a short configuration
// of the program's own in place of the system's: that one is some forty files, each of whose rules
// is tried for every font a text asks for, and takes a tenth of the start. What an administrator
// has put into the system's local.conf still counts.
//
// It is read on a thread while the application object connects to the screen. A configuration that
// cannot be used leaves the system's.
class FontSetup
{
public:
    FontSetup();
    ~FontSetup() { finish(); }
    FontSetup(const FontSetup &) = delete;
    FontSetup &operator=(const FontSetup &) = delete;

    // To be called before the first text is measured: the thread has ended.
    void finish();

private:
    std::thread mThread;
};
