#pragma once

#include <httplib.h>

#include <functional>
#include <string>
#include <string_view>
#include <vector>

// Which function answers which path. Paths are compared piece by piece, each piece percent-decoded
// on its own, so that an escaped slash stays inside its piece.
class Router
{
public:
    struct Call
    {
        const httplib::Request &request;
        std::vector<std::string> pieces; // what stood in the place of each "*"
    };
    using Handler = std::function<void(const Call &, httplib::Response &)>;
    // How many bytes of body a request may bring, decided by its head; an answer to one that brings
    // more may be put into the response.
    using BodyLimit = std::function<std::size_t(const Call &, httplib::Response &)>;
    static constexpr std::size_t standardBody = 1024 * 1024;

    // `pattern` as in "photos/*/*"; a HEAD request goes to the function for GET.
    void add(const std::string &method, const std::string &pattern, Handler handler,
             BodyLimit limit = {});

    // Calls the function of the route, or answers that there is none.
    void answer(const httplib::Request &request, httplib::Response &response) const;
    std::size_t bodyLimit(const httplib::Request &request, httplib::Response &response) const;

private:
    struct Route
    {
        std::string method;
        std::vector<std::string> pattern;
        Handler handler;
        BodyLimit limit;
    };
    struct Found
    {
        const Route *route = nullptr;
        bool isKnownPath = false; // maybe with another method
        std::vector<std::string> places;
    };
    Found find(const httplib::Request &request) const;

    std::vector<Route> mRoutes;
};

// An answer in the shape of all errors: {"error": {"code", "message"}}.
void answerError(httplib::Response &response, int status, const std::string &message);
