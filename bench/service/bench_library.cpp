#include "photolibrary.h"
#include "support/bench.h"

#include "base/texts.h"
#include "feeds/feedwriter.h"
#include "index/database.h"
#include "index/featureddeck.h"
#include "index/tokens.h"
#include "index/users.h"
#include "pictures/photometadata.h"
#include "scan/scanner.h"
#include "service.h"

#include <fcntl.h>
#include <httplib.h>
#include <spdlog/spdlog.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vips/vips.h>

#include <atomic>
#include <filesystem>
#include <thread>

// The album service with 100,000 photos (or as many as the first argument says): the first scan
// against what it cannot do without, answers while it runs, the scan after a restart, search, feeds
// and the deck of featured photos. Times are told in units of what they may be, as the table wants.
namespace {

namespace fs = std::filesystem;

constexpr int rounds = 5;
const std::string feedBase = "/data/feed/api/";

// What the processor did for it stays the same on a machine that does other things too.
struct Span
{
    double seconds;
    double processor;
};

double processorSeconds()
{
    timespec time{};
    ::clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

Span spanOf(const bench::Work &work)
{
    const double start = processorSeconds();
    const double seconds = bench::seconds(work);
    return {seconds, processorSeconds() - start};
}

double longest(const std::vector<Span> &spans, double Span::*part)
{
    double most = 0;
    for (const Span &span : spans)
        most = std::max(most, span.*part);
    return most;
}

std::string told(const std::vector<Span> &spans)
{
    std::vector<double> seconds;
    seconds.reserve(spans.size());
    for (const Span &span : spans)
        seconds.push_back(span.seconds);
    char text[120];
    std::snprintf(text, sizeof text, "%.1f ms, longest %.1f ms; of the processor %.1f ms",
                  bench::median(seconds) * 1e3, longest(spans, &Span::seconds) * 1e3,
                  longest(spans, &Span::processor) * 1e3);
    return text;
}

std::string told(const Span &ours, const Span &reference)
{
    char text[120];
    std::snprintf(text, sizeof text,
                  "%.1f s against %.1f s; of the processor %.1f s against %.1f s", ours.seconds,
                  reference.seconds, ours.processor, reference.processor);
    return text;
}

template <typename Each>
void walk(const std::string &folder, Each each)
{
    for (const auto &entry : fs::recursive_directory_iterator(folder)) {
        struct stat status
        {
        };
        if (::stat(entry.path().c_str(), &status) != 0)
            std::abort();
        if (S_ISREG(status.st_mode))
            each(entry.path().string());
    }
}

void readStart(const std::string &path)
{
    static char bytes[4096];
    const int file = ::open(path.c_str(), O_RDONLY);
    if (::read(file, bytes, sizeof bytes) <= 0)
        std::abort();
    ::close(file);
}

void readMetadata(const std::string &path)
{
    if (!readPhotoMetadata(path, nullptr))
        std::abort();
}

class Library
{
public:
    Library(const fs::path &folder, int photos)
        : mPhotos({folder / "photos", photos})
    {
        fs::create_directories(mPhotos.folder);
        writePhotos(mPhotos);
        mSettings.data = folder / "data";
        mSettings.withTls = false;
        std::string error;
        const auto database = openIndex(mSettings.data, &error);
        saveUser(*database, {0, "bench@orvala.example", "Bench", mPhotos.folder});
        mToken = issueTokens(*database, 1, 3600).access;
    }

    void start()
    {
        mService.reset();
        std::string error;
        mService = Service::start(mSettings, &error);
        if (!mService)
            std::abort();
        mClient = std::make_unique<httplib::Client>("127.0.0.1", mService->port());
        mClient->set_keep_alive(true);
        mClient->set_tcp_nodelay(true);
    }
    Service &service() { return *mService; }
    const PhotoLibrary &photos() const { return mPhotos; }

    // Until the answer is there.
    Span ask(const std::string &feed)
    {
        return spanOf([&] {
            const auto answer = mClient->Get(feedBase + feed);
            if (!answer || answer->status != 200)
                std::abort(); // a failed request would be a fast one
        });
    }
    std::vector<Span> askOften(const std::vector<std::string> &feeds)
    {
        std::vector<Span> spans;
        for (int round = 0; round < rounds; ++round) {
            for (const std::string &feed : feeds)
                spans.push_back(ask(feed));
        }
        return spans;
    }
    std::string own(const std::string &feed) const
    {
        return "user/default" + feed + (feed.find('?') == std::string::npos ? "?" : "&") +
               "access_token=" + mToken;
    }

private:
    PhotoLibrary mPhotos;
    ServiceSettings mSettings;
    std::string mToken;
    std::unique_ptr<Service> mService;
    std::unique_ptr<httplib::Client> mClient;
};

// The longest time is told in units of `limit` seconds.
void tell(const std::string &what, const std::vector<Span> &spans, double limit)
{
    bench::row(what, longest(spans, &Span::seconds) / limit, 1, told(spans));
}

void measureFirstScan(Library &library)
{
    const Span bare = spanOf([&] { walk(library.photos().folder, readStart); });
    const Span metadata = spanOf([&] { walk(library.photos().folder, readMetadata); });
    std::atomic<bool> isDone{false};
    std::vector<Span> answers;
    const Span scan = spanOf([&] {
        library.start();
        std::thread asking([&] {
            while (!isDone) {
                answers.push_back(library.ask("featured?max-results=8"));
                answers.push_back(library.ask(library.own("?max-results=8")));
                std::this_thread::sleep_for(std::chrono::milliseconds(50));
            }
        });
        library.service().scanner().scanAndWait();
        isDone = true;
        asking.join();
    });
    bench::row("first scan / walk that reads each photo's metadata",
               scan.seconds / metadata.seconds, 1.5, told(scan, metadata));
    bench::row("first scan / walk that reads each file's first 4 KiB", scan.seconds / bare.seconds,
               0, told(scan, bare));
    tell("feeds while the first scan runs, units of 250 ms", answers, 0.25);
}

void measureRestart(Library &library)
{
    const auto result = bench::compare(
        rounds, [&] { library.service().scanner().scanAndWait(); },
        [&] { walk(library.photos().folder, [](const std::string &) {}); });
    bench::row("scan after a restart / bare walk with one stat each", result.ratio, 1.5,
               bench::milliseconds(result));
    const Span first = spanOf([&] {
        library.start();
        library.ask("featured?max-results=8");
    });
    tell("start to first featured page, units of 500 ms", {first}, 0.5);
}

void measureSearch(Library &library)
{
    const auto &words = libraryWords();
    std::vector<std::string> feeds;
    for (const std::string &text :
         {words[0], words[1], words[0] + "+" + words[1], words[900], words[0].substr(0, 1),
          words[0].substr(0, 2) + "+" + words[3].substr(0, 3), std::string("img"),
          std::string("album"), std::string("bench"), std::string("june+2019"), std::string("2019"),
          std::string("christmas"), std::string("nothing")})
        feeds.push_back("all?q=" + text + "&max-results=100&alt=json");
    tell("search, answers of 100 photos, units of 50 ms", library.askOften(feeds), 0.05);
    feeds.back() = "all?q=img&max-results=100&start-index=90001&alt=json";
    tell("search, a page behind 90,000 photos, units of 50 ms", library.askOften({feeds.back()}),
         0.05);
}

void measureFeeds(Library &library)
{
    tell("own albums, all in one feed, units of 100 ms", library.askOften({library.own("")}), 0.1);
    tell("own albums, a page of 8, units of 50 ms",
         library.askOften(
             {library.own("?max-results=8"), library.own("?max-results=8&start-index=601")}),
         0.05);
    tell("gathered albums of at most 500 photos, units of 50 ms",
         library.askOften({library.own("/albumid/recent"), library.own("/albumid/never-shown"),
                           library.own("/albumid/on-this-day"),
                           library.own("/albumid/month-2012-03")}),
         0.05);
}

void measureDeck(Library &library)
{
    auto reader = library.service().database().read();
    std::vector<Span> deals;
    for (int day = 1; day <= rounds; ++day)
        deals.push_back(spanOf([&] { featuredOrder(reader, "2026-05-0" + std::to_string(day)); }));
    tell("featured deck dealt anew, units of 100 ms", deals, 0.1);
    const auto result = bench::compare(
        9, [&] { library.ask("featured?max-results=8&start-index=90001"); },
        [&] { library.ask("featured?max-results=8"); });
    bench::row("featured page at photo 90,001 / at photo 1", result.ratio, 0,
               bench::milliseconds(result));
}

} // namespace

int main(int argc, char **argv)
{
    spdlog::set_level(spdlog::level::off);
    char name[] = "bench_library_XXXXXX";
    const fs::path folder = fs::absolute(::mkdtemp(name));
    {
        Library library(folder, argc > 1 ? std::atoi(argv[1]) : 100'000);
        measureFirstScan(library);
        measureRestart(library);
        measureSearch(library);
        measureFeeds(library);
        measureDeck(library);
    }
    fs::remove_all(folder);
    return 0;
}
