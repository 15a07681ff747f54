#pragma once

#include <QtGlobal>

// Result of every network operation and call-back: 0 for success, negative for failures.
using ErrorCode = qint32;

constexpr ErrorCode NET_SUCCESS = 0;
constexpr ErrorCode NET_REJECTED = -1;        // no such list, no picture, or refused (managers)
constexpr ErrorCode NET_NOT_PERMITTED = -86;  // the server refused the operation
constexpr ErrorCode NET_FAILED = -87;         // any other failure
constexpr ErrorCode NET_NO_DATA = -88;        // a finished download had no bytes (managers)
constexpr ErrorCode NET_CONTENT_ERROR = -89;  // access denied, or content not found
constexpr ErrorCode NET_TIMEOUT = -90;        // the wait, or the transport, ran out of time
constexpr ErrorCode NET_CANCELED = -91;       // aborted, also for answers above the size cap
constexpr ErrorCode NET_REFUSED = -92;        // connection refused
constexpr ErrorCode NET_HOST_NOT_FOUND = -93; // host name not found
constexpr ErrorCode NET_OUT_OF_MEMORY = -97;  // a buffer could not be allocated (managers)

// What a Connection reports to its owner.
enum CallbackType : int {
    CALLBACK_ERROR = 0,      // parameter: the transport's network error number
    CALLBACK_READY_READ = 1, // parameter: 0
    CALLBACK_FINISHED = 2,   // parameter: 0
    CALLBACK_PROGRESS = 3,   // parameter: percent received, 0 to 100
};
