#include "base/texts.h"
#include "feeds/feedrequest.h"
#include "fuzz.h"
#include "http/accesslog.h"
#include "http/form.h"
#include "http/router.h"
#include "index/searchtext.h"

#include <cstring>

namespace {

// A request whose lines are the target, the Host line, the Authorization line and the body.
httplib::Request requestOf(std::string text)
{
    std::string lines[3];
    for (std::string &line : lines) {
        const std::size_t end = text.find('\n');
        line = text.substr(0, end);
        text.erase(0, end == std::string::npos ? end : end + 1);
    }
    httplib::Request request;
    request.method = "GET";
    request.target = lines[0];
    const std::size_t query = lines[0].find('?');
    request.path = lines[0].substr(0, query);
    if (query != std::string::npos)
        httplib::detail::parse_query_text(lines[0].substr(query + 1), request.params);
    request.headers.emplace("Host", lines[1]);
    request.headers.emplace("Authorization", lines[2]);
    request.body = text;
    return request;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    const httplib::Request request = requestOf(textOf(data, size));
    const PageLimits limits{25, 1000};
    const auto page = pageOf(request, limits);
    if (page && (page->start < 1 || page->count < 0 || page->count > limits.most))
        broken();
    originOf(request, "https");
    accessTokenOf(request);
    // However its name is written, a token never gets into the log.
    const std::string written = withoutSecrets(request.target);
    httplib::Params fields;
    if (const std::size_t query = written.find('?'); query != std::string::npos)
        httplib::detail::parse_query_text(written.substr(query + 1), fields);
    for (const auto &[name, value] : fields) {
        if (name == "access_token" && !value.empty() && value != "***")
            broken();
    }
    Form(request.body).value("code");
    searchWords(request.get_param_value("q"));
    searchText(request.path);
    searchDate(request.path);
    parseTime(request.path);

    Router router;
    const auto answers = [](const Router::Call &, httplib::Response &) {};
    router.add("GET", "data/feed/api/user/*/albumid/*", answers);
    router.add("GET", "photos/*/*", answers);
    httplib::Response response;
    router.answer(request, response);
    return 0;
}
