#pragma once

#include <QtGlobal>

// Result of every network operation and call-back: 0 for success, negative for failures.
using ErrorCode = qint32;

enum : ErrorCode {
    NET_SUCCESS = 0,
    NET_REJECTED = -1,       // managers: no factory for a list, not an image, refused by the server
    NET_NOT_PERMITTED = -86, // the server refused the operation
    NET_FAILED = -87,        // any other failure
    NET_NO_DATA = -88,       // a finished download had no bytes (managers)
    NET_CONTENT_ERROR = -89, // access denied, or content not found
    NET_TIMEOUT = -90,       // a synchronous request ran out of time, or the transport did
    NET_CANCELED = -91,      // the request was aborted, also for answers above the size cap
    NET_REFUSED = -92,       // connection refused
    NET_HOST_NOT_FOUND = -93, // host name not found
    NET_OUT_OF_MEMORY = -97,  // a buffer could not be allocated (managers)
};

// What a Connection reports to its owner.
enum CallbackType : int {
    CALLBACK_ERROR = 0,      // parameter: the transport's network error number
    CALLBACK_READY_READ = 1, // parameter: 0
    CALLBACK_FINISHED = 2,   // parameter: 0
    CALLBACK_PROGRESS = 3,   // parameter: percent received, 0 to 100
};
