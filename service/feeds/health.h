#pragma once

#include "http/router.h"

#include <string>

class Database;

// "health": 200 with {"status": "ok", "photos"} when the service can read its index and has room in
// its data folder, 503 when not. For programs that watch over it; needs no token and tells nothing
// about anybody.
void addHealthRoute(Router &router, Database &database, const std::string &dataFolder);
