#include "service.h"

#include "base/secrets.h"
#include "feeds/feeds.h"
#include "feeds/health.h"
#include "feeds/photopictures.h"
#include "feeds/shownphotos.h"
#include "http/httpserver.h"
#include "index/database.h"
#include "pictures/thumbnailstore.h"
#include "posting/posting.h"
#include "scan/scanner.h"
#include "signin/signinpages.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <sqlite3.h>

#include <cerrno>
#include <cstring>
#include <filesystem>

namespace {

constexpr std::chrono::minutes codeLife{5};

bool makeDataFolder(const std::string &folder, std::string *error)
{
    std::error_code code;
    const bool isNew = std::filesystem::create_directories(folder, code);
    if (code || !std::filesystem::is_directory(folder, code)) {
        *error = "cannot make the folder " + folder + (code ? ": " + code.message() : "") +
                 "; --data names one that this user may write to";
        return false;
    }
    if (isNew)
        std::filesystem::permissions(folder, std::filesystem::perms::owner_all, code);
    return true;
}

std::string whyNotListening(int error)
{
    switch (error) {
    case EADDRINUSE:
        return ": another program does; --port takes another one";
    case EADDRNOTAVAIL:
        return ": this machine has no such address; --listen 0.0.0.0 takes all it has";
    case EACCES:
        return ": ports below 1024 are for root; --port takes another one";
    default:
        return ": --listen takes an address of this machine, as 0.0.0.0 for all";
    }
}

bool isStorageFull(const std::exception &exception)
{
    const auto *problem = dynamic_cast<const SQLite::Exception *>(&exception);
    if (!problem)
        return false;
    const int code = problem->getExtendedErrorCode();
    return (code & 0xFF) == SQLITE_FULL || code == SQLITE_IOERR_WRITE ||
           code == SQLITE_IOERR_SHMSIZE;
}

} // namespace

// In the order in which they are made; they go the other way round.
struct Service::Parts
{
    ~Parts()
    {
        server.reset(); // before what its requests use
        if (lock >= 0)
            ::close(lock);
    }

    bool takeLock(const ServiceSettings &settings, std::string *error);
    bool prepareTls(const ServiceSettings &settings, std::string *error);
    bool startServer(const ServiceSettings &settings, std::string *error);

    int lock = -1;
    std::unique_ptr<Database> database;
    SslContext context;
    std::unique_ptr<ThumbnailStore> thumbnails;
    std::unique_ptr<ShownPhotos> shown;
    std::unique_ptr<Feeds> feeds;
    std::unique_ptr<PhotoPictures> pictures;
    std::unique_ptr<Posting> posting;
    AuthorisationCodes codes{codeLife, SteadyClock::now};
    std::unique_ptr<SignInPages> signIn;
    std::unique_ptr<TokenEndpoint> tokens;
    Router router;
    std::unique_ptr<HttpServer> server;
    std::unique_ptr<Scanner> scanner;
};

// Two services on one data folder would scan and drop thumbnails against each other.
bool Service::Parts::takeLock(const ServiceSettings &settings, std::string *error)
{
    const std::string file = settings.data + "/service.lock";
    lock = ::open(file.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    if (lock >= 0 && ::flock(lock, LOCK_EX | LOCK_NB) == 0)
        return true;
    *error = errno == EWOULDBLOCK
                 ? "another service is running with the data folder " + settings.data
                 : "cannot write " + file + ": " + std::strerror(errno);
    return false;
}

bool Service::Parts::prepareTls(const ServiceSettings &settings, std::string *error)
{
    if (!settings.withTls)
        return true;
    const std::string own = settings.data + "/certificate.pem";
    if (settings.certificate.empty() && !ensureSelfSignedCertificate(own, error))
        return false;
    const std::string &certificate = settings.certificate.empty() ? own : settings.certificate;
    context = makeSslContext(certificate, settings.key.empty() ? certificate : settings.key, error);
    return context != nullptr;
}

bool Service::Parts::startServer(const ServiceSettings &settings, std::string *error)
{
    thumbnails =
        std::make_unique<ThumbnailStore>(settings.data + "/thumbnails", settings.thumbnailBytes);
    const std::string scheme = settings.withTls ? "https" : "http";
    shown = std::make_unique<ShownPhotos>(*database);
    feeds = std::make_unique<Feeds>(*database, *shown,
                                    Feeds::Settings{scheme, settings.gathered, settings.today});
    posting = std::make_unique<Posting>(*database, scheme);
    pictures = std::make_unique<PhotoPictures>(*database, *thumbnails, *shown);
    tokens = std::make_unique<TokenEndpoint>(*database, codes,
                                             std::chrono::seconds(settings.accessLife).count());
    SignInPages::Settings pages;
    pages.withTls = settings.withTls;
    signIn = std::make_unique<SignInPages>(*database, codes, pages);
    addHealthRoute(router, *database, settings.data);
    feeds->addRoutes(router);
    posting->addRoutes(router);
    pictures->addRoutes(router);
    signIn->addRoutes(router);
    tokens->addRoutes(router);
    HttpServer::Settings http;
    http.address = settings.listen;
    http.port = settings.port;
    http.threads = settings.threads;
    http.context = context.get();
    http.isStorageFull = isStorageFull;
    server = std::make_unique<HttpServer>(router, http);
    if (server->start())
        return true;
    *error = "cannot listen on " + settings.listen + ", port " + std::to_string(settings.port) +
             whyNotListening(errno);
    return false;
}

std::unique_ptr<Service> Service::start(const ServiceSettings &settings, std::string *error)
{
    auto parts = std::make_unique<Parts>();
    parts->database = openIndex(settings.data, error);
    if (!parts->database || !parts->takeLock(settings, error) ||
        !parts->prepareTls(settings, error) || !parts->startServer(settings, error))
        return nullptr;
    parts->scanner = std::make_unique<Scanner>(*parts->database, settings.scanPause);
    parts->scanner->start();
    return std::unique_ptr<Service>(new Service(std::move(parts)));
}

Service::Service(std::unique_ptr<Parts> parts)
    : mParts(std::move(parts))
{
}

Service::~Service() = default;

int Service::port() const
{
    return mParts->server->port();
}

Database &Service::database()
{
    return *mParts->database;
}

Scanner &Service::scanner()
{
    return *mParts->scanner;
}

std::unique_ptr<Database> openIndex(const std::string &dataFolder, std::string *error)
{
    if (!initialiseSecrets()) {
        *error = "there is no source of randomness";
        return nullptr;
    }
    if (!makeDataFolder(dataFolder, error))
        return nullptr;
    return Database::open(dataFolder + "/index.db", error);
}
