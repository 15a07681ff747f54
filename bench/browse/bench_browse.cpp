// An album of 10,000 photos: how long until its first page is seen, whether a key that is held
// drops presses or frames, how fast a photo opens, and what the whole album leaves in memory.
//
//   bench_browse [PHOTOS]

#include "accountmanager/accountmanagerhelper.h"
#include "common/ui/remotekeys.h"
#include "data/benchpicture.h"
#include "network/jsonparser.h"
#include "page/homescreen.h"
#include "support/bench.h"
#include "ui/detailstage.h"
#include "ui/homewidget.h"
#include "ui/picturedetailwidget.h"

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QEventLoop>
#include <QFile>
#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QThread>

namespace {

constexpr int PHOTOS = 10000, PER_PAGE = 8;
constexpr int CACHE_MEGABYTES = 96;
constexpr int REPEAT_MS = 33; // of a key that is held
constexpr int HELD_PAGES = 100, OPENINGS = 15;
constexpr double FRAME = 0.05; // seconds; no frame may take longer

double residentMegabytes()
{
    QFile status(QStringLiteral("/proc/self/status"));
    if (!status.open(QIODevice::ReadOnly))
        return 0;
    for (const QByteArray &line : status.readAll().split('\n')) {
        if (line.startsWith("VmRSS:"))
            return line.mid(6).trimmed().split(' ').first().toDouble() / 1024;
    }
    return 0;
}

std::string figures(const char *format, double first, double second)
{
    char text[120];
    std::snprintf(text, sizeof text, format, first, second);
    return text;
}

// Over a connection that stays open.
QByteArray fetched(const QString &url)
{
    static QNetworkAccessManager manager;
    const std::unique_ptr<QNetworkReply> reply(manager.get(QNetworkRequest(url)));
    QObject::connect(reply.get(), &QNetworkReply::sslErrors, reply.get(),
                     [&](const QList<QSslError> &) { reply->ignoreSslErrors(); });
    QEventLoop loop;
    QObject::connect(reply.get(), &QNetworkReply::finished, &loop, &QEventLoop::quit);
    loop.exec();
    return reply->error() == QNetworkReply::NoError ? reply->readAll() : QByteArray();
}

// From Select to the last picture of the first page, against fetching the feed and making records
// of its text.
void measureOpening(HomeScreen &screen)
{
    std::vector<double> ours, theirs, ratios;
    for (int round = 0; round < 5; ++round) {
        screen.open(screen.service().url());
        screen.openAlbums();
        HomeScreen::forgetPictures();
        ours.push_back(bench::seconds([&] {
            screen.press(DEVICE_SELECT_KEY);
            screen.waitUntilShown();
        }));
        const PackageProperty album = HomeWidget::mWidgetInst->state().mCurrentProperty;
        const QString url =
            screen.service().url() +
            QStringLiteral("/data/feed/api/user/%1/albumid/%2?access_token=%3&alt=json")
                .arg(album.mUserId, album.mAlbumId, AccountManagerHelper::getAccessToken());
        int entries = 0;
        theirs.push_back(bench::seconds([&] {
            const JsonObject feed = JsonParser::parse(fetched(url));
            entries = feed.value(QStringLiteral("feed")).toHash().size();
        }));
        if (entries == 0)
            qFatal("the album's feed does not come");
        ratios.push_back(ours.back() / theirs.back());
    }
    bench::row(
        "album of 10,000, Select to first page, against fetching and parsing its feed",
        bench::median(ratios), 1.5,
        figures("%.0f ms against %.0f ms", bench::median(ours) * 1e3, bench::median(theirs) * 1e3));
}

// A key held from the first page on: every press turns a page, however fast the pictures come.
void measureHeldKey(HomeScreen &screen)
{
    const int first = screen.startIndex();
    double longest = 0;
    for (int press = 0; press < HELD_PAGES; ++press) {
        QDeadlineTimer next(REPEAT_MS, Qt::PreciseTimer);
        longest = std::max(longest, bench::seconds([&] {
                               screen.turn(true);
                               QCoreApplication::processEvents();
                           }));
        while (!next.hasExpired()) {
            longest = std::max(longest, bench::seconds([] { QCoreApplication::processEvents(); }));
            QThread::usleep(500);
        }
    }
    const int turned = (screen.startIndex() - first) / PER_PAGE;
    bench::row("held key through 100 pages: presses without a page", HELD_PAGES - turned + 1, 1,
               figures("%.0f of %.0f pages (1 is none)", turned, HELD_PAGES));
    bench::row("held key through 100 pages: longest frame, against 50 ms", longest / FRAME, 1,
               figures("%.1f ms against %.0f ms", longest * 1e3, FRAME * 1e3));
}

// From Select to the large photo on the screen, against fetching the same file and decoding it to
// the same size.
void measurePhoto(HomeScreen &screen)
{
    const auto *stage = HomeWidget::mWidgetInst->findChild<DetailStage *>();
    const auto *detail = HomeWidget::mWidgetInst->findChild<PictureDetailWidget *>();
    std::vector<double> ours, theirs, ratios;
    for (int round = 0; round < OPENINGS; ++round) {
        HomeScreen::forgetPictures();
        ours.push_back(bench::seconds([&] {
            screen.press(DEVICE_SELECT_KEY);
            HomeScreen::handleEventsUntil([&] { return !stage->picture().isNull(); });
        }));
        const QString url = detail->photo().imageUrl;
        const QSize size = stage->picture().size();
        screen.press(DEVICE_RETURN_KEY);
        screen.waitUntilShown();
        bool isDecoded = false;
        theirs.push_back(bench::seconds([&] {
            const QImage image = QImage::fromData(fetched(url));
            isDecoded = !image.scaled(size, Qt::KeepAspectRatio, Qt::SmoothTransformation).isNull();
        }));
        if (!isDecoded)
            qFatal("the large photo does not come");
        ratios.push_back(ours.back() / theirs.back());
    }
    bench::row(
        "photo, Select to painted, against fetching and decoding the file", bench::median(ratios),
        1.5,
        figures("%.1f ms against %.1f ms", bench::median(ours) * 1e3, bench::median(theirs) * 1e3));
}

// The cache for pictures is full long before the end.
void measureMemory(HomeScreen &screen)
{
    screen.open(screen.service().url());
    screen.openAlbums();
    screen.press(DEVICE_SELECT_KEY);
    screen.waitUntilShown();
    const double before = residentMegabytes();
    while (!screen.isLastPage()) {
        screen.turn(true);
        screen.waitUntilShown();
    }
    const double after = residentMegabytes();
    bench::row("memory after every photo of the album was seen, against the cache for pictures",
               (after - before) / CACHE_MEGABYTES, 1.2,
               figures("%.1f MiB more than %.1f MiB", after - before, before));
}

} // namespace

int main(int argc, char *argv[])
{
    HomeScreen screen(argc, argv, CACHE_MEGABYTES);
    const int photos = argc > 1 ? std::atoi(argv[1]) : PHOTOS;
    screen.serve(photos / PER_PAGE, photoJpeg(1920, 1080), {160, 120});
    const JsonObject tokens = JsonParser::parse(screen.service().tokens(HomeScreen::user()));
    AccountManagerHelper::setAccessToken(JsonParser::string(tokens, "access_token"));
    measureOpening(screen);
    measurePhoto(screen);
    measureHeldKey(screen);
    measureMemory(screen);
    return 0;
}
