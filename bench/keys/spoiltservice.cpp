#include "keys/spoiltservice.h"

#include "endtoend/relay.h"

#include <QRandomGenerator>

namespace {

using Behaviour = MisbehavingServer::Behaviour;

QVector<Behaviour> misbehaviours()
{
    const QByteArray half = "{\"feed\":{\"entry\":[{";
    return {MisbehavingServer::silence(),
            MisbehavingServer::answer("{}", 401),
            MisbehavingServer::answer("{}", 403),
            MisbehavingServer::answer("{}", 404),
            MisbehavingServer::answer("oops", 500),
            MisbehavingServer::answer(""),
            MisbehavingServer::answer("{\"feed\":{\"entry\":{\"$t\":7},\"openSearch$totalResults\":"
                                      "{\"$t\":\"-3\"}}}"),
            MisbehavingServer::answer("{\"feed\":{\"entry\":[null,1,[],{}],"
                                      "\"openSearch$totalResults\":{\"$t\":99999}}}"),
            MisbehavingServer::html(),
            MisbehavingServer::redirect("/elsewhere"),
            MisbehavingServer::drip(half + half, 7, 20),
            MisbehavingServer::reset(),
            MisbehavingServer::cut(half, 5000),
            MisbehavingServer::badChunks(),
            MisbehavingServer::cutGzip(half),
            MisbehavingServer::gzipBomb(40)};
}

} // namespace

SpoiltService::SpoiltService(quint16 service, quint32 seed)
    : mService(service)
    , mSeed(seed)
{
    start();
    while (!mIsReady)
        msleep(1);
}

SpoiltService::~SpoiltService()
{
    quit();
    wait();
}

void SpoiltService::closeConnections()
{
    QMetaObject::invokeMethod(
        mServer, [this] { static_cast<MisbehavingServer *>(mServer)->closeConnections(); },
        Qt::BlockingQueuedConnection);
}

void SpoiltService::run()
{
    MisbehavingServer server(MisbehavingServer::Tls);
    QRandomGenerator random(mSeed);
    const QVector<Behaviour> bad = misbehaviours();
    const Behaviour good = forwardTo(mService);
    server.otherwise([&](QTcpSocket *client, const MisbehavingServer::Request &request) {
        const bool isSpoilt = random.bounded(3) == 0;
        mSpoilt += isSpoilt;
        (isSpoilt ? bad.at(random.bounded(bad.size())) : good)(client, request);
        server.forgetRequests();
    });
    mServer = &server;
    mUrl = server.url({});
    mIsReady = true;
    exec();
}
