#include "endtoend/albumservice.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QEventLoop>
#include <QFile>
#include <QFileInfo>
#include <QImage>
#include <QJsonDocument>
#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QThread>

#include <sys/prctl.h>

#include <csignal>

namespace {

constexpr int PATIENCE_MS = 60000;
constexpr int POLL_MS = 5;

// Blocks until the condition holds; false when the patience is at its end.
template <typename Condition>
bool waitFor(Condition condition)
{
    const QDeadlineTimer deadline(PATIENCE_MS);
    while (!condition()) {
        if (deadline.hasExpired())
            return false;
        QThread::msleep(POLL_MS);
    }
    return true;
}

} // namespace

void AlbumService::Process::setupChildProcess()
{
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
}

AlbumService::~AlbumService()
{
    kill();
}

bool AlbumService::addFile(const QString &path, const QByteArray &content) const
{
    const QString name = mFolder.filePath("photos/" + path);
    QFile file(name);
    return QDir().mkpath(QFileInfo(name).path()) && file.open(QIODevice::WriteOnly) &&
           file.write(content) == content.size();
}

bool AlbumService::addPhoto(const QString &path, const QColor &colour, const QSize &size) const
{
    QImage image(size, QImage::Format_RGB32);
    image.fill(colour);
    return addFile(path, {}) && image.save(mFolder.filePath("photos/" + path));
}

bool AlbumService::addUser(const QString &mail, const QString &name, const QString &folder,
                           const QString &password) const
{
    const QString photos = mFolder.filePath("photos/" + folder);
    QDir().mkpath(photos);
    run({"user", "add", mail, "--name", name, "--photos", photos});
    if (!password.isEmpty())
        run({"user", "passwd", mail}, password.toUtf8() + '\n');
    return run({"user", "list"}).contains(mail.toUtf8());
}

bool AlbumService::start()
{
    const QString ready = mFolder.filePath("ready");
    QFile::remove(ready);
    mProcess.setProcessChannelMode(QProcess::ForwardedChannels);
    mProcess.start(ORVALA_SERVICE_PROGRAM,
                   {"serve", "--gathered", "none", "--data", mFolder.filePath("data"), "--port",
                    QString::number(mPort), "--ready-file", ready, "--log-level", "error"});
    QFile file(ready);
    const auto isReady = [&] {
        return file.exists() || mProcess.waitForFinished(0) ||
               mProcess.state() == QProcess::NotRunning;
    };
    if (!waitFor(isReady) || !file.open(QIODevice::ReadOnly))
        return false;
    mPort = file.readAll().trimmed().toUShort();
    return mPort != 0;
}

void AlbumService::kill()
{
    mProcess.kill();
    mProcess.waitForFinished();
}

QString AlbumService::urlAt(quint16 port)
{
    return QStringLiteral("https://127.0.0.1:%1").arg(port);
}

QByteArray AlbumService::get(const QString &url) const
{
    QNetworkAccessManager manager;
    QNetworkReply *reply = manager.get(QNetworkRequest(url));
    reply->ignoreSslErrors();
    QEventLoop loop;
    QObject::connect(reply, &QNetworkReply::finished, &loop, &QEventLoop::quit);
    loop.exec();
    return reply->error() == QNetworkReply::NoError ? reply->readAll() : QByteArray();
}

bool AlbumService::waitForPhotos(int count) const
{
    return waitFor([this, count] {
        const QByteArray feed = get(url() + "/data/feed/api/featured?max-results=0");
        const QJsonValue total =
            QJsonDocument::fromJson(feed)["feed"]["openSearch$totalResults"]["$t"];
        return total.toString().toInt() == count;
    });
}

QByteArray AlbumService::tokens(const QString &mail) const
{
    return run({"user", "token", mail});
}

QByteArray AlbumService::run(const QStringList &arguments, const QByteArray &input) const
{
    QProcess process;
    process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    process.start(ORVALA_SERVICE_PROGRAM,
                  arguments + QStringList{"--data", mFolder.filePath("data")});
    process.write(input);
    process.closeWriteChannel();
    return process.waitForFinished(PATIENCE_MS) ? process.readAllStandardOutput() : QByteArray();
}
