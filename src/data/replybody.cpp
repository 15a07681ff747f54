#include "data/replybody.h"

#include "base/log.h"
#include "network/connection.h"

#include <limits>
#include <new>

ReplyBody ReplyBody::read(Connection &connection, const char *owner)
{
    const qint64 available = connection.getAvailable();
    if (available < 1) {
        logLine("NO DATA to read ", owner, "::handleDownloadFinished");
        return ReplyBody(NET_NO_DATA);
    }

    ReplyBody body(NET_SUCCESS);
    if (available < std::numeric_limits<int>::max())
        body.mBuffer.reset(new (std::nothrow) char[static_cast<size_t>(available) + 1]);
    if (!body.mBuffer) {
        logLine("Out Of Memory in ", owner, "::handleDownloadFinished");
        return ReplyBody(NET_OUT_OF_MEMORY);
    }
    const qint64 count = connection.readData(body.mBuffer.get(), available);
    if (count <= 0 || count > available)
        return ReplyBody(NET_FAILED);
    body.mBuffer[static_cast<size_t>(count)] = '\0';
    body.mLength = static_cast<int>(count);
    return body;
}
