// bench_start OURS REFERENCE: from the start of each program to its first painted frame, and what
// memory it then holds. Needs an X screen with a white background and nothing else on it: the
// frame is there when the middle of the screen is white no longer.

#include "support/bench.h"

#include <QElapsedTimer>
#include <QFile>
#include <QGuiApplication>
#include <QPixmap>
#include <QProcess>
#include <QRegularExpression>
#include <QScreen>
#include <QThread>

#include <cstdlib>

namespace {

constexpr int ROUNDS = 15;
constexpr int PATIENCE_MS = 20000;
constexpr int SETTLE_MS = 300; // until what follows the first frame is in memory, too

struct Start
{
    double seconds;
    double megabytes;
};

bool isWhite()
{
    QScreen *screen = QGuiApplication::primaryScreen();
    const QPoint middle = screen->geometry().center();
    const QImage pixel = screen->grabWindow(0, middle.x(), middle.y(), 1, 1).toImage();
    return pixel.pixelColor(0, 0) == QColor(Qt::white);
}

void waitUntil(bool white, const char *what)
{
    QElapsedTimer timer;
    timer.start();
    while (isWhite() != white) {
        if (timer.elapsed() > PATIENCE_MS) {
            std::fprintf(stderr, "bench_start: %s\n", what);
            std::exit(1);
        }
        QThread::usleep(500);
    }
}

double residentMegabytes(qint64 process)
{
    QFile status(QStringLiteral("/proc/%1/status").arg(process));
    if (!status.open(QIODevice::ReadOnly))
        return 0;
    static const QRegularExpression line(QStringLiteral("VmRSS:\\s+(\\d+)"));
    return line.match(QString::fromLatin1(status.readAll())).captured(1).toDouble() / 1024;
}

Start start(const QString &program)
{
    QProcess process;
    process.setStandardOutputFile(QProcess::nullDevice());
    process.setStandardErrorFile(QProcess::nullDevice());
    const double seconds = bench::seconds([&] {
        process.start(program, QStringList());
        waitUntil(false, "no frame was painted");
    });
    QThread::msleep(SETTLE_MS);
    const double megabytes = residentMegabytes(process.processId());
    process.kill();
    process.waitForFinished();
    waitUntil(true, "the screen does not become free");
    return {seconds, megabytes};
}

std::string figures(double ours, double reference, const char *unit)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.1f %s against %.1f %s", ours, unit, reference, unit);
    return text;
}

} // namespace

int main(int argc, char *argv[])
{
    QGuiApplication application(argc, argv);
    if (argc != 3) {
        std::fprintf(stderr, "usage: bench_start OURS REFERENCE\n");
        return 2;
    }
    std::vector<double> timeRatios, memoryRatios, times, emptyTimes, sizes, emptySizes;
    for (int round = -1; round < ROUNDS; ++round) {
        const Start ours = start(QString::fromLocal8Bit(argv[1]));
        const Start empty = start(QString::fromLocal8Bit(argv[2]));
        if (round < 0)
            continue;
        timeRatios.push_back(ours.seconds / empty.seconds);
        memoryRatios.push_back(ours.megabytes / empty.megabytes);
        times.push_back(ours.seconds * 1e3);
        emptyTimes.push_back(empty.seconds * 1e3);
        sizes.push_back(ours.megabytes);
        emptySizes.push_back(empty.megabytes);
    }
    using bench::median;
    bench::row("start to the first frame, against an empty full-screen program", median(timeRatios),
               1.3, figures(median(times), median(emptyTimes), "ms"));
    bench::row("resident memory after the start, against the same", median(memoryRatios), 1.4,
               figures(median(sizes), median(emptySizes), "MiB"));
    return 0;
}
