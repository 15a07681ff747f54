#include "http/accesslog.h"

#include "base/texts.h"

#include <spdlog/spdlog.h>

#include <algorithm>
#include <chrono>

namespace {

using Clock = std::chrono::steady_clock;

thread_local Clock::time_point requestStart = Clock::now(); // a request stays on one thread
constexpr std::size_t longestTarget = 300;
const std::string picturePath = "/photos/";

// As the library reads the field: it knows more spellings of a name than one would think.
bool isSecret(std::string_view field)
{
    httplib::Params fields;
    httplib::detail::parse_query_text(std::string(field), fields);
    return std::any_of(fields.begin(), fields.end(), [](const auto &entry) {
        const std::string &name = entry.first;
        return name == "access_token" || name == "code" || name == "refresh_token" ||
               name == "client_secret" || name == "password";
    });
}

// A log line stays one line, whatever the client has sent.
std::string printable(std::string text)
{
    if (text.size() > longestTarget)
        text.resize(longestTarget);
    for (char &c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte < 0x20 || byte == 0x7F)
            c = '?';
    }
    return validUtf8(text);
}

} // namespace

std::string withoutSecrets(const std::string &target)
{
    const std::size_t query = target.find('?');
    std::string result;
    std::size_t start = 0;
    if (target.rfind(picturePath, 0) == 0) { // who knows the key sees the photo
        result = picturePath + "***";
        start = std::min(target.find_first_of("/?", picturePath.size()), target.size());
    }
    while (start < target.size()) {
        // Behind the first "?" only "&" parts: a later "?" belongs to a value.
        const char separator = start <= query ? '?' : '&';
        const std::size_t end = std::min(target.find(separator, start), target.size());
        const std::string_view part(target.data() + start, end - start);
        const std::size_t equals = part.find('=');
        if (equals != std::string_view::npos && isSecret(part))
            result.append(part.substr(0, equals)).append("=***");
        else
            result.append(part);
        result.append(target, end, end < target.size() ? 1 : 0);
        start = end + 1;
    }
    return result;
}

void noteRequestStart()
{
    requestStart = Clock::now();
}

void logRequest(const httplib::Request &request, const httplib::Response &response)
{
    const std::chrono::duration<double, std::milli> took = Clock::now() - requestStart;
    spdlog::info("{} {} {} {} {} B {:.1f} ms", request.remote_addr, printable(request.method),
                 printable(withoutSecrets(request.target)), response.status,
                 response.get_header_value("Content-Length"), took.count());
}
