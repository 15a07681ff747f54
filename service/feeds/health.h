#pragma once

#include "http/router.h"

class Database;

// "health": 200 with {"status": "ok", "photos"} when the service can read its index, 503 when it
// cannot. For programs that watch over it; needs no token and tells nothing about anybody.
void addHealthRoute(Router &router, Database &database);
