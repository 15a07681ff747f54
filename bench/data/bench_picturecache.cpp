#include "benchpicture.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "support/bench.h"
#include "support/misbehavingserver.h"

#include <QEventLoop>
#include <QFile>
#include <QGuiApplication>
#include <QTemporaryDir>

#include <unistd.h>

namespace {

const int width = 1920, height = 1080;
const double pictureBytes = double(width) * height * 4;

int arrived = 0;

double residentBytes()
{
    QFile file("/proc/self/statm");
    if (!file.open(QIODevice::ReadOnly))
        qFatal("no figures of this process");
    return file.readAll().split(' ').at(1).toDouble() * double(sysconf(_SC_PAGESIZE));
}

// The system's own record of the most that was in use since it was reset.
void resetPeak()
{
    QFile file("/proc/self/clear_refs");
    if (!file.open(QIODevice::WriteOnly) || file.write("5") != 1)
        qFatal("the peak cannot be reset");
}

double peakBytes()
{
    QFile file("/proc/self/status");
    if (!file.open(QIODevice::ReadOnly))
        qFatal("no figures of this process");
    const QByteArray text = file.readAll();
    const int start = text.indexOf("VmHWM:") + 6;
    return text.mid(start, text.indexOf("kB", start) - start).trimmed().toDouble() * 1024;
}

void countArrival(QString &, ErrorCode code)
{
    if (code != NET_SUCCESS)
        qFatal("a picture failed with %d", code);
    ++arrived;
}

void download(const MisbehavingServer &server, int from, int count)
{
    arrived = 0;
    for (int i = from; i < from + count; ++i)
        PhotoManager::downloadPhoto(server.url("/p?" + QString::number(i)), &countArrival);
    QEventLoop loop;
    while (arrived < count)
        loop.processEvents(QEventLoop::WaitForMoreEvents);
}

void setCapacity(const QTemporaryDir &folder, int megabytes)
{
    const QString path = folder.filePath(QString("%1.ini").arg(megabytes));
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        qFatal("no configuration");
    file.write("[Max]\nCacheSize=" + QByteArray::number(megabytes) + "\n");
    file.close();
    SystemConfig::setConfigFile(path);
    PhotoManager::init();
}

std::string megabytes(double ours, double reference)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.1f MiB against %.1f MiB", ours / 1048576,
                  reference / 1048576);
    return text;
}

} // namespace

int main(int argc, char *argv[])
{
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QGuiApplication application(argc, argv);
    qInstallMessageHandler([](QtMsgType type, const QMessageLogContext &, const QString &line) {
        if (type == QtFatalMsg)
            std::fprintf(stderr, "%s\n", qPrintable(line));
    });
    SystemConfig::mScreen_Width = width;
    SystemConfig::mScreen_Height = height;
    QTemporaryDir folder;
    MisbehavingServer server;
    server.on("/p", MisbehavingServer::answer(photoJpeg(width, height)));

    const int filled = 20;
    setCapacity(folder, 200);
    download(server, 0, filled);
    PhotoManager::clearAll();
    const double before = residentBytes();
    download(server, 100, filled);
    const double growth = residentBytes() - before;
    bench::row("picture cache, growth while filling", growth / (filled * pictureBytes), 1.05,
               megabytes(growth, filled * pictureBytes));
    PhotoManager::clearAll();
    const double left = residentBytes() - before;
    bench::row("picture cache, left after clearing", left / growth, 0.1, megabytes(left, growth));

    const int capacity = 64;
    setCapacity(folder, capacity);
    const double base = residentBytes();
    resetPeak();
    download(server, 1000, 200);
    const double peak = peakBytes() - base;
    bench::row("picture cache, peak under churn", peak / (capacity * 1048576.0), 1.2,
               megabytes(peak, capacity * 1048576.0));
    return 0;
}
