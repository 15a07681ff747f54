#include "ui/detailkeys.h"

#include "common/ui/remotekeys.h"

namespace {

struct Meaning
{
    int key;
    DetailCommand onPhoto;
    DetailCommand onActions;
};

constexpr Meaning kMeanings[] = {
    {DEVICE_LEFT_KEY, DetailCommand::Previous, DetailCommand::ActionLeft},
    {DEVICE_RIGHT_KEY, DetailCommand::Next, DetailCommand::ActionRight},
    {DEVICE_UP_KEY, DetailCommand::None, DetailCommand::ToPhoto},
    {DEVICE_DOWN_KEY, DetailCommand::ToActions, DetailCommand::Stay},
    {DEVICE_SELECT_KEY, DetailCommand::FullScreen, DetailCommand::RunAction},
    {DEVICE_PRE_KEY, DetailCommand::Previous, DetailCommand::Previous},
    {DEVICE_NEXT_KEY, DetailCommand::Next, DetailCommand::Next},
    {DEVICE_PAGEUP_KEY, DetailCommand::PageBack, DetailCommand::PageBack},
    {DEVICE_PAGEDOWN_KEY, DetailCommand::PageOn, DetailCommand::PageOn},
    {DEVICE_PLAY_KEY, DetailCommand::Play, DetailCommand::Play},
    {DEVICE_PLAYPAUSE_KEY, DetailCommand::Play, DetailCommand::Play},
    {DEVICE_RETURN_KEY, DetailCommand::Back, DetailCommand::Back},
};

} // namespace

DetailCommand detailCommand(bool onActions, int key)
{
    for (const Meaning &meaning : kMeanings) {
        if (meaning.key == key)
            return onActions ? meaning.onActions : meaning.onPhoto;
    }
    return DetailCommand::None;
}
