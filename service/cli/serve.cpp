#include "cli/serve.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/users.h"
#include "scan/scanner.h"

#include <spdlog/spdlog.h>

#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <fstream>
#include <thread>

namespace {

constexpr std::chrono::milliseconds endPatience{700};
constexpr rlim_t openFiles = 8192;

// Blocked before any thread begins, so that all threads leave them to the one that waits.
sigset_t blockSignals()
{
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGTERM);
    sigaddset(&signals, SIGINT);
    sigaddset(&signals, SIGHUP);
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    return signals;
}

bool writeReadyFile(const std::string &file, int port)
{
    const std::string unfinished = file + ".new";
    std::ofstream stream(unfinished);
    stream << port << "\n";
    stream.close();
    return stream.good() && std::rename(unfinished.c_str(), file.c_str()) == 0;
}

// Connections, photos and the index' files may be more than the usual 1024.
void raiseFileLimit()
{
    rlimit limit{};
    if (::getrlimit(RLIMIT_NOFILE, &limit) != 0 || limit.rlim_cur >= openFiles)
        return;
    limit.rlim_cur = std::min(openFiles, limit.rlim_max);
    ::setrlimit(RLIMIT_NOFILE, &limit);
}

// What is under way at the end, as a large photo being decoded, is not waited for any longer: all
// that was acknowledged is on the disk, as it has to be for a power cut.
void endSoon()
{
    std::thread([] {
        std::this_thread::sleep_for(endPatience);
        ::_exit(0);
    }).detach();
}

int fail(const std::string &error)
{
    spdlog::critical("{}", error);
    return 1;
}

// The first user gets the folder; without users there will be one.
bool givePhotos(const ServeOptions &options, std::string *error)
{
    const auto database = openIndex(options.service.data, error);
    if (!database)
        return false;
    std::vector<UserRecord> users;
    {
        auto reader = database->read();
        users = allUsers(reader);
    }
    UserRecord user = users.empty() ? UserRecord{0, options.user, "Family", ""} : users.front();
    user.photos = absoluteFolder(options.photos);
    saveUser(*database, user);
    return true;
}

void waitForEnd(const sigset_t &signals, Service &service)
{
    for (;;) {
        int signal = 0;
        sigwait(&signals, &signal);
        if (signal != SIGHUP)
            return;
        service.scanner().requestScan();
    }
}

} // namespace

int runServe(const ServeOptions &options)
{
    const sigset_t signals = blockSignals();
    raiseFileLimit();
    std::signal(SIGXFSZ, SIG_IGN); // a limit on the size of files is answered like a full disk
    spdlog::set_pattern("%Y-%m-%d %H:%M:%S.%e %L %v");
    spdlog::set_level(spdlog::level::from_str(options.logLevel));
    std::string error;
    if (!options.photos.empty() && !givePhotos(options, &error))
        return fail(error);
    const auto service = Service::start(options.service, &error);
    if (!service)
        return fail(error);
    spdlog::info("listening on {}, port {}", options.service.listen, service->port());
    if (!options.readyFile.empty() && !writeReadyFile(options.readyFile, service->port()))
        return fail("cannot write " + options.readyFile);
    waitForEnd(signals, *service);
    spdlog::info("stopping");
    endSoon();
    return 0;
}
