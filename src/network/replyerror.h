#pragma once

#include "network/errorcode.h"

#include <QNetworkReply>

// What a reply's error means to the program. The two mappings differ: only a synchronous request
// tells "not permitted" apart and takes an unknown content error for a success.
ErrorCode asynchronousErrorCode(QNetworkReply::NetworkError error);
ErrorCode synchronousErrorCode(QNetworkReply::NetworkError error);
