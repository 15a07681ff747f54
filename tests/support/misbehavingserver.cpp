#include "support/misbehavingserver.h"

#include "support/testcertificate.h"

#include <QSslCertificate>
#include <QSslKey>
#include <QSslSocket>
#include <QTimer>

#include <zlib.h>

namespace {

using Headers = MisbehavingServer::Headers;

QByteArray head(int status, const Headers &headers)
{
    QByteArray text = "HTTP/1.1 " + QByteArray::number(status) + " Status\r\n";
    for (const auto &header : headers)
        text += header.first + ": " + header.second + "\r\n";
    return text + "\r\n";
}

QByteArray message(int status, Headers headers, const QByteArray &body)
{
    headers.append({"Content-Length", QByteArray::number(body.size())});
    return head(status, headers) + body;
}

// The members of a gzip stream: each text ends on a byte, so that it can be repeated.
QByteArray compressed(const QByteArray &text, int flush)
{
    constexpr int gzipFormat = 15 + 16;
    z_stream stream = {};
    deflateInit2(&stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, gzipFormat, 8, Z_DEFAULT_STRATEGY);
    QByteArray out(int(deflateBound(&stream, uLong(text.size()))) + 64, '\0');
    stream.next_in = reinterpret_cast<Bytef *>(const_cast<char *>(text.constData()));
    stream.avail_in = uInt(text.size());
    stream.next_out = reinterpret_cast<Bytef *>(out.data());
    stream.avail_out = uInt(out.size());
    deflate(&stream, flush);
    out.resize(int(stream.total_out));
    deflateEnd(&stream);
    return out;
}

QByteArray bomb(int megabytes)
{
    constexpr int headerSize = 10;
    const QByteArray first = compressed(QByteArray(1 << 20, '\0'), Z_FULL_FLUSH);
    return first + first.mid(headerSize).repeated(megabytes - 1);
}

const Headers gzipHeaders = {{"Content-Encoding", "gzip"}, {"Content-Type", "application/json"}};

} // namespace

MisbehavingServer::MisbehavingServer(Transport transport)
    : mTransport(transport)
{
    listen(QHostAddress::LocalHost);
}

QString MisbehavingServer::url(const QString &path) const
{
    const QString scheme = mTransport == Tls ? QStringLiteral("https") : QStringLiteral("http");
    return QStringLiteral("%1://127.0.0.1:%2%3").arg(scheme).arg(serverPort()).arg(path);
}

int MisbehavingServer::openConnections() const
{
    return mBuffers.size();
}

void MisbehavingServer::closeConnections()
{
    const QList<QTcpSocket *> sockets = mBuffers.keys();
    for (QTcpSocket *socket : sockets)
        socket->abort();
}

void MisbehavingServer::incomingConnection(qintptr descriptor)
{
    auto *socket = new QSslSocket(this);
    if (!socket->setSocketDescriptor(descriptor)) {
        delete socket;
        return;
    }
    ++mConnections;
    mBuffers.insert(socket, {});
    connect(socket, &QTcpSocket::readyRead, this, [this, socket] { read(socket); });
    connect(socket, &QTcpSocket::disconnected, this, [this, socket] {
        mBuffers.remove(socket);
        socket->deleteLater();
    });
    socket->setSocketOption(QAbstractSocket::LowDelayOption, 1);
    if (mTransport == Tls) {
        socket->setLocalCertificate(QSslCertificate(testcertificate::certificate));
        socket->setPrivateKey(QSslKey(testcertificate::key, QSsl::Ec));
        socket->startServerEncryption();
    }
}

void MisbehavingServer::read(QTcpSocket *socket)
{
    mBuffers[socket] += socket->readAll();
    Request request;
    while (mBuffers.contains(socket) && takeRequest(mBuffers[socket], request)) {
        mRequests.append(request);
        behaviourFor(request)(socket, request);
    }
}

bool MisbehavingServer::takeRequest(QByteArray &buffer, Request &request)
{
    const int headEnd = buffer.indexOf("\r\n\r\n");
    if (headEnd < 0)
        return false;
    Request found;
    const QList<QByteArray> lines = buffer.left(headEnd).replace("\r\n", "\n").split('\n');
    const QList<QByteArray> words = lines.first().split(' ');
    found.method = words.value(0);
    found.path = words.value(1);
    for (const QByteArray &line : lines.mid(1)) {
        const int colon = line.indexOf(':');
        found.headers.insert(line.left(colon).toLower(), line.mid(colon + 1).trimmed());
    }
    const int bodyStart = headEnd + 4;
    const int length = found.headers.value("content-length").toInt();
    if (buffer.size() < bodyStart + length)
        return false;
    found.body = buffer.mid(bodyStart, length);
    buffer.remove(0, bodyStart + length);
    request = found;
    return true;
}

MisbehavingServer::Behaviour MisbehavingServer::behaviourFor(const Request &request)
{
    if (!mQueue.isEmpty())
        return mQueue.takeFirst();
    const QByteArray path = request.path.split('?').first();
    return mByPath.value(path, mOtherwise);
}

MisbehavingServer::Behaviour MisbehavingServer::raw(const QByteArray &bytes, bool close)
{
    return [=](QTcpSocket *socket, const Request &) {
        socket->write(bytes);
        if (close)
            socket->disconnectFromHost();
    };
}

MisbehavingServer::Behaviour MisbehavingServer::answer(const QByteArray &body, int status,
                                                       const Headers &headers)
{
    return raw(message(status, headers, body), false);
}

MisbehavingServer::Behaviour MisbehavingServer::html(int status)
{
    return answer("<!DOCTYPE html><html><body><h1>Sorry</h1></body></html>", status,
                  {{"Content-Type", "text/html"}});
}

MisbehavingServer::Behaviour MisbehavingServer::redirect(const QByteArray &target, int status)
{
    return answer({}, status, {{"Location", target}});
}

MisbehavingServer::Behaviour MisbehavingServer::chunked(const QByteArray &body)
{
    const int half = body.size() / 2;
    QByteArray text = head(200, {{"Transfer-Encoding", "chunked"}});
    for (const QByteArray &part : {body.left(half), body.mid(half), QByteArray()})
        text += QByteArray::number(part.size(), 16) + "\r\n" + part + "\r\n";
    return raw(text, false);
}

MisbehavingServer::Behaviour MisbehavingServer::gzip(const QByteArray &body)
{
    return answer(compressed(body, Z_FINISH), 200, gzipHeaders);
}

MisbehavingServer::Behaviour MisbehavingServer::silence()
{
    return [](QTcpSocket *, const Request &) {};
}

MisbehavingServer::Behaviour MisbehavingServer::drip(const QByteArray &body, int bytesAtOnce,
                                                     int milliseconds)
{
    return [=](QTcpSocket *socket, const Request &) {
        socket->write(head(200, {{"Content-Length", QByteArray::number(body.size())}}));
        auto *timer = new QTimer(socket);
        QObject::connect(timer, &QTimer::timeout, socket, [=, rest = body]() mutable {
            socket->write(rest.left(bytesAtOnce));
            rest.remove(0, bytesAtOnce);
            if (rest.isEmpty())
                timer->deleteLater();
        });
        timer->start(milliseconds);
    };
}

MisbehavingServer::Behaviour MisbehavingServer::reset()
{
    return [](QTcpSocket *socket, const Request &) { socket->abort(); };
}

MisbehavingServer::Behaviour MisbehavingServer::cut(const QByteArray &body, qint64 claimed)
{
    return raw(head(200, {{"Content-Length", QByteArray::number(claimed)}}) + body);
}

MisbehavingServer::Behaviour MisbehavingServer::badChunks()
{
    return raw(head(200, {{"Transfer-Encoding", "chunked"}}) + "3\r\nabc\r\nzz\r\nabc\r\n");
}

MisbehavingServer::Behaviour MisbehavingServer::cutGzip(const QByteArray &body)
{
    const QByteArray whole = compressed(body, Z_FINISH);
    return answer(whole.left(whole.size() / 2), 200, gzipHeaders);
}

MisbehavingServer::Behaviour MisbehavingServer::gzipBomb(int megabytes)
{
    return answer(bomb(megabytes), 200, gzipHeaders);
}
