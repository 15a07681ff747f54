#include "shellserver.h"

#include "platform/localsocket.h"

#include <QFile>

#include <sys/socket.h>
#include <sys/stat.h>

#include <algorithm>

using localsocket::Received;

ShellServer::Client::Client(int fd)
    : socket(fd)
    , notifier(fd, QSocketNotifier::Read)
{
}

ShellServer::ShellServer(QObject *parent)
    : QObject(parent)
{
}

ShellServer::~ShellServer()
{
    if (mListener.isOpen())
        QFile::remove(mPath);
}

bool ShellServer::listen(const QString &path)
{
    const std::string name = QFile::encodeName(path).toStdString();
    mListener = localsocket::listenAt(name);
    if (!mListener.isOpen())
        return false;
    mPath = path;
    ::chmod(name.c_str(), S_IRUSR | S_IWUSR);
    mNotifier = std::make_unique<QSocketNotifier>(mListener.get(), QSocketNotifier::Read);
    connect(mNotifier.get(), &QSocketNotifier::activated, this, [this] { acceptClient(); });
    return true;
}

int ShellServer::sendExit()
{
    return sendToAll({netcommon::MSG_EXIT, {1, 0}});
}

int ShellServer::sendTimeZone(int hours)
{
    mTimeZone = hours;
    return sendToAll({netcommon::MSG_TIME_ZONE, {hours}});
}

void ShellServer::acceptClient()
{
    const int fd = ::accept4(mListener.get(), nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC);
    if (fd < 0)
        return;
    mClients.push_back(std::make_unique<Client>(fd));
    Client *client = mClients.back().get();
    connect(&client->notifier, &QSocketNotifier::activated, this,
            [this, client] { readFrom(client); });
    emit connected();
    if (mTimeZone)
        localsocket::send(fd, {netcommon::MSG_TIME_ZONE, {*mTimeZone}});
}

void ShellServer::readFrom(Client *client)
{
    _NETWORK_MSG_T message = {};
    for (;;) {
        switch (localsocket::receive(client->socket.get(), &message)) {
        case Received::Message:
            handle(message);
            break;
        case Received::Ignored:
            break;
        case Received::Nothing:
            return;
        case Received::Closed:
            drop(client);
            return;
        }
    }
}

void ShellServer::handle(const _NETWORK_MSG_T &message)
{
    emit received(message);
    if (message.type == netcommon::MSG_REQUEST_EXIT)
        sendExit();
}

void ShellServer::drop(Client *client)
{
    // This runs in a slot of the client's notifier, which must outlive it.
    const auto found = std::find_if(mClients.begin(), mClients.end(),
                                    [client](const auto &owned) { return owned.get() == client; });
    client->notifier.setEnabled(false);
    Client *gone = found->release();
    mClients.erase(found);
    QMetaObject::invokeMethod(
        this, [gone] { delete gone; }, Qt::QueuedConnection);
    emit disconnected();
}

int ShellServer::sendToAll(const _NETWORK_MSG_T &message)
{
    return int(std::count_if(mClients.begin(), mClients.end(), [&message](const auto &client) {
        return localsocket::send(client->socket.get(), message);
    }));
}
