#include "http/turns.h"

Turns::Turns(std::size_t atOnce, std::size_t waiting)
    : mAtOnce(atOnce)
    , mWaiting(waiting)
{
}

bool Turns::take(const Client &client)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    Place &place = mPlaces[client->address()];
    if (place.served < mAtOnce) {
        ++place.served;
        return true;
    }
    if (place.waiting.size() < mWaiting)
        place.waiting.push_back(client);
    return false;
}

Turns::Client Turns::pass(const std::string &address)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    const auto place = mPlaces.find(address);
    if (place == mPlaces.end())
        return nullptr;
    std::deque<Client> &waiting = place->second.waiting;
    if (waiting.empty()) {
        if (--place->second.served == 0)
            mPlaces.erase(place);
        return nullptr;
    }
    Client next = std::move(waiting.front());
    waiting.pop_front();
    return next;
}

void Turns::clear()
{
    const std::lock_guard<std::mutex> lock(mMutex);
    mPlaces.clear();
}
