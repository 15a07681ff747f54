#include "http/httpserver.h"

#include "base/texts.h"
#include "http/accesslog.h"
#include "http/workers.h"

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
constexpr std::size_t waitingOfAddress = 64;

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

bool hasLength(const httplib::Request &request)
{
    return request.has_header("Content-Length") || request.has_header("Transfer-Encoding");
}

// Proxies and servers may read such a request differently.
bool isAmbiguous(const httplib::Request &request)
{
    const std::size_t lengths = request.get_header_value_count("Content-Length");
    return lengths > 1 || (lengths > 0 && request.has_header("Transfer-Encoding"));
}

// Kinds that the library would take apart on its own: a small packed body may become a thousand
// times its size.
bool isUnfit(const httplib::Request &request)
{
    const std::string encoding = request.get_header_value("Content-Encoding");
    return (!encoding.empty() && encoding != "identity") || request.is_multipart_form_data();
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
    case 411:
        return "the request does not say how long its body is";
    case 413:
        return "the request is too large";
    case 414:
        return "the address is too long";
    case 415:
        return "bodies of this kind are not taken";
    default:
        return "the request cannot be answered";
    }
}

void explainFailure(const httplib::Request &, httplib::Response &response)
{
    if (response.body.empty() && response.status >= 400)
        answerError(response, response.status, messageOf(response.status));
}

} // namespace

HttpServer::HttpServer(const Router &router, const Settings &settings)
    : mRouter(router)
    , mSettings(settings)
    , mStopEvent(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
    , mTurns(std::size_t(std::max(1, settings.threads / 4)), waitingOfAddress)
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
    new_task_queue = [this] { return mWorkers = new Workers(std::size_t(mSettings.threads)); };
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
    Post(".*", [this](const httplib::Request &request, httplib::Response &response,
                      const httplib::ContentReader &reader) { post(request, response, reader); });
    Put(".*", answer).Patch(".*", answer).Delete(".*", answer);
    set_error_handler(Handler(explainFailure));
    set_exception_handler(
        [this](const httplib::Request &, httplib::Response &response,
               const std::exception_ptr &what) { explainException(response, what); });
    set_logger(logRequest);
}

// Nothing is done with a body that did not arrive whole. One that nobody wanted is read all the
// same: it would be taken for the next request.
void HttpServer::post(const httplib::Request &request, httplib::Response &response,
                      const httplib::ContentReader &reader)
{
    bool isRead = false, isWhole = true;
    std::size_t total = 0;
    const Router::Body body = [&](const Router::Receiver &receiver) {
        isRead = true;
        isWhole = reader([&receiver, &total](const char *bytes, std::size_t size) {
            total += size;
            receiver({bytes, size});
            return true;
        });
        return isWhole;
    };
    try {
        mRouter.answer(request, response, body);
    } catch (...) {
        explainException(response, std::current_exception());
    }
    if (!isRead)
        body([](std::string_view) {});
    if (isWhole)
        return;
    httplib::Response refusal; // a body in chunks may turn out to be too long
    const int status = total > mRouter.bodyLimit(request, refusal) ? 413 : 400;
    answerError(response, status, messageOf(status));
}

void HttpServer::explainException(httplib::Response &response, const std::exception_ptr &what) const
{
    try {
        std::rethrow_exception(what);
    } catch (const std::exception &exception) {
        spdlog::error("a request failed: {}", exception.what());
        if (mSettings.isStorageFull && mSettings.isStorageFull(exception))
            return answerError(response, 507, "the service has no room to store anything");
    } catch (...) {
        spdlog::error("a request failed");
    }
    answerError(response, 500, "the service has a problem; its log says which");
}

// A body has to be read first, if it is not too long.
HttpServer::HandlerResponse HttpServer::takeBody(const httplib::Request &request,
                                                 httplib::Response &response)
{
    httplib::Response refusal;
    if (isAmbiguous(request))
        answerError(refusal, 400, messageOf(400));
    else if (isUnfit(request))
        answerError(refusal, 415, messageOf(415));
    else if (!hasLength(request) && request.method != "DELETE")
        answerError(refusal, 411, messageOf(411));
    else if (!isTooLarge(request, mRouter.bodyLimit(request, refusal)))
        return HandlerResponse::Unhandled;
    else if (refusal.body.empty())
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
        [this](Client client) {
            mWorkers->enqueue([this, client]() mutable { serve(std::move(client)); });
        },
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
    mTurns.clear();
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

void HttpServer::serve(Client client)
{
    if (mStopping || !mTurns.take(client))
        return;
    const std::string address = client->address();
    for (; client; client = mTurns.pass(address)) {
        try {
            serveRequests(client);
        } catch (const std::exception &exception) { // of this client, nobody else's
            spdlog::error("a connection failed: {}", exception.what());
        }
    }
}

void HttpServer::serveRequests(const Client &client)
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

// Nothing when that cannot be told now. Here the library catches nothing; takeBody() asks again and
// has it answered.
std::optional<std::size_t> HttpServer::limitOf(const httplib::Request &request) const
{
    httplib::Response refusal;
    try {
        return mRouter.bodyLimit(request, refusal);
    } catch (const std::exception &) {
        return std::nullopt;
    }
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
        const auto limit = limitOf(request);
        client.headArrived(limit.value_or(0) + chunkBytes);
        simplify(request);
        noteRequestStart();
        // Bytes that nobody reads would be taken for the next request.
        if (!limit || isTooLarge(request, *limit) || isUnfit(request) || isAmbiguous(request) ||
            (takesBody(request) && !hasLength(request)) ||
            (hasBody(request) && (!takesBody(request) || request.path.size() > longestPath)))
            client.closeAfterAnswer();
    };
    const bool answered = process_request(client, mStopping, isClosed, headArrived);
    const bool flushed = client.flush();
    return isUnderstood && answered && flushed && !isClosed && !client.isBroken();
}
