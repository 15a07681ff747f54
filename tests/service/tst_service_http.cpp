#include "pictures/wholefile.h"
#include "support/testservice.h"

#include "http/accesslog.h"
#include "http/httpserver.h"

#include <gtest/gtest.h>

#include <arpa/inet.h>
#include <sys/socket.h>

#include <future>
#include <thread>

namespace {

using Clock = std::chrono::steady_clock;

// A bare connection, for what no well-behaved client sends.
class RawClient
{
public:
    // `device`: which of the loopback addresses it comes from.
    explicit RawClient(int port, std::uint32_t device = INADDR_LOOPBACK)
        : mSocket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0))
    {
        sockaddr_in address{};
        const auto *bare = reinterpret_cast<const sockaddr *>(&address);
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(device);
        EXPECT_EQ(::bind(mSocket, bare, sizeof address), 0);
        address.sin_port = htons(static_cast<std::uint16_t>(port));
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        EXPECT_EQ(::connect(mSocket, bare, sizeof address), 0);
    }
    ~RawClient() { ::close(mSocket); }

    bool send(const std::string &bytes)
    {
        return ::send(mSocket, bytes.data(), bytes.size(), MSG_NOSIGNAL) ==
               static_cast<ssize_t>(bytes.size());
    }
    // How often it takes the bytes until the server closes the connection.
    int sendOften(const std::string &bytes)
    {
        int count = 0;
        while (count < 100'000 && send(bytes))
            ++count;
        return count;
    }
    // Until so many answers have begun, or the server closes the connection.
    std::string read(int answers)
    {
        std::string text;
        char bytes[4096];
        for (ssize_t n; answersIn(text) < answers && (n = ::recv(mSocket, bytes, 4096, 0)) > 0;)
            text.append(bytes, n);
        return text;
    }
    static int answersIn(const std::string &text)
    {
        int count = 0;
        for (std::size_t at = 0; (at = text.find("HTTP/1.1 ", at)) != std::string::npos; ++at)
            ++count;
        return count;
    }

private:
    int mSocket;
};

class Http : public testing::Test, protected TestService
{
protected:
    std::string answerTo(const std::string &request)
    {
        RawClient client(service().port());
        client.send(request);
        return client.read(2).substr(0, 12);
    }
};

const std::string closing = "Host: x\r\nConnection: close\r\n\r\n";
const std::string page = "GET /data/feed/api/featured HTTP/1.1\r\n";
const std::string tokenPost = "POST /o/oauth2/token HTTP/1.1\r\n";

} // namespace

TEST_F(Http, oddRequestsGetClearAnswers)
{
    start();
    std::string chunks = "Transfer-Encoding: chunked\r\n" + closing;
    for (int i = 0; i < 20; ++i)
        chunks += "10000\r\n" + std::string(65536, 'x') + "\r\n";
    const std::string length = "Content-Length: 3\r\n", end = closing + "abc";
    const std::pair<std::string, const char *> rows[] = {
        {page + closing, "200"},
        {page + "Range: bytes=0-1\r\n" + closing, "200"},
        {"GET /data/feed/api/featured?x=%zz%&&=&a HTTP/1.1\r\n" + closing, "200"},
        {"NONSENSE\r\n\r\n", "400"},
        {"GET /" + std::string(9000, 'a') + " HTTP/1.1\r\n" + closing, "414"},
        {"GET /" + std::string(2000, 'a') + " HTTP/1.1\r\n" + closing, "414"},
        {"GET /nowhere HTTP/1.1\r\n" + closing, "404"},
        {"DELETE /data/feed/api/featured HTTP/1.1\r\n" + closing, "405"},
        {tokenPost + "Content-Length: 99999999\r\n" + closing, "413"},
        {tokenPost + "Content-Length: -5\r\n" + closing, "413"},
        {tokenPost + chunks + "0\r\n\r\n", "413"},
        {tokenPost + closing, "411"},
        {tokenPost + length + "Content-Encoding: gzip\r\n" + end, "415"},
        {tokenPost + length + "Content-Type: multipart/form-data\r\n" + end, "415"},
        {tokenPost + length + "Content-Length: 30\r\n" + end, "400"},
        {tokenPost + length + "Transfer-Encoding: chunked\r\n" + end, "400"}};
    for (const auto &[request, status] : rows)
        EXPECT_EQ(answerTo(request), std::string("HTTP/1.1 ") + status) << request.substr(0, 99);
    const std::string line = "X: " + std::string(1000, 'x') + "\r\n";
    RawClient headers(service().port()), lines(service().port());
    headers.send(page);
    EXPECT_LT(headers.sendOften(line), 100'000);
    EXPECT_LT(lines.sendOften(line.substr(0, 1000)), 100'000);
}

TEST_F(Http, everyRequestIsAnsweredOnce)
{
    start();
    const std::string request = page + "Host: x\r\n\r\n", hidden = page + closing;
    RawClient client(service().port()), other(service().port());
    client.send(request + request + request.substr(0, 10)); // sent ahead
    EXPECT_EQ(RawClient::answersIn(client.read(2)), 2);
    client.send(request.substr(10));
    EXPECT_EQ(RawClient::answersIn(client.read(1)), 1);
    // A body that nobody reads is no next request.
    other.send(page + "Host: x\r\nContent-Length: " + std::to_string(hidden.size()) + "\r\n\r\n" +
               hidden);
    EXPECT_EQ(RawClient::answersIn(other.read(9)), 1);
}

TEST_F(Http, silentAndSlowClientsCostNobodyElse)
{
    for (const bool withTls : {true, false}) {
        start(withTls);
        const int port = service().port();
        std::vector<std::unique_ptr<RawClient>> others(300); // more than there are threads
        for (std::unique_ptr<RawClient> &other : others)
            other = std::make_unique<RawClient>(port, INADDR_LOOPBACK + 1);
        for (int i = 0; i < 200; ++i)
            others[i]->send(i % 2 ? page + "Host: x\r\nX: "
                                  : tokenPost + "Content-Length: 99\r\n\r\nx");
        const auto ask = [&] { // 25 times on one connection
            httplib::Client client((withTls ? "https" : "http") + std::string("://127.0.0.1:") +
                                   std::to_string(port));
            client.enable_server_certificate_verification(false);
            client.set_keep_alive(true);
            int good = 0;
            for (int n = 0; n < 25; ++n) {
                const auto answer = client.Get(feedBase + "featured");
                good += answer && answer->status == 200 && answer->body.back() == '}';
            }
            return good;
        };
        std::vector<std::future<int>> clients(8);
        for (std::future<int> &client : clients)
            client = std::async(std::launch::async, ask);
        for (std::future<int> &client : clients)
            EXPECT_EQ(client.get(), 25);
        // And with all of them open the service stops at once.
        const auto start = Clock::now();
        stop();
        EXPECT_LT(Clock::now() - start, std::chrono::seconds(1));
    }
}

TEST_F(Http, theCertificateIsMadeOnceAndPrivate)
{
    start(true);
    stop();
    const std::string certificate = readWholeFile(file("data/certificate.pem"));
    for (const char *name : {"data/certificate.pem", "data/index.db"})
        EXPECT_EQ(fs::status(file(name)).permissions(),
                  fs::perms::owner_read | fs::perms::owner_write);
    start(true);
    EXPECT_EQ(readWholeFile(file("data/certificate.pem")), certificate);
    std::string error;
    ServiceSettings second;
    second.data = file("data");
    EXPECT_FALSE(Service::start(second, &error)); // one service to a data folder
    second.data = file("other");
    second.port = service().port();
    EXPECT_FALSE(Service::start(second, &error));
    second.certificate = file("data/index.db");
    EXPECT_FALSE(Service::start(second, &error));
}

TEST_F(Http, aFailureCostsOneAnswer)
{
    Router router;
    router.addReader(
        "upload", [](const Router::Call &, httplib::Response &) {},
        [](const Router::Call &, httplib::Response &) -> std::size_t {
            throw std::runtime_error("the index is away");
        });
    HttpServer::Settings settings;
    settings.address = "127.0.0.1";
    HttpServer server(router, settings);
    ASSERT_TRUE(server.start());
    httplib::Client client("127.0.0.1", server.port());
    EXPECT_EQ(client.Post("/upload", "x", "text/plain")->status, 500);
    EXPECT_EQ(client.Get("/")->status, 404);
}

TEST_F(Http, aFailedHandshakeCostsNobodyElse)
{
    threads = 1; // so that they share it
    start(true);
    httplib::SSLClient client("127.0.0.1", service().port());
    client.enable_server_certificate_verification(false);
    client.set_keep_alive(true);
    for (int i = 0; i < 5; ++i) {
        RawClient other(service().port());
        other.send(page + closing);
        other.read(1);
        const auto answer = client.Post("/o/oauth2/token", std::string(500'000, 'x'), "text/plain");
        EXPECT_EQ(answer ? answer->status : 0, 401);
    }
}

TEST(AccessLog, cutsSecretsOut)
{
    const std::pair<const char *, const char *> rows[] = {
        {"/user/1?kind=tag&access_token=abc&alt=json",
         "/user/1?kind=tag&access_token=***&alt=json"},
        {"/a?acc%65ss_token=abc", "/a?acc%65ss_token=***"},
        {"/a?%u0061ccess_token=abc", "/a?%u0061ccess_token=***"},
        {"/a?code=x&&q=1?", "/a?code=***&&q=1?"},
        {"/photos/kEy-1/s336/Sea.jpg?password=x", "/photos/***/s336/Sea.jpg?password=***"},
        {"/photos/kEy-1", "/photos/***"},
        {"/plain", "/plain"}};
    for (const auto &[target, written] : rows)
        EXPECT_EQ(withoutSecrets(target), written);
}
