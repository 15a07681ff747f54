#include "pictures/wholefile.h"
#include "support/testservice.h"

#include "http/accesslog.h"

#include <gtest/gtest.h>

#include <arpa/inet.h>
#include <sys/socket.h>

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
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(device);
        ::bind(mSocket, reinterpret_cast<sockaddr *>(&address), sizeof address);
        address.sin_port = htons(static_cast<std::uint16_t>(port));
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        mConnected =
            ::connect(mSocket, reinterpret_cast<sockaddr *>(&address), sizeof address) == 0;
    }
    ~RawClient() { ::close(mSocket); }

    bool isConnected() const { return mConnected; }
    bool send(const std::string &bytes)
    {
        return ::send(mSocket, bytes.data(), bytes.size(), MSG_NOSIGNAL) ==
               static_cast<ssize_t>(bytes.size());
    }
    // All that comes until the server closes the connection.
    std::string readToEnd()
    {
        std::string text;
        char bytes[4096];
        for (ssize_t n; (n = ::recv(mSocket, bytes, sizeof bytes, 0)) > 0;)
            text.append(bytes, n);
        return text;
    }
    // Reads until so many answers have begun.
    std::string readAnswers(int count)
    {
        std::string text;
        char bytes[4096];
        while (answersIn(text) < count) {
            const ssize_t n = ::recv(mSocket, bytes, sizeof bytes, 0);
            if (n <= 0)
                break;
            text.append(bytes, n);
        }
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
    bool mConnected;
};

class Http : public testing::Test, protected TestService
{
protected:
    std::string answerTo(const std::string &request)
    {
        RawClient client(service().port());
        client.send(request);
        return client.readToEnd().substr(0, 12);
    }
};

const std::string closing = "Host: x\r\nConnection: close\r\n\r\n";
const std::string page = "GET /data/feed/api/featured HTTP/1.1\r\n";

} // namespace

TEST_F(Http, oddRequestsGetClearAnswers)
{
    start();
    const std::string answer = "HTTP/1.1 ";
    EXPECT_EQ(answerTo(page + closing), answer + "200");
    EXPECT_EQ(answerTo("NONSENSE\r\n\r\n").substr(0, 9), answer);
    EXPECT_EQ(answerTo("GET /" + std::string(9000, 'a') + " HTTP/1.1\r\n" + closing),
              answer + "414");
    EXPECT_EQ(answerTo("GET /" + std::string(2000, 'a') + " HTTP/1.1\r\n" + closing),
              answer + "414");
    EXPECT_EQ(answerTo("GET /nowhere HTTP/1.1\r\n" + closing), answer + "404");
    EXPECT_EQ(answerTo("DELETE /data/feed/api/featured HTTP/1.1\r\n" + closing), answer + "405");
    EXPECT_EQ(answerTo("POST /o/oauth2/token HTTP/1.1\r\nContent-Length: 99999999\r\n" + closing),
              answer + "413");
    const std::string post = "POST /o/oauth2/token HTTP/1.1\r\n";
    EXPECT_EQ(answerTo(post + "Content-Length: -5\r\n" + closing), answer + "413");
    EXPECT_EQ(answerTo(post + closing), answer + "411");
    EXPECT_EQ(answerTo(post + "Content-Length: 3\r\nContent-Encoding: gzip\r\n" + closing + "abc"),
              answer + "415");
    EXPECT_EQ(answerTo(post + "Content-Length: 3\r\nContent-Type: multipart/form-data\r\n" +
                       closing + "abc"),
              answer + "415");
    EXPECT_EQ(answerTo(post + "Content-Length: 3\r\nContent-Length: 30\r\n" + closing + "abc"),
              answer + "400");
    EXPECT_EQ(answerTo(post + "Content-Length: 30\r\nTransfer-Encoding: chunked\r\n" + closing),
              answer + "400");
    std::string chunks = post + "Transfer-Encoding: chunked\r\n" + closing;
    for (int i = 0; i < 20; ++i)
        chunks += "10000\r\n" + std::string(65536, 'x') + "\r\n";
    EXPECT_EQ(answerTo(chunks + "0\r\n\r\n"), answer + "413");
    EXPECT_EQ(answerTo(page + "Range: bytes=0-1\r\n" + closing), answer + "200");
    EXPECT_EQ(get("/data/feed/api/featured?x=%zz%&&=&a")->status, 200);
}

TEST_F(Http, endlessHeadersAreCutOff)
{
    start();
    RawClient client(service().port());
    client.send(page);
    const std::string line = "X: " + std::string(1000, 'x') + "\r\n";
    int lines = 0;
    while (lines < 100'000 && client.send(line))
        ++lines;
    EXPECT_LT(lines, 100'000);
    RawClient other(service().port());
    other.send(std::string(1000, 'x'));
    int pieces = 0;
    while (pieces < 100'000 && other.send(line.substr(0, 1000)))
        ++pieces;
    EXPECT_LT(pieces, 100'000);
}

TEST_F(Http, aBodyThatNobodyReadsIsNoNextRequest)
{
    start();
    RawClient client(service().port());
    const std::string hidden = page + closing;
    client.send(page + "Host: x\r\nContent-Length: " + std::to_string(hidden.size()) + "\r\n\r\n" +
                hidden);
    EXPECT_EQ(RawClient::answersIn(client.readToEnd()), 1);
}

TEST_F(Http, requestsSentAheadAreAllAnswered)
{
    start();
    RawClient client(service().port());
    const std::string request = page + "Host: x\r\n\r\n";
    client.send(request + request + request.substr(0, 10));
    EXPECT_EQ(RawClient::answersIn(client.readAnswers(2)), 2);
    client.send(request.substr(10));
    EXPECT_EQ(RawClient::answersIn(client.readAnswers(1)), 1);
}

TEST_F(Http, silentClientsCostNobodyElse)
{
    start(true);
    std::vector<std::unique_ptr<RawClient>> silent;
    for (int i = 0; i < 300; ++i) {
        silent.push_back(std::make_unique<RawClient>(service().port()));
        ASSERT_TRUE(silent.back()->isConnected());
    }
    std::atomic<int> good{0};
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i) {
        threads.emplace_back([&] {
            httplib::SSLClient client("127.0.0.1", service().port());
            client.enable_server_certificate_verification(false);
            client.set_keep_alive(true);
            for (int n = 0; n < 25; ++n) {
                const auto answer = client.Get("/data/feed/api/featured");
                good += answer && answer->status == 200 && answer->body.back() == '}';
            }
        });
    }
    for (std::thread &thread : threads)
        thread.join();
    EXPECT_EQ(good, 8 * 25);
    // And with all of them open the service stops at once.
    const auto start = Clock::now();
    stop();
    EXPECT_LT(Clock::now() - start, std::chrono::seconds(1));
}

TEST_F(Http, slowClientsCostNobodyElse)
{
    start();
    std::vector<std::unique_ptr<RawClient>> slow;
    for (int i = 0; i < 200; ++i) { // more than there are threads
        slow.push_back(std::make_unique<RawClient>(service().port(), INADDR_LOOPBACK + 1));
        ASSERT_TRUE(slow.back()->send(
            i % 2 ? page + "Host: x\r\nX: "
                  : "POST /o/oauth2/token HTTP/1.1\r\nContent-Length: 100\r\n\r\nx"));
    }
    const auto start = Clock::now();
    EXPECT_EQ(statusOf("/data/feed/api/featured"), 200);
    stop();
    EXPECT_LT(Clock::now() - start, std::chrono::seconds(1));
}

TEST_F(Http, theCertificateIsMadeOnceAndPrivate)
{
    namespace fs = std::filesystem;
    start(true);
    stop();
    const std::string certificate = readWholeFile(file("data/certificate.pem"));
    EXPECT_EQ(fs::status(file("data/certificate.pem")).permissions(),
              fs::perms::owner_read | fs::perms::owner_write);
    EXPECT_EQ(fs::status(file("data/index.db")).permissions(),
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

TEST(AccessLog, cutsSecretsOut)
{
    EXPECT_EQ(withoutSecrets("/user/1?kind=tag&access_token=abc&alt=json"),
              "/user/1?kind=tag&access_token=***&alt=json");
    EXPECT_EQ(withoutSecrets("/a?acc%65ss_token=abc"), "/a?acc%65ss_token=***");
    EXPECT_EQ(withoutSecrets("/a?code=x&&q=1?"), "/a?code=***&&q=1?");
    EXPECT_EQ(withoutSecrets("/photos/kEy-1/s336/Sea.jpg?password=x"),
              "/photos/***/s336/Sea.jpg?password=***");
    EXPECT_EQ(withoutSecrets("/photos/kEy-1"), "/photos/***");
    EXPECT_EQ(withoutSecrets("/plain"), "/plain");
}
