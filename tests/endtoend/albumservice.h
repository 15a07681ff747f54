#pragma once

#include <QByteArray>
#include <QColor>
#include <QProcess>
#include <QSize>
#include <QString>
#include <QTemporaryDir>

// The real orvala-service in a process of its own, over HTTPS on a free loopback port, with a
// folder of photos that the test fills:
//
//   AlbumService service;
//   service.addPhoto("anna/Sea/Wave.jpg", Qt::blue);
//   service.addUser("anna@orvala.example", "Anna", "anna");
//   service.start() && service.waitForPhotos(1);
class AlbumService
{
public:
    AlbumService() = default;
    ~AlbumService();

    // Paths are below the folder of photos; each folder with photos in it is an album.
    bool addFile(const QString &path, const QByteArray &content) const;
    bool addPhoto(const QString &path, const QColor &colour, const QSize &size = {96, 64}) const;
    // Without a password the user cannot sign in on the service's pages.
    bool addUser(const QString &mail, const QString &name, const QString &folder,
                 const QString &password = {}) const;

    // Returns when the service answers; after the first time on the same port.
    bool start();
    // At once, as when the power goes (SIGKILL).
    void kill();

    quint16 port() const { return mPort; }
    QString url() const { return urlAt(mPort); }
    static QString urlAt(quint16 port); // origin, when something else listens for it at this port
    qint64 processId() const { return mProcess.processId(); }

    // Blocks until the scan has found this many photos that everybody may see.
    bool waitForPhotos(int count) const;
    // Body of a GET, empty after a failure. Runs an event loop.
    QByteArray get(const QString &url) const;
    // The answer of "user token": access_token, refresh_token.
    QByteArray tokens(const QString &mail) const;

private:
    // Ends with the program that started it, however that one ends.
    class Process : public QProcess
    {
    protected:
        void setupChildProcess() override;
    };

    QByteArray run(const QStringList &arguments, const QByteArray &input = {}) const;

    QTemporaryDir mFolder;
    Process mProcess;
    quint16 mPort = 0;
};
