#pragma once

#include "network/errorcode.h"

#include <QByteArray>

#include <memory>

class Connection;

// The body of a finished answer. A buffer that cannot be had is an error code, not the program's
// end, so it is no QByteArray.
class ReplyBody
{
public:
    // Reads everything that the connection has. The owner's name goes into the log.
    static ReplyBody read(Connection &connection, const char *owner);

    ErrorCode code() const { return mCode; }
    // Looks into the body's buffer; followed by a zero byte.
    QByteArray bytes() const { return QByteArray::fromRawData(mBuffer.get(), mLength); }

private:
    explicit ReplyBody(ErrorCode code)
        : mCode(code)
    {
    }

    ErrorCode mCode;
    std::unique_ptr<char[]> mBuffer;
    int mLength = 0;
};
