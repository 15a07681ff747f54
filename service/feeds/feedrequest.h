#pragma once

#include "index/records.h"

#include <httplib.h>

// What feeds read from a request.

// The scheme and host that the client used, for addresses that work for it; the address of the
// connection when the Host line is missing or no host.
std::string originOf(const httplib::Request &request, const std::string &scheme);

// The access token from the query or the Authorization line, empty if there is none.
std::string accessTokenOf(const httplib::Request &request);

struct PageLimits
{
    std::int64_t standard; // entries when the client does not say
    std::int64_t most;
};

// "start-index" and "max-results", brought into their limits; nothing if one is no number.
std::optional<Page> pageOf(const httplib::Request &request, const PageLimits &limits);
