// A page of eight pictures over warm HTTPS sockets, five at once, against libcurl doing the same.
#include "network/connection.h"
#include "network/systemconfig.h"
#include "support/bench.h"
#include "support/misbehavingserver.h"

#include <QCoreApplication>
#include <QSemaphore>
#include <QThread>

#include <curl/curl.h>

#include <cstdlib>

namespace {

constexpr int pageSize = 8;
constexpr int atOnce = 5;
constexpr int pictureBytes = 12000;

QStringList waiting;
int finished = 0;

void load(Connection *connection);

void ended(QString url, CallbackType type, int)
{
    if (type == CALLBACK_ERROR)
        std::abort();
    if (type != CALLBACK_FINISHED)
        return;
    ++finished;
    Connection *connection = Connection::findConnection(url);
    QByteArray body(int(connection->getAvailable()), '\0');
    if (connection->readData(body.data(), body.size()) != pictureBytes)
        std::abort();
    load(connection);
}

// As the photo manager does: a connection that has become free takes the next picture.
void load(Connection *connection)
{
    if (waiting.isEmpty())
        Connection::removeConnection(connection);
    else
        connection->get(waiting.takeFirst());
}

void pageByConnections(const QStringList &urls)
{
    waiting = urls;
    finished = 0;
    for (int i = 0; i < atOnce; ++i) {
        Connection *connection = Connection::createConnection();
        connection->setCallback(ended);
        load(connection);
    }
    while (finished < pageSize)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

size_t append(char *data, size_t size, size_t count, void *body)
{
    static_cast<std::string *>(body)->append(data, size * count);
    return size * count;
}

void pageByCurl(CURLM *multi, const QStringList &urls)
{
    std::string bodies[pageSize];
    CURL *easy[pageSize];
    for (int i = 0; i < pageSize; ++i) {
        easy[i] = curl_easy_init();
        curl_easy_setopt(easy[i], CURLOPT_URL, urls[i].toUtf8().constData());
        curl_easy_setopt(easy[i], CURLOPT_SSL_VERIFYPEER, 0L);
        curl_easy_setopt(easy[i], CURLOPT_SSL_VERIFYHOST, 0L);
        curl_easy_setopt(easy[i], CURLOPT_WRITEFUNCTION, append);
        curl_easy_setopt(easy[i], CURLOPT_WRITEDATA, &bodies[i]);
        curl_multi_add_handle(multi, easy[i]);
    }
    int running = 1;
    while (running) {
        curl_multi_perform(multi, &running);
        if (running)
            curl_multi_poll(multi, nullptr, 0, 100, nullptr);
    }
    for (int i = 0; i < pageSize; ++i) {
        if (bodies[i].size() != pictureBytes)
            std::abort();
        curl_multi_remove_handle(multi, easy[i]);
        curl_easy_cleanup(easy[i]);
    }
}

// The server, on a thread of its own.
class ServerThread : public QThread
{
public:
    QString origin() const { return mOrigin; }
    void begin()
    {
        start();
        mReady.acquire();
    }
    ~ServerThread() override
    {
        quit();
        wait();
    }

private:
    void run() override
    {
        MisbehavingServer server(MisbehavingServer::Tls);
        const auto picture = MisbehavingServer::answer(QByteArray(pictureBytes, 'x'));
        for (int i = 0; i < pageSize; ++i)
            server.on("/" + QByteArray::number(i), picture);
        mOrigin = server.url({});
        mReady.release();
        exec();
    }

    QString mOrigin;
    QSemaphore mReady;
};

} // namespace

int main(int argc, char **argv)
{
    QCoreApplication application(argc, argv);
    SystemConfig::setConfigFile(QStringLiteral("absent.ini"));
    ServerThread server;
    server.begin();
    QStringList urls;
    for (int i = 0; i < pageSize; ++i)
        urls << server.origin() + '/' + QString::number(i);

    CURLM *multi = curl_multi_init();
    curl_multi_setopt(multi, CURLMOPT_MAX_TOTAL_CONNECTIONS, long(atOnce));
    const auto ours = [&] { pageByConnections(urls); };
    const bench::Comparison warm = bench::compare(60, ours, [&] { pageByCurl(multi, urls); });
    bench::row("page of 8 over warm HTTPS, against libcurl", warm.ratio, 0,
               bench::milliseconds(warm));
    curl_multi_cleanup(multi);

    const auto cold = [&] {
        Connection::closeIdleSockets();
        ours();
    };
    const bench::Comparison parked = bench::compare(30, ours, cold);
    bench::row("page of 8 over parked sockets, against new ones", parked.ratio, 0,
               bench::milliseconds(parked));
    return 0;
}
