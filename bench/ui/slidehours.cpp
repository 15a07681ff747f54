// Hours of play: 10,000 turns through real photos, as fast as this machine can have them ready.
// Whether memory, handles and threads stay what they were after the first 1,000, and how late the
// latest photo was painted. Takes the folder of photos, and how many turns if not 10,000.

#include "support/bench.h"
#include "ui/slidescene.h"
#include "ui/slidesetting.h"

#include <QDir>
#include <QElapsedTimer>

#include <algorithm>
#include <ctime>

namespace {

constexpr int kTurns = 10000, kWarmUp = 1000;
constexpr int kSamples = 500;     // turns over which memory is read
constexpr double kLateness = 100; // milliseconds that a photo may be late
constexpr double kFlat = 1.2;     // one connection more at a time is no growth
constexpr double kBudget = 2;     // times what a photo takes: the length of a turn

double statusValue(const char *name)
{
    QFile status(QStringLiteral("/proc/self/status"));
    status.open(QIODevice::ReadOnly);
    for (const QByteArray &line : status.readAll().split('\n')) {
        if (line.startsWith(name))
            return line.mid(line.indexOf(':') + 1).trimmed().split(' ').first().toDouble();
    }
    return 0;
}

struct Usage
{
    std::vector<double> megabytes, handles, threads;

    void read()
    {
        const QDir open(QStringLiteral("/proc/self/fd"));
        megabytes.push_back(statusValue("VmRSS") / 1024);
        handles.push_back(open.entryList(QDir::AllEntries | QDir::System).size());
        threads.push_back(statusValue("Threads"));
    }
};

bool isNextReady(const SlideScene &scene)
{
    return scene.isPrepared(scene.player()->position() + 1);
}

// What it takes to fetch, decode and fit a photo, in milliseconds.
double photoCost(SlideScene &scene)
{
    std::vector<double> costs;
    for (int i = 0; i < 40; ++i) {
        QElapsedTimer time;
        time.start();
        scene.player()->update();
        SlideScene::waitFor([&] { return scene.showsPhoto() && isNextReady(scene); });
        costs.push_back(time.nsecsElapsed() / 1e6);
    }
    return bench::median(costs);
}

// Of this process, in milliseconds.
double processorTime()
{
    timespec time = {};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
    return double(time.tv_sec) * 1e3 + double(time.tv_nsec) / 1e6;
}

struct Lateness
{
    std::vector<double> waited; // milliseconds from the end of the turn to the photo
    std::vector<double> worked; // of the processor, likewise: what other programs do is left out
};

// Ends the turn when its time is over.
void turn(SlideScene &scene, QElapsedTimer &clock, double length, Lateness &late)
{
    double before = processorTime();
    while (clock.elapsed() < length) {
        before = processorTime();
        QCoreApplication::processEvents(QEventLoop::AllEvents, 1);
    }
    const double tooLate = clock.nsecsElapsed() / 1e6 - length;
    clock.start();
    scene.player()->update();
    while (!scene.showsPhoto())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
    late.waited.push_back(tooLate + clock.nsecsElapsed() / 1e6);
    late.worked.push_back(processorTime() - before);
    scene.forgetRequests();
}

std::string figures(double before, double after, const char *unit)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.1f %s before, %.1f after", before, unit, after);
    return text;
}

void reportUsage(const Usage &before, const Usage &after)
{
    const double memory = bench::median(before.megabytes), now = bench::median(after.megabytes);
    bench::row("memory growth from the 1,000th turn of a slide show on, MiB", now - memory, 2,
               figures(memory, now, "MiB"));
    const double handles = bench::median(before.handles), open = bench::median(after.handles);
    bench::row("open handles, likewise", open / handles, kFlat, figures(handles, open, "handles"));
    const double threads = bench::median(before.threads), run = bench::median(after.threads);
    bench::row("threads, likewise", run / threads, kFlat, figures(threads, run, "threads"));
}

void reportLateness(const char *what, std::vector<double> times, double length)
{
    std::sort(times.begin(), times.end());
    const auto late = times.end() - std::upper_bound(times.begin(), times.end(), kLateness);
    char note[160];
    std::snprintf(note, sizeof note, "%.0f ms, median %.1f ms; %d of %d turns of %.0f ms are later",
                  times.back(), bench::median(times), int(late), int(times.size()), length);
    bench::row(what, times.back() / kLateness, 1, note);
}

} // namespace

int main(int argc, char **argv)
{
    SlideScene scene(argc, argv,
                     "Loop=true\nAhead=3\nBlurredFill=true\nCaption=BottomLeft\nClock=TopRight\n");
    SlideSetting::SlideSpeed = 3600; // a turn ends when the benchmark says so
    const QDir folder(argc > 1 ? QString::fromLocal8Bit(argv[1]) : QString());
    QStringList files;
    for (const QString &name : folder.entryList({QStringLiteral("*.jpg")}, QDir::Files))
        files << folder.filePath(name);
    if (files.isEmpty())
        return std::puts("slidehours FOLDER"), 1;
    scene.serveFiles(files.size(), files);
    scene.open(0, true);

    const int turns = argc > 2 ? qMax(kWarmUp + 2 * kSamples, atoi(argv[2])) : kTurns;
    const double length = kBudget * photoCost(scene);
    Usage before, after;
    Lateness late;
    QElapsedTimer clock;
    clock.start();
    for (int i = 0; i < turns; ++i) {
        turn(scene, clock, length, late);
        if (i >= kWarmUp && i < kWarmUp + kSamples)
            before.read();
        else if (i >= turns - kSamples)
            after.read();
    }
    reportUsage(before, after);
    reportLateness("latest photo against 100 ms", late.waited, length);
    reportLateness("processor time for it against 100 ms", late.worked, length);
    return 0;
}
