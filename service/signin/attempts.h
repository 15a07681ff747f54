#pragma once

#include "signin/shortlived.h"

#include <deque>

// Counts wrong passwords, for each mail address and for each device that they come from, and says
// when asking has to become harder. May be used from any thread.
class Attempts
{
public:
    struct Limits
    {
        std::size_t untilPanel = 3; // then digits have to be read from a picture as well
        std::size_t ofMail = 10;
        std::size_t ofDevice = 30;
        std::chrono::seconds window{600}; // a wrong try is forgotten after this time
    };
    struct Who
    {
        std::string mail;
        std::string device; // its network address
    };

    Attempts(const Limits &limits, Now now);

    bool needsPanel(const Who &who);
    // How long nobody may try; zero when they may.
    std::chrono::seconds blockedFor(const Who &who);
    void noteWrong(const Who &who);
    void noteRight(const Who &who);

private:
    using Times = std::deque<SteadyClock::time_point>;

    const Times &recent(const std::string &key);
    std::chrono::seconds waitFor(const std::string &key, std::size_t most);
    void dropForgotten();

    const Limits mLimits;
    const Now mNow;
    std::mutex mMutex;
    std::map<std::string, Times> mWrong; // the latest last
};
