#pragma once

#include "http/clientstream.h"

#include <functional>
#include <map>
#include <mutex>
#include <thread>

// Where connections wait between requests, at the cost of a descriptor each but no thread: one
// thread watches them all and hands over those that have something to say.
class Parking
{
public:
    using Client = std::shared_ptr<ClientStream>;
    using Ready = std::function<void(Client)>;

    struct Limits
    {
        std::chrono::seconds patience{300}; // then a silent connection is closed
        std::size_t clients =
            512; // beyond it the longest waiting one goes, of the address with most
    };

    // `ready` is called on the watching thread.
    Parking(Ready ready, const Limits &limits);
    ~Parking();
    Parking(const Parking &) = delete;
    Parking &operator=(const Parking &) = delete;

    void park(Client client);
    // Closes all that wait; who parks afterwards is closed at once.
    void stop();

private:
    using Clock = std::chrono::steady_clock;
    struct Place
    {
        Client client;
        Clock::time_point since;
    };

    void watch();
    Client take(int socket);
    std::vector<Client> takePatientless();
    Client takeLongest();

    const Ready mReady;
    const Limits mLimits;
    int mEvents;
    int mWake;
    std::mutex mMutex;
    std::map<int, Place> mPlaces;
    bool mStopping = false;
    std::thread mThread;
};
