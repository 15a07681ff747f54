#include "http/parking.h"

#include <sys/epoll.h>
#include <sys/eventfd.h>
#include <unistd.h>

#include <algorithm>
#include <array>

namespace {

constexpr int lookMilliseconds = 1000; // how often silent connections are looked for

void watchDescriptor(int events, int descriptor)
{
    epoll_event event{};
    event.events = EPOLLIN | EPOLLRDHUP;
    event.data.fd = descriptor;
    epoll_ctl(events, EPOLL_CTL_ADD, descriptor, &event);
}

} // namespace

Parking::Parking(Ready ready, const Limits &limits)
    : mReady(std::move(ready))
    , mLimits(limits)
    , mEvents(epoll_create1(EPOLL_CLOEXEC))
    , mWake(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
{
    watchDescriptor(mEvents, mWake);
    mThread = std::thread([this] { watch(); });
}

Parking::~Parking()
{
    stop();
    ::close(mEvents);
    ::close(mWake);
}

void Parking::park(Client client)
{
    Client displaced;
    const std::lock_guard<std::mutex> lock(mMutex);
    if (mStopping)
        return;
    if (mPlaces.size() >= mLimits.clients)
        displaced = takeLongest();
    const int socket = client->socket();
    mPlaces[socket] = {std::move(client), Clock::now()};
    watchDescriptor(mEvents, socket);
}

void Parking::stop()
{
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mStopping = true;
    }
    eventfd_write(mWake, 1);
    if (mThread.joinable())
        mThread.join();
    mPlaces.clear();
}

void Parking::watch()
{
    std::array<epoll_event, 64> events;
    for (;;) {
        const int count = epoll_wait(mEvents, events.data(), events.size(), lookMilliseconds);
        {
            const std::lock_guard<std::mutex> lock(mMutex);
            if (mStopping)
                return;
        }
        for (int i = 0; i < count; ++i) {
            if (Client client = take(events[i].data.fd))
                mReady(std::move(client));
        }
        takePatientless(); // whom nobody holds any more is closed
    }
}

Parking::Client Parking::take(int socket)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    const auto place = mPlaces.find(socket);
    if (place == mPlaces.end())
        return nullptr;
    Client client = std::move(place->second.client);
    mPlaces.erase(place);
    epoll_ctl(mEvents, EPOLL_CTL_DEL, socket, nullptr);
    return client;
}

std::vector<Parking::Client> Parking::takePatientless()
{
    std::vector<Client> clients;
    const std::lock_guard<std::mutex> lock(mMutex);
    const Clock::time_point oldest = Clock::now() - mLimits.patience;
    for (auto place = mPlaces.begin(); place != mPlaces.end();) {
        if (place->second.since > oldest) {
            ++place;
            continue;
        }
        epoll_ctl(mEvents, EPOLL_CTL_DEL, place->first, nullptr);
        clients.push_back(std::move(place->second.client));
        place = mPlaces.erase(place);
    }
    return clients;
}

// One device that opens hundreds must not push the others out.
Parking::Client Parking::takeLongest()
{
    std::map<std::string, std::size_t> counts;
    for (const auto &[socket, place] : mPlaces)
        ++counts[place.client->address()];
    const auto rank = [&counts](const auto &entry) {
        const Place &place = entry.second;
        return std::make_pair(counts[place.client->address()], Clock::now() - place.since);
    };
    const auto longest = std::max_element(
        mPlaces.begin(), mPlaces.end(),
        [&rank](const auto &one, const auto &other) { return rank(one) < rank(other); });
    Client client = std::move(longest->second.client);
    epoll_ctl(mEvents, EPOLL_CTL_DEL, longest->first, nullptr);
    mPlaces.erase(longest);
    return client;
}
