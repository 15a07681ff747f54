// The share of one core that a slide show takes while it plays at 5 seconds a photo. Takes the
// folder of photos, what the row is called, the seconds, and settings of the slide show as
// KEY=VALUE.

#include "support/bench.h"
#include "ui/slidescene.h"
#include "ui/slidesetting.h"

#include <QDir>

#include <sys/resource.h>

namespace {

constexpr int kTurnSeconds = 5;

double processorSeconds()
{
    rusage usage = {};
    getrusage(RUSAGE_SELF, &usage);
    return double(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           double(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
}

std::string figures(double share, int turns, bool hasStopped)
{
    char text[120];
    std::snprintf(text, sizeof text, "%.1f %%, %d photos, %dp%s", share * 100, turns,
                  SlideScene::screen().height(),
                  hasStopped ? "; too slow for motion, which ended itself" : "");
    return text;
}

} // namespace

int main(int argc, char **argv)
{
    if (argc < 4)
        return std::puts("slideload FOLDER NAME SECONDS [KEY=VALUE...]"), 1;
    QByteArray settings("Loop=true\n");
    for (int i = 4; i < argc; ++i)
        settings += QByteArray(argv[i]) + '\n';
    const QDir folder(QString::fromLocal8Bit(argv[1]));
    const std::string name = argv[2];
    const int seconds = QByteArray(argv[3]).toInt();
    SlideScene scene(argc, argv, settings);
    QStringList files;
    for (const QString &file : folder.entryList({QStringLiteral("*.jpg")}, QDir::Files))
        files << folder.filePath(file);
    scene.serveFiles(files.size(), files);
    SlideSetting::SlideSpeed = kTurnSeconds;
    scene.open(0, true);

    QTest::qWait(kTurnSeconds * 1000); // the first photo fetches more than one
    const int first = scene.player()->position();
    const double before = processorSeconds();
    QTest::qWait(seconds * 1000);
    const double share = (processorSeconds() - before) / seconds;
    const int turns = scene.player()->position() - first;
    const bool isMoving = scene.player()->label()->isMoving();
    bench::row("share of one core while playing at 5 s a photo, " + name, share, 0,
               figures(share, turns, settings.contains("Motion") && !isMoving));
    return 0;
}
