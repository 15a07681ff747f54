#include "app/exitdeadline.h"

#include <sys/time.h>
#include <unistd.h>

#include <csignal>

namespace {

constexpr suseconds_t DEADLINE_MICROSECONDS = 700000;

volatile std::sig_atomic_t pendingExitCode = 0;

void endProcess(int)
{
    ::_exit(pendingExitCode);
}

} // namespace

void startExitDeadline(int exitCode)
{
    pendingExitCode = exitCode;
    std::signal(SIGALRM, endProcess);
    itimerval deadline = {};
    deadline.it_value.tv_usec = DEADLINE_MICROSECONDS;
    ::setitimer(ITIMER_REAL, &deadline, nullptr);
}
