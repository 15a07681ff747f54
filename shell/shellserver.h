#pragma once

#include "platform/filedescriptor.h"
#include "platform/ipc.h"

#include <QObject>
#include <QSocketNotifier>
#include <QString>

#include <memory>
#include <optional>
#include <vector>

// The menu shell's end of the messages: listens at a path and speaks to every program that
// connects. Asked for the program's end, it grants it at once. The socket file goes with the
// server.
class ShellServer : public QObject
{
    Q_OBJECT

public:
    explicit ShellServer(QObject *parent = nullptr);
    ~ShellServer() override;

    // False, with errno set, when nothing can listen there.
    bool listen(const QString &path);

    // Each returns how many programs the message went to.
    int sendExit();
    // The zone also goes to every program that connects later.
    int sendTimeZone(int hours);

signals:
    void connected();
    void disconnected();
    void received(const _NETWORK_MSG_T &message);

private:
    struct Client
    {
        FileDescriptor socket;
        QSocketNotifier notifier;
        explicit Client(int fd);
    };

    void acceptClient();
    void readFrom(Client *client);
    void handle(const _NETWORK_MSG_T &message);
    void drop(Client *client);
    int sendToAll(const _NETWORK_MSG_T &message);

    QString mPath;
    FileDescriptor mListener;
    std::unique_ptr<QSocketNotifier> mNotifier;
    std::vector<std::unique_ptr<Client>> mClients;
    std::optional<int> mTimeZone;
};
