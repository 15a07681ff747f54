#include "platform/sntp.h"

#include <QtEndian>

namespace {

constexpr qint64 SECONDS_1900_TO_1970 = 2208988800;
constexpr int REQUEST_SIZE = 48;
constexpr int TIMESTAMP_SIZE = 8; // seconds, then fraction, 4 bytes each

} // namespace

QByteArray sntpRequest(const QDateTime &local)
{
    // Counted as if in UTC, which has no jumps between then and now.
    const qint64 seconds =
        QDateTime(local.date(), local.time(), Qt::UTC).toSecsSinceEpoch() + SECONDS_1900_TO_1970;
    uchar request[REQUEST_SIZE] = {};
    request[0] = 0x1B; // leap indicator 0, version 3, mode 3
    request[2] = 4;    // poll
    request[3] = 0xFA; // precision
    request[5] = 1;    // root delay
    request[9] = 1;    // root dispersion
    qToBigEndian(quint32(seconds), request + REQUEST_SIZE - TIMESTAMP_SIZE);
    return QByteArray(reinterpret_cast<const char *>(request), REQUEST_SIZE);
}

std::optional<qint64> sntpSeconds(const QByteArray &reply)
{
    if (reply.size() < TIMESTAMP_SIZE)
        return std::nullopt;
    const quint32 seconds =
        qFromBigEndian<quint32>(reply.constData() + reply.size() - TIMESTAMP_SIZE);
    return qint64(seconds) - SECONDS_1900_TO_1970;
}
