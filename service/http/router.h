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
    using Receiver = std::function<void(std::string_view bytes)>;
    // Reads a request's body, once, piece by piece; false when it does not arrive whole.
    using Body = std::function<bool(const Receiver &receiver)>;
    struct Call
    {
        const httplib::Request &request;
        std::vector<std::string> pieces; // what stood in the place of each "*"
        const Body &body;                // only for functions that read it themselves
    };
    using Handler = std::function<void(const Call &, httplib::Response &)>;
    // How many bytes of body a request may bring, decided by its head; an answer to one that brings
    // more may be put into the response.
    using BodyLimit = std::function<std::size_t(const Call &, httplib::Response &)>;
    static constexpr std::size_t standardBody = 1024 * 1024;

    // `pattern` as in "photos/*/*"; a HEAD request goes to the function for GET.
    void add(const std::string &method, const std::string &pattern, Handler handler);
    // A function for POST that reads the body itself, however long it is.
    void addReader(const std::string &pattern, Handler handler, BodyLimit limit);

    // Calls the function of the route, or answers that there is none. A `body`, if there is one, is
    // put into the request first, unless the function reads it itself.
    void answer(const httplib::Request &request, httplib::Response &response,
                const Body &body = {}) const;
    std::size_t bodyLimit(const httplib::Request &request, httplib::Response &response) const;

private:
    struct Route
    {
        std::string method;
        std::vector<std::string> pattern;
        Handler handler;
        BodyLimit limit; // of those that read the body themselves
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
