// Hours of play: 10,000 turns through real photos, as fast as this machine can have them ready.
// Whether memory, handles and threads stay what they were after the first 1,000, and how late the
// latest photo was painted. Takes the folder of photos.

#include "support/bench.h"
#include "ui/slidescene.h"
#include "ui/slidesetting.h"

#include <QDir>
#include <QElapsedTimer>

namespace {

constexpr int kTurns = 10000, kWarmUp = 1000;
constexpr int kSamples = 500;     // turns over which memory is read
constexpr double kLateness = 100; // milliseconds that a photo may be late
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

// Ends the turn when its time is over. How late the next photo was there, in milliseconds.
double turn(SlideScene &scene, QElapsedTimer &clock, double length)
{
    while (clock.elapsed() < length)
        QCoreApplication::processEvents(QEventLoop::AllEvents, 1);
    const double tooLate = clock.nsecsElapsed() / 1e6 - length;
    QElapsedTimer time;
    time.start();
    clock.start();
    scene.player()->update();
    while (!scene.showsPhoto())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
    scene.forgetRequests();
    return tooLate + time.nsecsElapsed() / 1e6;
}

std::string figures(double before, double after, const char *unit)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.1f %s after %d turns, %.1f after %d", before, unit, kWarmUp,
                  after, kTurns);
    return text;
}

void report(const Usage &before, const Usage &after)
{
    const double memory = bench::median(before.megabytes), now = bench::median(after.megabytes);
    bench::row("memory growth over 9,000 turns of a slide show, MiB", now - memory, 2,
               figures(memory, now, "MiB"));
    const double handles = bench::median(before.handles), open = bench::median(after.handles);
    bench::row("open handles, likewise", open / handles, 1, figures(handles, open, "handles"));
    const double threads = bench::median(before.threads), run = bench::median(after.threads);
    bench::row("threads, likewise", run / threads, 1, figures(threads, run, "threads"));
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

    const double length = kBudget * photoCost(scene);
    Usage before, after;
    std::vector<double> lateness;
    QElapsedTimer clock;
    clock.start();
    for (int i = 0; i < kTurns; ++i) {
        lateness.push_back(turn(scene, clock, length));
        if (i >= kWarmUp && i < kWarmUp + kSamples)
            before.read();
        else if (i >= kTurns - kSamples)
            after.read();
    }
    report(before, after);
    const auto isLate = [](double milliseconds) { return milliseconds > kLateness; };
    const double latest = *std::max_element(lateness.begin(), lateness.end());
    char note[160];
    std::snprintf(note, sizeof note, "%.0f ms; %d turns of %.0f ms, %d later than %.0f ms", latest,
                  kTurns, length, int(std::count_if(lateness.begin(), lateness.end(), isLate)),
                  kLateness);
    bench::row("latest photo against 100 ms", latest / kLateness, 1, note);
    return 0;
}
