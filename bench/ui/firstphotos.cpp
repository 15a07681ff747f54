// From the start of a process to eight thumbnails and a photo on its screen, saved as a picture,
// and the most memory that it held meanwhile: ours, signed in, against headless Chromium with a
// page of the same pictures from the same server. With an address and a picture's name it is the
// process.

#include "accountmanager/accountmanagerhelper.h"
#include "app/fontsetup.h"
#include "benchpicture.h"
#include "data/download.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "res/resources.h"
#include "support/bench.h"
#include "support/misbehavingserver.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"
#include "ui/samplefeeds.h"
#include "ui/widget.h"

#include <QApplication>
#include <QDir>
#include <QEventLoop>
#include <QFile>
#include <QFontDatabase>
#include <QJsonArray>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QTimer>

#include <sys/resource.h>

#include <algorithm>

namespace {

constexpr int kThumbnails = 8;
constexpr int kRounds = 5; // for the time, and as many for the memory
constexpr int kSampleMs = 100;

// --- The process.

// Without the pauses that a test's waiting makes.
template <typename Condition>
void waitFor(Condition condition)
{
    QTimer patience;
    QObject::connect(&patience, &QTimer::timeout, [] { qFatal("the pictures do not come"); });
    patience.start(20000);
    while (!condition())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
}

int showPictures(const QString &service, const QString &picture)
{
    QTemporaryDir folder;
    QFile settings(folder.filePath("config.ini"));
    settings.open(QIODevice::WriteOnly);
    settings.write("[Max]\nCacheSize=96\n[SlideShow]\nSharpen=true\n[Service]\nFeedBase=" +
                   service.toUtf8() + '\n');
    settings.close();
    SystemConfig::setConfigFile(settings.fileName());
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    SystemConfig::setScale(qApp->devicePixelRatio());
    const int font = QFontDatabase::addApplicationFont(ORVALA_FONT_FILE);
    QApplication::setFont(QFont(QFontDatabase::applicationFontFamilies(font).value(0), 12));
    PhotoManager::init();
    AccountManagerHelper::setAccessToken("token");

    Widget page;
    page.setGeometry(0, 0, 1280, 720);
    page.show();
    waitFor(
        [&] { return !page.homeScreen()->isLoading() && Download::mHomeLabelUrlHash.isEmpty(); });
    page.repaint();
    emit page.homeScreen()->slideShow(0);
    waitFor([] { return Download::mPhotoSlideShowUrlHash.isEmpty(); });
    if (!page.player()->label()->placeholder().isEmpty())
        return 1;
    return page.grab().save(picture) ? 0 : 1;
}

// --- The benchmark.

void serve(MisbehavingServer &server)
{
    const QByteArray thumbnail = photoJpeg(420, 300), photo = photoJpeg(1680, 945);
    QJsonArray photos;
    QByteArray page("<body style='margin:0'>");
    for (int i = 0; i < kThumbnails; ++i) {
        const QString name = QString("/p%1.jpg").arg(i);
        photos << sample::photo("Photo", server.url(name));
        server.on(name.toUtf8(), MisbehavingServer::answer(thumbnail));
        server.on("/s0" + name.toUtf8(), MisbehavingServer::answer(photo));
        page += "<img src='" + name.toUtf8() + "' width=210>";
    }
    page += "<img src='/s0/p0.jpg' style='width:100%'>";
    server.on("/data/feed/api/featured",
              MisbehavingServer::answer(sample::feed(photos, kThumbnails)));
    server.on("/page", MisbehavingServer::answer(page, 200, {{"Content-Type", "text/html"}}));
}

QByteArray contentOf(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

// The processes that descend from this one, itself included.
QList<qint64> family(qint64 process)
{
    QMultiHash<qint64, qint64> children;
    for (const QString &name : QDir("/proc").entryList({"[0-9]*"}, QDir::Dirs)) {
        const QByteArray stat = contentOf("/proc/" + name + "/stat");
        children.insert(stat.mid(stat.lastIndexOf(')') + 4).split(' ').value(0).toLongLong(),
                        name.toLongLong());
    }
    QList<qint64> members{process};
    for (int i = 0; i < members.size(); ++i)
        members += children.values(members.at(i));
    return members;
}

// What pages they share is counted once.
double megabytes(const QList<qint64> &processes)
{
    double sum = 0;
    for (qint64 process : processes) {
        const QByteArray sizes = contentOf(QString("/proc/%1/smaps_rollup").arg(process));
        const QByteArray line = sizes.mid(sizes.indexOf("\nPss:") + 5);
        sum += line.left(line.indexOf('k')).trimmed().toDouble() / 1024;
    }
    return sum;
}

// Of all the processes that have ended.
double processorSeconds()
{
    rusage usage = {};
    getrusage(RUSAGE_CHILDREN, &usage);
    return double(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           double(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
}

struct Run
{
    double seconds, processorSeconds, megabytes;
};

// Looking at the memory takes time: a run tells one or the other.
Run run(const QString &program, const QStringList &arguments, const QString &picture,
        bool isMeasuringMemory)
{
    QFile::remove(picture);
    QProcess process;
    process.setStandardErrorFile(QProcess::nullDevice());
    process.setStandardOutputFile(QProcess::nullDevice());
    double most = 0;
    QTimer sampler;
    QObject::connect(&sampler, &QTimer::timeout, &process, [&] {
        if (process.processId() > 0)
            most = std::max(most, megabytes(family(process.processId())));
    });
    QEventLoop loop;
    QObject::connect(&process, qOverload<int, QProcess::ExitStatus>(&QProcess::finished), &loop,
                     &QEventLoop::quit);
    if (isMeasuringMemory)
        sampler.start(kSampleMs);
    const double before = processorSeconds();
    const double seconds = bench::seconds([&] {
        process.start(program, arguments);
        loop.exec();
    });
    if (!QFile::exists(picture))
        qFatal("%s shows nothing", qPrintable(program));
    return {seconds, processorSeconds() - before, most};
}

std::string figures(const std::vector<double> &ours, const std::vector<double> &theirs,
                    const char *unit)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.0f %s against %.0f %s", bench::median(ours), unit,
                  bench::median(theirs), unit);
    return text;
}

int compare(const QString &self, const QString &chromium)
{
    MisbehavingServer server;
    serve(server);
    QTemporaryDir folder;
    const QString picture = folder.filePath("screen.jpeg");
    std::vector<double> times, theirTimes, work, theirWork, sizes, theirSizes;
    for (int round = -1; round < 2 * kRounds; ++round) { // the first warms the files up
        const bool isMemory = round >= kRounds;
        const Run ours = run(self, {server.url(QString()), picture}, picture, isMemory);
        const Run theirs =
            run(chromium,
                {"--headless", "--no-sandbox", "--disable-gpu", "--window-size=1920,1080",
                 "--hide-scrollbars", "--no-first-run", "--disable-background-networking",
                 "--user-data-dir=" + folder.filePath("profile"), "--screenshot=" + picture,
                 server.url("/page")},
                picture, isMemory);
        if (round < 0)
            continue;
        if (isMemory) {
            sizes.push_back(ours.megabytes);
            theirSizes.push_back(theirs.megabytes);
        } else {
            times.push_back(ours.seconds * 1e3);
            theirTimes.push_back(theirs.seconds * 1e3);
            work.push_back(ours.processorSeconds * 1e3);
            theirWork.push_back(theirs.processorSeconds * 1e3);
        }
    }
    bench::row("process start to eight thumbnails and a photo, against headless Chromium",
               bench::median(times) / bench::median(theirTimes), 0.15,
               figures(times, theirTimes, "ms"));
    bench::row("time of the processors for it, against the same",
               bench::median(work) / bench::median(theirWork), 0, figures(work, theirWork, "ms"));
    bench::row("memory meanwhile, against the same",
               bench::median(sizes) / bench::median(theirSizes), 0.12,
               figures(sizes, theirSizes, "MiB"));
    return 0;
}

} // namespace

int main(int argc, char **argv)
{
    qInstallMessageHandler([](QtMsgType type, const QMessageLogContext &, const QString &line) {
        if (type == QtFatalMsg)
            std::fprintf(stderr, "%s\n", qPrintable(line));
    });
    if (argc == 3) {
        FontSetup fonts;
        QApplication application(argc, argv);
        fonts.finish();
        initResources();
        return showPictures(QString::fromLocal8Bit(argv[1]), QString::fromLocal8Bit(argv[2]));
    }
    QCoreApplication application(argc, argv);
    const QString chromium = QStandardPaths::findExecutable(QStringLiteral("chromium"));
    if (chromium.isEmpty()) {
        std::puts("process start to eight thumbnails and a photo: Chromium is not installed");
        return 0;
    }
    return compare(QCoreApplication::applicationFilePath(), chromium);
}
