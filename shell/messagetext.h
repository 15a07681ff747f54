#pragma once

#include "platform/ipc.h"

#include <QString>

// A message of the program as one readable line, without a line end: a word for its type, then
// the parameters that the type has.
QString messageText(const _NETWORK_MSG_T &message);
