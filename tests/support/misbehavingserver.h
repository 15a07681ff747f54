#pragma once

#include <QByteArray>
#include <QHash>
#include <QList>
#include <QTcpServer>

#include <functional>

class QTcpSocket;

// A small HTTP/1.1 server on a free loopback port that answers as badly as it is told:
//
//   MisbehavingServer server;                            // or server(MisbehavingServer::Tls)
//   server.on("/feed", MisbehavingServer::answer("{}")); // by path, query left out
//   server.enqueue(MisbehavingServer::reset());          // the next request, whatever its path
//   connection->get(server.url("/feed"));
//   QTRY_COMPARE(server.requests().size(), 1);
//
// Queued behaviours come before those by path; any other path gets a 404, or otherwise().
// Connections stay open after an answer unless the behaviour closes them. It runs in the event loop
// of its thread.
class MisbehavingServer : public QTcpServer
{
    Q_OBJECT

public:
    struct Request
    {
        QByteArray method;
        QByteArray path;                       // with the query
        QHash<QByteArray, QByteArray> headers; // names in lower case
        QByteArray body;
    };
    using Headers = QList<QPair<QByteArray, QByteArray>>;
    using Behaviour = std::function<void(QTcpSocket *, const Request &)>;
    enum Transport { Plain, Tls }; // Tls: with a self-signed certificate

    explicit MisbehavingServer(Transport transport = Plain);

    void on(const QByteArray &path, const Behaviour &behaviour) { mByPath[path] = behaviour; }
    void otherwise(const Behaviour &behaviour) { mOtherwise = behaviour; }
    void enqueue(const Behaviour &behaviour) { mQueue.append(behaviour); }

    QString url(const QString &path) const; // absolute, with the port
    const QList<Request> &requests() const { return mRequests; }
    void forgetRequests() { mRequests.clear(); }
    int connections() const { return mConnections; } // accepted so far
    int openConnections() const;
    void closeConnections(); // from the server's side

    // Well-behaved.
    static Behaviour answer(const QByteArray &body, int status = 200, const Headers &headers = {});
    static Behaviour html(int status = 200); // a page where a feed is expected
    static Behaviour redirect(const QByteArray &target, int status = 302);
    static Behaviour chunked(const QByteArray &body);
    static Behaviour gzip(const QByteArray &body);

    // Slow.
    static Behaviour silence(); // takes the request and never answers
    static Behaviour drip(const QByteArray &body, int bytesAtOnce, int milliseconds);

    // Broken.
    static Behaviour reset();                                         // closed without a byte
    static Behaviour cut(const QByteArray &body, qint64 claimed);     // closed before that length
    static Behaviour badChunks();                                     // a size that is no number
    static Behaviour cutGzip(const QByteArray &body);                 // the second half is missing
    static Behaviour gzipBomb(int megabytes);                         // about 1 kB for each
    static Behaviour raw(const QByteArray &bytes, bool close = true); // anything at all

protected:
    void incomingConnection(qintptr descriptor) override;

private:
    void read(QTcpSocket *socket);
    bool takeRequest(QByteArray &buffer, Request &request);
    Behaviour behaviourFor(const Request &request);

    const Transport mTransport;
    QHash<QByteArray, Behaviour> mByPath;
    QList<Behaviour> mQueue;
    Behaviour mOtherwise = answer("not here", 404);
    QList<Request> mRequests;
    QHash<QTcpSocket *, QByteArray> mBuffers; // of the open connections
    int mConnections = 0;
};

Q_DECLARE_METATYPE(MisbehavingServer::Behaviour)
