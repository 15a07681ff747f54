#pragma once

#include <QByteArray>
#include <QDateTime>

#include <optional>

// The datagrams of the simple network time protocol, version 3, client mode.

// The 48-byte request. Its transmit time is the date and time as the clock on the wall shows them,
// whatever their zone.
QByteArray sntpRequest(const QDateTime &local);

// The seconds since 1970-01-01 that a reply carries in the transmit timestamp at its end (negative
// before 1970), or nothing when it is too short to have one.
std::optional<qint64> sntpSeconds(const QByteArray &reply);
