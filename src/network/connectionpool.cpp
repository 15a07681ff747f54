// The process-wide pool of connections.
#include "network/connection.h"

#include "network/managerpark.h"
#include "network/systemconfig.h"

#include <QCoreApplication>

namespace {

QList<Connection *> &pool()
{
    static QList<Connection *> connections;
    return connections;
}

// A request that still runs at the program's end goes before the application object does.
void deleteAtExit()
{
    static bool isRegistered = false;
    if (isRegistered)
        return;
    isRegistered = true;
    qAddPostRoutine([] {
        isRegistered = false;
        qDeleteAll(QList<Connection *>(pool()));
    });
}

} // namespace

Connection *Connection::createConnection()
{
    deleteAtExit();
    auto *connection = new Connection;
    pool().append(connection);
    return connection;
}

Connection *Connection::createConnection(const QString &proxy)
{
    Connection *connection = createConnection();
    connection->setProxy(proxy);
    return connection;
}

Connection *Connection::createConnection(const QString &host, const QString &port)
{
    Connection *connection = createConnection();
    connection->setProxy(host, port);
    return connection;
}

Connection *Connection::createConfiguredConnection()
{
    const QString proxy = SystemConfig::proxyAddress();
    return proxy.size() > 1 ? createConnection(proxy) : createConnection();
}

Connection *Connection::findConnection(const QString &url)
{
    for (Connection *connection : qAsConst(pool())) {
        if (connection->mUrl == url)
            return connection;
    }
    return nullptr;
}

void Connection::leavePool()
{
    pool().removeOne(this);
}

bool Connection::removeConnection(Connection *connection)
{
    if (!pool().removeOne(connection))
        return false;
    connection->release();
    return true;
}

void Connection::removeAllConnections()
{
    const QList<Connection *> connections = pool();
    pool().clear();
    for (Connection *connection : connections)
        connection->release();
}

void Connection::clearConnections()
{
    pool().clear();
}

void Connection::closeIdleSockets()
{
    ManagerPark::clear();
}
