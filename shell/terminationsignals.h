#pragma once

#include "platform/filedescriptor.h"

#include <QObject>
#include <QSocketNotifier>

// Turns SIGINT and SIGTERM into a Qt signal. To be made after the application object
// and before any thread.
class TerminationSignals : public QObject
{
    Q_OBJECT

public:
    explicit TerminationSignals(QObject *parent = nullptr);

signals:
    void terminated();

private:
    FileDescriptor mSignals;
    QSocketNotifier mNotifier;
};
