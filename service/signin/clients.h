#pragma once

#include "base/secrets.h"

#include <string>

// The one program that may ask for tokens, as the sign-in pages and the token endpoint know it.
inline const char knownClientId[] = "583920174652-abcdefghijklmnopqrstuvwxyz";
inline const char knownClientSecret[] = "Qm7rT2vXk9LpZ4wHs1NdYb8E";
// There is no address to go back to: the result stands in the title of the last page.
inline const char outOfBand[] = "urn:ietf:wg:oauth:2.0:oob";

// What somebody has allowed and a one-time code stands for.
struct Approval
{
    std::int64_t userId = 0;
    std::string clientId;
    std::string redirectUri;
};
