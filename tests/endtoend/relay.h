#pragma once

#include "support/misbehavingserver.h"

// Hands the request on to the album service at that port, and its answer back until the service
// closes.
MisbehavingServer::Behaviour forwardTo(quint16 port);
