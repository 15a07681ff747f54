#pragma once

#include "base/texts.h"
#include "index/gatheredalbums.h"

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

class Database;
class Scanner;

struct ServiceSettings
{
    std::string data; // folder of all that the service keeps
    std::string listen = "127.0.0.1";
    int port = 0; // 0: a free one
    bool withTls = true;
    std::string certificate; // empty: self-signed, made once
    std::string key;         // empty: in the certificate's file
    int threads = 64;
    std::chrono::seconds scanPause{300};
    std::chrono::hours accessLife{90 * 24};        // of an access token
    GatheredKinds gathered = allGatheredKinds();   // which albums the service makes up
    std::function<std::string()> today = localDay; // as 2026-05-01
    std::int64_t thumbnailBytes = std::int64_t(8) << 30;
};

// The running service: index, scan and server.
class Service
{
public:
    // Starts everything; null and the reason in `error` when that is not possible.
    static std::unique_ptr<Service> start(const ServiceSettings &settings, std::string *error);
    // Stops everything.
    ~Service();

    int port() const;
    Database &database();
    Scanner &scanner();

private:
    struct Parts;
    explicit Service(std::unique_ptr<Parts> parts);

    std::unique_ptr<Parts> mParts;
};

// The index below a data folder, which is made when missing; null and the reason in `error` when it
// cannot be opened.
std::unique_ptr<Database> openIndex(const std::string &dataFolder, std::string *error);
