#include "http/router.h"

#include "base/texts.h"

#include <nlohmann/json.hpp>

#include <optional>

namespace {

std::vector<std::string> splitPath(std::string_view path)
{
    std::vector<std::string> pieces;
    path.remove_prefix(path.empty() ? 0 : 1);
    for (;;) {
        const std::size_t slash = path.find('/');
        pieces.emplace_back(path.substr(0, slash));
        if (slash == std::string_view::npos)
            return pieces;
        path.remove_prefix(slash + 1);
    }
}

std::vector<std::string> piecesOf(const std::string &target)
{
    std::vector<std::string> pieces = splitPath(target.substr(0, target.find_first_of("?#")));
    for (std::string &piece : pieces)
        piece = percentDecoded(piece);
    return pieces;
}

std::optional<std::vector<std::string>> match(const std::vector<std::string> &pattern,
                                              const std::vector<std::string> &pieces)
{
    if (pattern.size() != pieces.size())
        return std::nullopt;
    std::vector<std::string> places;
    for (std::size_t i = 0; i < pattern.size(); ++i) {
        if (pattern[i] == "*")
            places.push_back(pieces[i]);
        else if (pattern[i] != pieces[i])
            return std::nullopt;
    }
    return places;
}

} // namespace

void Router::add(const std::string &method, const std::string &pattern, Handler handler)
{
    mRoutes.push_back({method, splitPath("/" + pattern), std::move(handler), {}});
}

void Router::addReader(const std::string &pattern, Handler handler, BodyLimit limit)
{
    mRoutes.push_back({"POST", splitPath("/" + pattern), std::move(handler), std::move(limit)});
}

Router::Found Router::find(const httplib::Request &request) const
{
    const std::vector<std::string> pieces = piecesOf(request.target);
    const std::string method = request.method == "HEAD" ? "GET" : request.method;
    Found found;
    for (const Route &route : mRoutes) {
        auto places = match(route.pattern, pieces);
        if (!places)
            continue;
        found.isKnownPath = true;
        if (route.method == method)
            return {&route, true, std::move(*places)};
    }
    return found;
}

void Router::answer(const httplib::Request &request, httplib::Response &response,
                    const Body &body) const
{
    Found found = find(request);
    if (!found.route) {
        if (found.isKnownPath)
            answerError(response, 405, "this address does not take " + request.method);
        else
            answerError(response, 404, "there is nothing at this address");
        return;
    }
    if (!body || found.route->limit)
        return found.route->handler({request, std::move(found.places), body}, response);
    httplib::Request whole = request;
    if (body([&whole](std::string_view bytes) { whole.body.append(bytes); }))
        found.route->handler({whole, std::move(found.places), body}, response);
}

std::size_t Router::bodyLimit(const httplib::Request &request, httplib::Response &response) const
{
    Found found = find(request);
    if (!found.route || !found.route->limit)
        return standardBody;
    static const Body none;
    return found.route->limit({request, std::move(found.places), none}, response);
}

void answerError(httplib::Response &response, int status, const std::string &message)
{
    const nlohmann::json body = {{"error", {{"code", status}, {"message", message}}}};
    response.status = status;
    response.set_content(body.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace),
                         "application/json; charset=UTF-8");
}
