#include "console.h"

#include <unistd.h>

#include <cstdio>

namespace {

constexpr int MAXIMUM_LINE = 4096; // bytes; nobody types that

} // namespace

Console::Console(QObject *parent)
    : QObject(parent)
    , mNotifier(STDIN_FILENO, QSocketNotifier::Read)
{
    connect(&mNotifier, &QSocketNotifier::activated, this, [this] { readInput(); });
}

void Console::print(const QString &line)
{
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
}

void Console::readInput()
{
    char buffer[1024];
    const ssize_t size = ::read(STDIN_FILENO, buffer, sizeof buffer);
    if (size <= 0) {
        // The shell goes on without an input: a service manager gives it none.
        mNotifier.setEnabled(false);
        return;
    }
    mUnfinished.append(buffer, int(size));
    for (int end = mUnfinished.indexOf('\n'); end >= 0; end = mUnfinished.indexOf('\n')) {
        const QString line = QString::fromUtf8(mUnfinished.left(end)).trimmed();
        mUnfinished.remove(0, end + 1);
        emit lineEntered(line);
    }
    if (mUnfinished.size() > MAXIMUM_LINE)
        mUnfinished.clear();
}
