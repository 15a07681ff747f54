#pragma once

#include "service.h"

// `orvala-service serve`: runs the service until SIGTERM or SIGINT; SIGHUP scans at once. Throws as
// the other commands do.
struct ServeOptions
{
    ServiceSettings service;
    std::string photos; // folder of the first user, empty: as it is
    std::string user = "family@orvala.example";
    std::string readyFile; // gets the port once the service answers
    std::string logLevel = "info";
};

int runServe(const ServeOptions &options);
