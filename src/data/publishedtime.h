#pragma once

#include <QDateTime>
#include <QString>

// Reading of the feeds' times, which all look like "2012-03-01T10:00:00.000Z". Building records
// costs mostly this, so the digits are taken apart by hand.

// The time as written, taken for local time: everything from the first "." on is dropped and the
// rest must be exactly "yyyy-MM-ddThh:mm:ss", else the result is invalid.
QDateTime localTimeAsWritten(const QString &text);

// The time by ISO 8601, with its fraction and zone; invalid when it is none.
QDateTime isoTime(const QString &text);
