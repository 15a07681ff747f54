#pragma once

// What a key of the remote means on the photo screen.
enum class DetailCommand {
    None, // the owner's business
    Stay, // nothing, and nobody else's business
    Previous,
    Next,
    PageBack,
    PageOn,
    FullScreen,
    ToActions,
    ToPhoto,
    ActionLeft,
    ActionRight,
    RunAction,
    Play,
    Back,
};

// Depends on whether the actions or the photo have the focus.
DetailCommand detailCommand(bool onActions, int key);
