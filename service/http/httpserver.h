#pragma once

#include "http/certificate.h"
#include "http/parking.h"
#include "http/router.h"
#include "http/turns.h"

#include <httplib.h>

#include <atomic>
#include <optional>

// The HTTP library's server on connections of our own: a client that keeps its connection open
// costs no thread while it is silent, none can take all threads, and stopping waits for nobody.
//
//   listener --> Parking --(has something to say)--> worker: handshake, requests, answers
//                   ^                                   |
//                   '------------(nothing more)---------'
class HttpServer : private httplib::Server
{
public:
    struct Settings
    {
        std::string address;
        int port = 0;               // 0: a free one
        int threads = 64;           // requests at the same time; a quarter of them for one address
        SSL_CTX *context = nullptr; // no TLS without one
        // Whether something failed because there is no room on the disk.
        std::function<bool(const std::exception &)> isStorageFull;
    };

    HttpServer(const Router &router, const Settings &settings);
    ~HttpServer() override;

    // Starts to answer; false when the address is taken or not ours.
    bool start();
    int port() const { return mPort; }
    void stop();

private:
    using Client = Parking::Client;

    bool process_and_close_socket(socket_t socket) override;
    void setUp();
    void serve(Client client);
    void serveRequests(const Client &client);
    bool serveRequest(ClientStream &client);
    std::optional<std::size_t> limitOf(const httplib::Request &request) const;
    HandlerResponse takeBody(const httplib::Request &request, httplib::Response &response);
    void post(const httplib::Request &request, httplib::Response &response,
              const httplib::ContentReader &reader);
    void explainException(httplib::Response &response, const std::exception_ptr &what) const;

    const Router &mRouter;
    const Settings mSettings;
    const int mStopEvent;
    int mPort = 0;
    httplib::TaskQueue *mWorkers = nullptr; // owned by the library while it listens
    std::atomic<bool> mStopping{false};
    Turns mTurns;
    std::unique_ptr<Parking> mParking;
    std::thread mListener;
};
