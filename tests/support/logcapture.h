#pragma once

#include <QStringList>
#include <QtGlobal>

// Collects every debug line while it lives, in place of printing it. One at a time.
class LogCapture
{
public:
    LogCapture()
    {
        lines().clear();
        mPrevious = qInstallMessageHandler(
            [](QtMsgType, const QMessageLogContext &, const QString &line) { lines() << line; });
    }
    ~LogCapture() { qInstallMessageHandler(mPrevious); }
    LogCapture(const LogCapture &) = delete;
    LogCapture &operator=(const LogCapture &) = delete;

    static QStringList &lines()
    {
        static QStringList collected;
        return collected;
    }
    static bool contains(const QString &line) { return lines().contains(line); }

private:
    QtMessageHandler mPrevious;
};
