#include "scan/folderwatch.h"

#include <spdlog/spdlog.h>

#include <poll.h>
#include <sys/eventfd.h>
#include <sys/inotify.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>

namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

constexpr milliseconds quiet{1000};
constexpr milliseconds longest{10'000};
constexpr std::uint32_t changes = IN_CREATE | IN_CLOSE_WRITE | IN_MOVED_FROM | IN_MOVED_TO |
                                  IN_DELETE | IN_DELETE_SELF | IN_MOVE_SELF | IN_ONLYDIR;

int millisecondsUntil(Clock::time_point time)
{
    const auto left = std::chrono::ceil<milliseconds>(time - Clock::now());
    return static_cast<int>(std::max<milliseconds>(left, milliseconds(0)).count());
}

} // namespace

FolderWatch::FolderWatch(std::function<void()> changed)
    : mChanged(std::move(changed))
    , mEvents(inotify_init1(IN_CLOEXEC | IN_NONBLOCK))
    , mWake(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
    , mThread([this] { run(); })
{
}

FolderWatch::~FolderWatch()
{
    eventfd_write(mWake, 1);
    mThread.join();
    ::close(mEvents);
    ::close(mWake);
}

bool FolderWatch::add(const std::set<std::string> &folders)
{
    const std::lock_guard<std::mutex> lock(mMutex);
    bool isNew = false;
    for (const std::string &folder : folders) {
        const int watch = inotify_add_watch(mEvents, folder.c_str(), changes);
        if (watch >= 0) {
            isNew |= mWatches.insert(watch).second;
        } else if (errno == ENOSPC) {
            if (!std::exchange(mIsFull, true))
                spdlog::warn("there are more folders than the system lets watch");
            break;
        }
    }
    return isNew;
}

void FolderWatch::run()
{
    std::array<pollfd, 2> descriptors = {pollfd{mEvents, POLLIN, 0}, pollfd{mWake, POLLIN, 0}};
    Clock::time_point first, due;
    bool isPending = false;
    for (;;) {
        ::poll(descriptors.data(), descriptors.size(), isPending ? millisecondsUntil(due) : -1);
        if (descriptors[1].revents != 0)
            return;
        if (descriptors[0].revents != 0) {
            readEvents();
            const Clock::time_point now = Clock::now();
            first = std::exchange(isPending, true) ? first : now;
            due = std::min(now + quiet, first + longest);
        }
        if (isPending && Clock::now() >= due) {
            isPending = false;
            mChanged();
        }
    }
}

// That something happened is all that counts, except for folders that are gone.
void FolderWatch::readEvents()
{
    alignas(inotify_event) std::array<char, 16 * 1024> bytes;
    for (ssize_t size; (size = ::read(mEvents, bytes.data(), bytes.size())) > 0;) {
        const std::lock_guard<std::mutex> lock(mMutex);
        for (ssize_t at = 0; at < size;) {
            const auto *event = reinterpret_cast<const inotify_event *>(bytes.data() + at);
            if (event->mask & IN_IGNORED)
                mWatches.erase(event->wd);
            at += static_cast<ssize_t>(sizeof(inotify_event) + event->len);
        }
    }
}
