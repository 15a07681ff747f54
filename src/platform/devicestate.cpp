#include "platform/devicestate.h"

bool NetworkCableStatus = true;
bool IsSetTimeZone = false;
int TimeZone = 0;
