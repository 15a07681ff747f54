#pragma once

#include <string>

class Session;

constexpr int newestSchema = 8;

// Brings the index from whatever version it has to the newest (tests stop at an older one), one
// step per version, inside the caller's transaction. False for a file that a newer version of the
// service has written.
bool upgradeSchema(Session &session, std::string *error, int version = newestSchema);
