#include "signin/attempts.h"

#include <cctype>

namespace {

constexpr std::size_t mostKeys = 10'000;

std::string keyOfMail(const std::string &mail)
{
    std::string key = "mail " + mail;
    for (char &c : key)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return key;
}

std::string keyOfDevice(const std::string &device)
{
    return "device " + device;
}

} // namespace

Attempts::Attempts(const Limits &limits, Now now)
    : mLimits(limits)
    , mNow(std::move(now))
{
}

bool Attempts::needsPanel(const Who &who)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    return recent(keyOfMail(who.mail)).size() >= mLimits.untilPanel ||
           recent(keyOfDevice(who.device)).size() >= mLimits.untilPanel;
}

std::chrono::seconds Attempts::blockedFor(const Who &who)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    return std::max(waitFor(keyOfMail(who.mail), mLimits.ofMail),
                    waitFor(keyOfDevice(who.device), mLimits.ofDevice));
}

void Attempts::noteWrong(const Who &who)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    if (mWrong.size() >= mostKeys)
        dropForgotten();
    for (const std::string &key : {keyOfMail(who.mail), keyOfDevice(who.device)})
        mWrong[key].push_back(mNow());
}

void Attempts::noteRight(const Who &who)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    mWrong.erase(keyOfMail(who.mail));
    mWrong.erase(keyOfDevice(who.device));
}

const Attempts::Times &Attempts::recent(const std::string &key)
{
    static const Times none;
    const auto found = mWrong.find(key);
    if (found == mWrong.end())
        return none;
    Times &times = found->second;
    while (!times.empty() && times.front() + mLimits.window <= mNow())
        times.pop_front();
    return times;
}

std::chrono::seconds Attempts::waitFor(const std::string &key, std::size_t most)
{
    const Times &times = recent(key);
    if (times.size() < most)
        return std::chrono::seconds(0);
    const auto left = times[times.size() - most] + mLimits.window - mNow();
    return std::max(std::chrono::ceil<std::chrono::seconds>(left), std::chrono::seconds(1));
}

void Attempts::dropForgotten()
{
    for (auto entry = mWrong.begin(); entry != mWrong.end();)
        entry = recent(entry->first).empty() ? mWrong.erase(entry) : std::next(entry);
    if (mWrong.size() >= mostKeys)
        mWrong.clear(); // only made-up addresses grow this large
}
