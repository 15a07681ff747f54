#pragma once

#include "base/secrets.h"

#include <algorithm>
#include <chrono>
#include <functional>
#include <map>
#include <mutex>
#include <optional>
#include <string>

using SteadyClock = std::chrono::steady_clock;
using Now = std::function<SteadyClock::time_point()>; // moved by hand in tests

// Values that are known by a text nobody can guess, for a short time and only in memory: sessions
// of the sign-in pages, one-time codes. When there are too many the oldest goes. May be used from
// any thread.
template <typename Value>
class ShortLived
{
public:
    ShortLived(std::chrono::seconds life, Now now)
        : mLife(life)
        , mNow(std::move(now))
    {
    }

    // The text by which the value is found from now on.
    std::string add(Value value)
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        makeRoom();
        std::string key = randomText(keyBytes);
        mEntries[fingerprint(key)] = {std::move(value), mNow() + mLife};
        return key;
    }
    std::optional<Value> find(const std::string &key) const
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        const auto entry = mEntries.find(fingerprint(key));
        if (entry == mEntries.end() || entry->second.end <= mNow())
            return std::nullopt;
        return entry->second.value;
    }
    // The same, once: whoever asks again finds nothing.
    std::optional<Value> take(const std::string &key)
    {
        std::optional<Value> value = find(key);
        const std::lock_guard<std::mutex> lock(mMutex);
        return mEntries.erase(fingerprint(key)) > 0 ? value : std::nullopt;
    }

private:
    struct Entry
    {
        Value value;
        SteadyClock::time_point end;
    };
    static constexpr std::size_t keyBytes = 32;
    static constexpr std::size_t mostEntries = 1000;

    void makeRoom()
    {
        const SteadyClock::time_point now = mNow();
        for (auto entry = mEntries.begin(); entry != mEntries.end();)
            entry = entry->second.end <= now ? mEntries.erase(entry) : std::next(entry);
        if (mEntries.size() < mostEntries)
            return;
        mEntries.erase(
            std::min_element(mEntries.begin(), mEntries.end(), [](const auto &a, const auto &b) {
                return a.second.end < b.second.end;
            }));
    }

    const std::chrono::seconds mLife;
    const Now mNow;
    mutable std::mutex mMutex;
    std::map<std::string, Entry> mEntries; // by the fingerprint of the text
};
