#include "feeds/feedrequest.h"

#include "base/texts.h"

#include <algorithm>
#include <cctype>

namespace {

constexpr std::size_t longestHost = 255;
constexpr std::int64_t lastIndex = 1'000'000'000;

bool isHost(const std::string &host)
{
    const auto allowed = [](char c) {
        return std::isalnum(static_cast<unsigned char>(c)) ||
               std::string("-._:[]").find(c) != std::string::npos;
    };
    return !host.empty() && host.size() <= longestHost &&
           std::all_of(host.begin(), host.end(), allowed);
}

std::string localHost(const httplib::Request &request)
{
    const bool isV6 = request.local_addr.find(':') != std::string::npos;
    const std::string address = isV6 ? "[" + request.local_addr + "]" : request.local_addr;
    return address + ":" + std::to_string(request.local_port);
}

std::optional<std::int64_t> numberParameter(const httplib::Request &request, const char *name,
                                            std::int64_t standard)
{
    if (!request.has_param(name))
        return standard;
    return parseNumber(request.get_param_value(name));
}

} // namespace

std::string originOf(const httplib::Request &request, const std::string &scheme)
{
    const std::string host = request.get_header_value("Host");
    return scheme + "://" + (isHost(host) ? host : localHost(request));
}

std::string accessTokenOf(const httplib::Request &request)
{
    static const std::string bearer = "Bearer ";
    if (request.has_param("access_token"))
        return request.get_param_value("access_token");
    const std::string line = request.get_header_value("Authorization");
    return line.compare(0, bearer.size(), bearer) == 0 ? line.substr(bearer.size()) : "";
}

std::optional<Page> pageOf(const httplib::Request &request, const PageLimits &limits)
{
    const auto start = numberParameter(request, "start-index", 1);
    const auto count = numberParameter(request, "max-results", limits.standard);
    if (!start || !count)
        return std::nullopt;
    return Page{std::clamp<std::int64_t>(*start, 1, lastIndex),
                std::clamp<std::int64_t>(*count, 0, limits.most)};
}
