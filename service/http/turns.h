#pragma once

#include "http/parking.h"

// How many connections of one address are served at once: further ones wait for their turn, so that
// one device cannot keep all threads busy. May be used from any thread.
class Turns
{
public:
    using Client = Parking::Client;

    // Beyond `atOnce` clients of an address as many as `waiting` wait.
    Turns(std::size_t atOnce, std::size_t waiting);

    // True when the client may be served now. Otherwise it waits, or is closed when too many do.
    bool take(const Client &client);
    // After a client with this address has been served: the next one, which may be served now, or
    // null.
    Client pass(const std::string &address);
    // Closes all that wait.
    void clear();

private:
    struct Place
    {
        std::size_t served = 0;
        std::deque<Client> waiting;
    };

    const std::size_t mAtOnce;
    const std::size_t mWaiting;
    std::mutex mMutex;
    std::map<std::string, Place> mPlaces; // by address
};
