#include "support/bench.h"

#include "index/database.h"
#include "index/users.h"
#include "pictures/thumbnailstore.h"
#include "scan/scanner.h"
#include "service.h"

#include <httplib.h>
#include <nlohmann/json.hpp>
#include <spdlog/spdlog.h>
#include <sys/resource.h>
#include <vips/vips.h>

#include <filesystem>
#include <thread>

// What it costs to make a picture, in processor time, against the command-line programs that make
// the same one; and how long eight thumbnails take to five televisions at once.
namespace {

namespace fs = std::filesystem;

constexpr int rounds = 7;
constexpr int photos = 8;
constexpr int televisions = 5;

// 12 megapixels with soft edges and some grain, in the size that cameras write.
void writePhoto(const fs::path &path)
{
    VipsImage *noise = nullptr, *soft = nullptr, *colour = nullptr, *bytes = nullptr;
    vips_gaussnoise(&noise, 4000, 3000, "sigma", 60.0, nullptr);
    vips_gaussblur(noise, &soft, 1.2, nullptr);
    VipsImage *bands[] = {soft, soft, soft};
    vips_bandjoin(bands, &colour, 3, nullptr);
    vips_cast_uchar(colour, &bytes, nullptr);
    vips_jpegsave(bytes, path.c_str(), "Q", 90, nullptr);
    for (VipsImage *image : {noise, soft, colour, bytes})
        g_object_unref(image);
}

double processorSeconds()
{
    double sum = 0;
    for (const int who : {RUSAGE_SELF, RUSAGE_CHILDREN}) {
        rusage usage{};
        ::getrusage(who, &usage);
        sum += usage.ru_utime.tv_sec + usage.ru_stime.tv_sec +
               (usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
    }
    return sum;
}

double cost(const bench::Work &work)
{
    const double before = processorSeconds();
    work();
    return processorSeconds() - before;
}

void compareCost(const std::string &what, double goal, const bench::Work &ours,
                 const bench::Work &reference)
{
    std::vector<double> ratios, first, second;
    for (int round = 0; round < rounds; ++round) {
        first.push_back(cost(ours));
        second.push_back(cost(reference));
        ratios.push_back(first.back() / second.back());
    }
    char text[96];
    std::snprintf(text, sizeof text, "%.1f ms a picture against %.1f ms",
                  bench::median(first) / photos * 1e3, bench::median(second) / photos * 1e3);
    bench::row(what, bench::median(ratios), goal, text);
}

bench::Work command(const std::string &line)
{
    return [line] {
        if (std::system(line.c_str()) != 0)
            std::abort();
    };
}

void compareWithCommands(const fs::path &folder, int width)
{
    const std::string size = std::to_string(width), out = folder / "out";
    const std::string all = " '" + folder.string() + "'/photos/Sea/*.jpg";
    fs::create_directories(out);
    ThumbnailStore store(folder / "store", 1 << 30);
    int round = 0;
    const bench::Work ours = [&] {
        ++round;
        for (int i = 0; i < photos; ++i) {
            const std::string path = folder / "photos/Sea" / (std::to_string(i) + ".jpg");
            const std::string identity = std::to_string(round) + path;
            if (!store.picture(path, identity, width).ok())
                std::abort();
        }
    };
    compareCost("picture " + size + " wide of 12 megapixels / vipsthumbnail", 1.1, ours,
                command("VIPS_CONCURRENCY=1 vipsthumbnail --size " + size + "x100000 -o '" + out +
                        "/%s.jpg[Q=88,strip,optimize_coding]'" + all));
    compareCost("picture " + size + " wide of 12 megapixels / mogrify", 1, ours,
                command("MAGICK_THREAD_LIMIT=1 mogrify -path '" + out +
                        "' -define jpeg:size=" + std::to_string(2 * width) +
                        "x -auto-orient -thumbnail " + size + "x -quality 88" + all));
}

using Paths = std::vector<std::string>;

void fetch(int port, const Paths &paths)
{
    httplib::SSLClient client("127.0.0.1", port);
    client.enable_server_certificate_verification(false);
    client.set_keep_alive(true);
    client.set_tcp_nodelay(true);
    for (const std::string &path : paths) {
        const auto answer = client.Get(path);
        if (!answer || answer->status != 200)
            std::abort();
    }
}

// Each television fetches two at a time.
void fetchAtOnce(int port, const Paths &paths, int screens)
{
    std::vector<std::thread> threads;
    for (int screen = 0; screen < screens; ++screen) {
        threads.emplace_back(
            [&] { fetch(port, Paths(paths.begin(), paths.begin() + photos / 2)); });
        threads.emplace_back([&] { fetch(port, Paths(paths.begin() + photos / 2, paths.end())); });
    }
    for (std::thread &thread : threads)
        thread.join();
}

Paths sized(const Paths &addresses, int width)
{
    Paths paths;
    for (std::string path : addresses)
        paths.push_back(path.insert(path.rfind('/'), "/s" + std::to_string(width)));
    return paths;
}

void compareTelevisions(const fs::path &folder)
{
    ServiceSettings settings;
    settings.data = folder / "data";
    std::string error;
    saveUser(*openIndex(settings.data, &error),
             {0, "bench@orvala.example", "B", folder / "photos"});
    const auto service = Service::start(settings, &error);
    if (!service)
        std::abort();
    service->scanner().scanAndWait();
    httplib::SSLClient client("127.0.0.1", service->port());
    client.enable_server_certificate_verification(false);
    const auto feed = nlohmann::json::parse(client.Get("/data/feed/api/featured")->body)["feed"];
    Paths addresses;
    for (const auto &entry : feed["entry"]) {
        const std::string address = entry["content"]["src"];
        addresses.push_back(address.substr(address.find('/', 8)));
    }
    int width = 200; // another one each time: nothing is there yet
    auto result = bench::compare(
        rounds, [&] { fetchAtOnce(service->port(), sized(addresses, ++width), televisions); },
        [&] { fetchAtOnce(service->port(), sized(addresses, ++width), 1); });
    bench::row("8 new thumbnails to 5 televisions at once / to one", result.ratio, 1.3,
               bench::milliseconds(result));
    const Paths kept = sized(addresses, width);
    result = bench::compare(
        rounds, [&] { fetchAtOnce(service->port(), kept, televisions); },
        [&] { fetchAtOnce(service->port(), kept, 1); });
    bench::row("8 kept thumbnails to 5 televisions at once / to one", result.ratio, 5,
               bench::milliseconds(result));
}

} // namespace

int main()
{
    spdlog::set_level(spdlog::level::off);
    char name[] = "bench_thumbnails_XXXXXX";
    const fs::path folder = fs::absolute(::mkdtemp(name));
    fs::create_directories(folder / "photos/Sea");
    writePhoto(folder / "photos/Sea/0.jpg");
    for (int i = 1; i < photos; ++i)
        fs::copy_file(folder / "photos/Sea/0.jpg",
                      folder / "photos/Sea" / (std::to_string(i) + ".jpg"));
    for (const int width : {336, 1280})
        compareWithCommands(folder, width);
    compareTelevisions(folder);
    fs::remove_all(folder);
    return 0;
}
