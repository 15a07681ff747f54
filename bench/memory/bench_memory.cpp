// What 1,000 pages of the home screen leave behind: memory, handles and threads, against what the
// program held after the first 100.

#include "page/homescreen.h"
#include "support/bench.h"

#include <QDir>
#include <QFile>

namespace {

constexpr int PAGES = 40; // of the album, to and fro
constexpr int CACHE_MEGABYTES = 24;
constexpr int WARM = 100, TURNS = 1000;
constexpr int SAMPLES = 40; // turns before each reading: one way through the album

double statusValue(const char *name)
{
    QFile status(QStringLiteral("/proc/self/status"));
    if (!status.open(QIODevice::ReadOnly))
        return 0;
    for (const QByteArray &line : status.readAll().split('\n')) {
        if (line.startsWith(name))
            return line.mid(line.indexOf(':') + 1).trimmed().split(' ').first().toDouble();
    }
    return 0;
}

double handles()
{
    return QDir(QStringLiteral("/proc/self/fd")).entryList(QDir::AllEntries | QDir::System).size();
}

struct Usage
{
    double megabytes, handles, threads;
};

// Turns pages up to that number; the medians over the last of them.
Usage usageAfter(HomeScreen &screen, int &turned, int number)
{
    static bool forward = true;
    std::vector<double> megabytes, open, threads;
    while (turned < number) {
        if (forward ? screen.isLastPage() : screen.startIndex() == 1)
            forward = !forward;
        screen.turn(forward);
        screen.waitUntilIdle();
        if (++turned <= number - SAMPLES)
            continue;
        megabytes.push_back(statusValue("VmRSS") / 1024);
        open.push_back(handles());
        threads.push_back(statusValue("Threads"));
    }
    return {bench::median(megabytes), bench::median(open), bench::median(threads)};
}

std::string figures(double before, double after, const char *unit)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.1f %s after %d pages, %.1f after %d", before, unit, WARM,
                  after, TURNS);
    return text;
}

} // namespace

int main(int argc, char *argv[])
{
    HomeScreen screen(argc, argv, CACHE_MEGABYTES);
    screen.serve(PAGES);
    screen.open(screen.service().url());
    int turned = 0;
    const Usage before = usageAfter(screen, turned, WARM);
    const Usage after = usageAfter(screen, turned, TURNS);
    bench::row("memory growth over 900 pages, MiB", after.megabytes - before.megabytes, 2,
               figures(before.megabytes, after.megabytes, "MiB"));
    bench::row("open handles, likewise", after.handles / before.handles, 1,
               figures(before.handles, after.handles, "handles"));
    bench::row("threads, likewise", after.threads / before.threads, 1,
               figures(before.threads, after.threads, "threads"));
    return 0;
}
