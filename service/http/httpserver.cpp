#include "http/httpserver.h"

#include "base/texts.h"
#include "http/accesslog.h"

#include <spdlog/spdlog.h>

#include <fcntl.h>
#include <sys/eventfd.h>

namespace {

constexpr std::size_t headBytes = 64 * 1024;
constexpr std::size_t chunkBytes = 64 * 1024; // what a body in chunks has beside its content
constexpr std::size_t largestBody = 128 * 1024 * 1024; // the router sets lower limits
constexpr std::size_t longestPath = 1024; // matching by regular expression recurses once per byte
constexpr int waitingConnections = 128;
// A client that fetches a page sends the next request at once: a worker that stays for it saves
// two changes of threads.
constexpr std::chrono::milliseconds nextRequestPatience{10};
constexpr time_t keepAliveSeconds = 300;
constexpr std::size_t keepAliveRequests = 1'000'000;

bool isTooLarge(const httplib::Request &request, std::size_t bodyBytes)
{
    const std::string length = request.get_header_value("Content-Length");
    return !length.empty() && std::size_t(parseNumber(length).value_or(-1)) > bodyBytes;
}

bool hasBody(const httplib::Request &request)
{
    return request.has_header("Transfer-Encoding") ||
           (request.has_header("Content-Length") &&
            request.get_header_value("Content-Length") != "0");
}

bool takesBody(const httplib::Request &request)
{
    return request.method != "GET" && request.method != "HEAD" && request.method != "OPTIONS";
}

// What the library would do with a request beyond our needs is taken out of it: answers are small
// and the network is the house's own, so parts and compression cost more than they save.
void simplify(httplib::Request &request)
{
    request.ranges.clear();
    request.headers.erase("Accept-Encoding");
}

const char *messageOf(int status)
{
    switch (status) {
    case 400:
        return "the request cannot be understood";
    case 404:
        return "there is nothing at this address";
    case 413:
        return "the request is too large";
    case 414:
        return "the address is too long";
    default:
        return "the request cannot be answered";
    }
}

void explainFailure(const httplib::Request &, httplib::Response &response)
{
    if (response.body.empty() && response.status >= 400)
        answerError(response, response.status, messageOf(response.status));
}

void handleException(const httplib::Request &, httplib::Response &response, std::exception_ptr what)
{
    try {
        std::rethrow_exception(what);
    } catch (const std::exception &exception) {
        spdlog::error("a request failed: {}", exception.what());
    } catch (...) {
        spdlog::error("a request failed");
    }
    answerError(response, 500, "the service has a problem; its log says which");
}

} // namespace

HttpServer::HttpServer(const Router &router, const Settings &settings)
    : mRouter(router)
    , mSettings(settings)
    , mStopEvent(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
{
    setUp();
}

HttpServer::~HttpServer()
{
    stop();
    ::close(mStopEvent);
}

void HttpServer::setUp()
{
    new_task_queue = [this] { return mWorkers = new httplib::ThreadPool(mSettings.threads); };
    // Not as the library does: with a shared port two services would take turns unnoticed.
    set_socket_options([](socket_t socket) {
        const int on = 1;
        setsockopt(socket, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    });
    set_keep_alive_timeout(keepAliveSeconds);
    set_keep_alive_max_count(keepAliveRequests);
    set_payload_max_length(largestBody);
    set_pre_routing_handler([this](const httplib::Request &request, httplib::Response &response) {
        if (request.path.size() > longestPath)
            answerError(response, 414, messageOf(414));
        else if (!takesBody(request))
            mRouter.answer(request, response);
        else
            return takeBody(request, response);
        return HandlerResponse::Handled;
    });
    const Handler answer = [this](const httplib::Request &request, httplib::Response &response) {
        mRouter.answer(request, response);
    };
    Post(".*", answer).Put(".*", answer).Patch(".*", answer).Delete(".*", answer);
    set_error_handler(Handler(explainFailure));
    set_exception_handler(handleException);
    set_logger(logRequest);
}

// A body has to be read first, if it is not too long.
HttpServer::HandlerResponse HttpServer::takeBody(const httplib::Request &request,
                                                 httplib::Response &response)
{
    httplib::Response refusal;
    if (!isTooLarge(request, mRouter.bodyLimit(request, refusal)))
        return HandlerResponse::Unhandled;
    if (refusal.body.empty())
        answerError(refusal, 413, messageOf(413));
    response.status = refusal.status;
    response.body = std::move(refusal.body);
    response.headers.insert(refusal.headers.begin(), refusal.headers.end());
    return HandlerResponse::Handled;
}

bool HttpServer::start()
{
    if (!is_valid())
        return false;
    if (mSettings.port == 0)
        mPort = bind_to_any_port(mSettings.address);
    else if (bind_to_port(mSettings.address, mSettings.port))
        mPort = mSettings.port;
    if (mPort <= 0 || ::listen(svr_sock_, waitingConnections) != 0)
        return false;
    mParking = std::make_unique<Parking>(
        [this](Client client) { mWorkers->enqueue([this, client] { serve(client); }); },
        Parking::Limits{std::chrono::seconds(keepAliveSeconds)});
    mListener = std::thread([this] { listen_after_bind(); });
    while (!is_running()) // stop() has no effect before
        std::this_thread::yield();
    return true;
}

void HttpServer::stop()
{
    if (mStopping.exchange(true))
        return;
    eventfd_write(mStopEvent, 1);
    if (mParking)
        mParking->stop();
    httplib::Server::stop();
    if (mListener.joinable())
        mListener.join();
}

// Called by a worker with a new connection; the library does not look at the result.
bool HttpServer::process_and_close_socket(socket_t socket)
{
    ClientStream::Limits limits;
    limits.headBytes = headBytes;
    ::fcntl(socket, F_SETFL, ::fcntl(socket, F_GETFL) | O_NONBLOCK);
    mParking->park(std::make_shared<ClientStream>(socket, mSettings.context, mStopEvent, limits));
    return true;
}

void HttpServer::serve(const Client &client)
{
    if (mStopping)
        return;
    client->beginRequest();
    if (!client->isSecured()) {
        if (!client->handshake())
            return;
        if (!client->hasInput())
            return mParking->park(client);
    }
    do {
        if (!serveRequest(*client))
            return;
    } while (client->awaitsInput(nextRequestPatience));
    mParking->park(client);
}

// False when the connection has to be closed.
bool HttpServer::serveRequest(ClientStream &client)
{
    client.beginRequest();
    bool isClosed = false;
    bool isUnderstood =
        false; // after lines that are no request, nothing can be told from what follows
    const auto headArrived = [this, &client, &isUnderstood](httplib::Request &request) {
        isUnderstood = true;
        httplib::Response refusal;
        const std::size_t limit = mRouter.bodyLimit(request, refusal);
        client.headArrived(limit + chunkBytes);
        simplify(request);
        noteRequestStart();
        // Bytes that nobody reads would be taken for the next request.
        if (isTooLarge(request, limit) ||
            (hasBody(request) && (!takesBody(request) || request.path.size() > longestPath)))
            client.closeAfterAnswer();
    };
    const bool answered = process_request(client, mStopping, isClosed, headArrived);
    const bool flushed = client.flush();
    return isUnderstood && answered && flushed && !isClosed && !client.isBroken();
}
