#include "support/bench.h"

#include "feeds/feedwriter.h"
#include "index/database.h"
#include "index/users.h"
#include "scan/scanner.h"
#include "service.h"

#include <httplib.h>
#include <spdlog/spdlog.h>
#include <sys/stat.h>
#include <vips/vips.h>

#include <filesystem>
#include <thread>

// The album service against a server that holds the same bytes ready in memory, both over TLS on
// connections that stay open, and a scan without changes against the bare walk with one stat for
// each file.
namespace {

namespace fs = std::filesystem;

constexpr int rounds = 9;
constexpr int requestsPerRound = 300;
constexpr int folders = 50;
constexpr int photosPerFolder = 100;

void writePhoto(const fs::path &path)
{
    VipsImage *noise = nullptr;
    VipsImage *image = nullptr;
    vips_gaussnoise(&noise, 640, 480, nullptr);
    vips_cast_uchar(noise, &image, nullptr);
    vips_jpegsave(image, path.c_str(), nullptr);
    g_object_unref(image);
    g_object_unref(noise);
}

void makePhotos(const fs::path &folder)
{
    writePhoto(folder / "photo.jpg");
    for (int i = 0; i < folders; ++i) {
        const fs::path album = folder / ("album " + std::to_string(i));
        fs::create_directories(album);
        for (int n = 0; n < photosPerFolder; ++n)
            fs::create_hard_link(folder / "photo.jpg", album / (std::to_string(n) + ".jpg"));
    }
}

std::unique_ptr<httplib::SSLClient> clientFor(int port)
{
    auto client = std::make_unique<httplib::SSLClient>("127.0.0.1", port);
    client->enable_server_certificate_verification(false);
    client->set_keep_alive(true);
    client->set_tcp_nodelay(true);
    return client;
}

bench::Work requests(httplib::SSLClient &client, const std::string &path)
{
    return [&client, path] {
        for (int i = 0; i < requestsPerRound; ++i) {
            const auto answer = client.Get(path);
            if (!answer || answer->status != 200)
                std::abort(); // a failed request would be a fast one
        }
    };
}

std::string perSecond(const bench::Comparison &c)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.0f requests a second against %.0f",
                  requestsPerRound / c.ours, requestsPerRound / c.reference);
    return text;
}

void compareRequests(const std::string &what, const Service &service, const std::string &path,
                     const std::string &certificate)
{
    const auto ours = clientFor(service.port());
    const std::string body = ours->Get(path)->body;
    httplib::SSLServer bare(certificate.c_str(), certificate.c_str());
    bare.Get("/", [&body](const httplib::Request &, httplib::Response &response) {
        response.set_content(body, "image/jpeg");
    });
    bare.set_keep_alive_max_count(1'000'000);
    bare.set_tcp_nodelay(true);
    const int port = bare.bind_to_any_port("127.0.0.1");
    std::thread thread([&bare] { bare.listen_after_bind(); });
    {
        const auto reference = clientFor(port);
        const auto result =
            bench::compare(rounds, requests(*ours, path), requests(*reference, "/"));
        bench::row(what, result.ratio, 0, perSecond(result));
    }
    bare.stop();
    thread.join();
}

void walk(const std::string &folder)
{
    for (const auto &entry : fs::recursive_directory_iterator(folder)) {
        struct stat status
        {
        };
        if (::stat(entry.path().c_str(), &status) != 0)
            std::abort();
    }
}

void compareScan(Service &service, const std::string &photos)
{
    const auto result = bench::compare(
        rounds, [&] { service.scanner().scanAndWait(); }, [&] { walk(photos); });
    bench::row("scan of 5,000 unchanged photos / bare walk", result.ratio, 0,
               bench::milliseconds(result));
}

void run(const fs::path &folder)
{
    const std::string photos = folder / "photos";
    fs::create_directories(photos);
    makePhotos(photos);
    ServiceSettings settings;
    settings.data = folder / "data";
    std::string error;
    saveUser(*openIndex(settings.data, &error), {0, "bench@orvala.example", "Bench", photos});
    const auto service = Service::start(settings, &error);
    if (!service)
        std::abort();
    service->scanner().scanAndWait();
    const std::string page = "/data/feed/api/featured?start-index=2001&max-results=8";
    const std::string certificate = settings.data + "/certificate.pem";
    const auto feed = FeedJson::parse(clientFor(service->port())->Get(page)->body)["feed"];
    const std::string address =
        feed["entry"][0]["media$group"]["media$thumbnail"][2]["url"].get<std::string>();
    const std::string thumbnail = address.substr(address.find('/', 8));
    compareRequests("featured page of 8 / same bytes from memory", *service, page, certificate);
    compareRequests("cached thumbnail / same bytes from memory", *service, thumbnail, certificate);
    compareScan(*service, photos);
}

} // namespace

int main()
{
    spdlog::set_level(spdlog::level::off);
    char name[] = "bench_service_XXXXXX";
    const fs::path folder = fs::absolute(::mkdtemp(name));
    run(folder);
    fs::remove_all(folder);
    return 0;
}
