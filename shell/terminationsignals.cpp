#include "terminationsignals.h"

#include <sys/signalfd.h>

#include <csignal>

namespace {

int blockedSignals()
{
    sigset_t signalSet;
    ::sigemptyset(&signalSet);
    ::sigaddset(&signalSet, SIGINT);
    ::sigaddset(&signalSet, SIGTERM);
    ::pthread_sigmask(SIG_BLOCK, &signalSet, nullptr);
    return ::signalfd(-1, &signalSet, SFD_CLOEXEC | SFD_NONBLOCK);
}

} // namespace

TerminationSignals::TerminationSignals(QObject *parent)
    : QObject(parent)
    , mSignals(blockedSignals())
    , mNotifier(mSignals.get(), QSocketNotifier::Read)
{
    connect(&mNotifier, &QSocketNotifier::activated, this, [this] {
        mNotifier.setEnabled(false);
        emit terminated();
    });
}
