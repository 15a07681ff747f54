#include "platform/linknotify.h"

#include "platform/linkwatcher.h"

#include <memory>

int i4_reg_network_notify_cb(NetworkNotifyCallback callback)
{
    static std::unique_ptr<LinkWatcher> watcher;
    watcher.reset();
    if (!callback)
        return 0;
    auto next = std::make_unique<LinkWatcher>([callback](const LinkChange &change) {
        std::string name = change.name;
        callback(name.data(), change.carrier ? NETWORK_EVENT_PLUG_IN : NETWORK_EVENT_PLUG_OUT);
    });
    if (!next->isRunning())
        return -1;
    watcher = std::move(next);
    return 0;
}
