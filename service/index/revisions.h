#pragma once

#include <cstdint>

class Session;

// Counters in the index that tell what may have changed, whichever process changed it.
enum class Revision {
    Photos, // which photos there are, and which of them everybody may see
    Users
};

std::int64_t revision(Session &session, Revision what);
void raiseRevision(Session &session, Revision what);
