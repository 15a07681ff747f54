#include "data/publishedtime.h"

namespace {

const int timeLength = 19; // of "yyyy-MM-ddThh:mm:ss"

// Takes a number apart that fills its field; false when something else stands there. A plus sign
// may lead, as it may for Qt's parser of formatted times.
bool readField(const QString &text, int from, int length, int *value)
{
    *value = 0;
    for (int i = from; i < from + length; ++i) {
        const ushort digit = text.at(i).unicode() - '0';
        if (digit > 9) {
            if (i == from && text.at(i) == QLatin1Char('+'))
                continue;
            return false;
        }
        *value = *value * 10 + digit;
    }
    return true;
}

bool hasSeparators(const QString &text)
{
    return text.at(4) == QLatin1Char('-') && text.at(7) == QLatin1Char('-') &&
           text.at(10) == QLatin1Char('T') && text.at(13) == QLatin1Char(':') &&
           text.at(16) == QLatin1Char(':');
}

} // namespace

QDateTime localTimeAsWritten(const QString &text)
{
    const int dot = text.indexOf(QLatin1Char('.'));
    if ((dot < 0 ? text.size() : dot) != timeLength || !hasSeparators(text))
        return QDateTime();

    int year, month, day, hour, minute, second;
    if (!readField(text, 0, 4, &year) || !readField(text, 5, 2, &month) ||
        !readField(text, 8, 2, &day) || !readField(text, 11, 2, &hour) ||
        !readField(text, 14, 2, &minute) || !readField(text, 17, 2, &second))
        return QDateTime();

    const QDate date(year, month, day);
    const QTime time(hour, minute, second);
    return date.isValid() && time.isValid() ? QDateTime(date, time) : QDateTime();
}

QDateTime isoTime(const QString &text)
{
    return QDateTime::fromString(text, Qt::ISODate);
}
