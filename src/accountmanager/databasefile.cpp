#include "accountmanager/databasefile.h"

#include <QFile>
#include <QFileInfo>

#include <cstdio>
#include <fcntl.h>
#include <unistd.h>

namespace {

bool syncToDisk(const QString &path, int flags)
{
    const int file = ::open(QFile::encodeName(path).constData(), flags | O_CLOEXEC);
    if (file < 0)
        return false;
    const bool synced = ::fsync(file) == 0;
    ::close(file);
    return synced;
}

// SQLite would play the journal of a file that is gone into the new file of the same name.
void removeJournals(const QString &path)
{
    QFile::remove(path + QStringLiteral("-journal"));
    QFile::remove(path + QStringLiteral("-wal"));
    QFile::remove(path + QStringLiteral("-shm"));
}

bool moveIntoPlace(const QString &path)
{
    const QString built = databasefile::buildPath(path);
    if (!syncToDisk(built, O_RDONLY))
        return false;
    removeJournals(path);
    return std::rename(QFile::encodeName(built).constData(), QFile::encodeName(path).constData()) ==
           0;
}

} // namespace

QString databasefile::buildPath(const QString &path)
{
    return path + QStringLiteral(".new");
}

bool databasefile::startBuilding(const QString &path)
{
    discard(path);
    const QByteArray name = QFile::encodeName(buildPath(path));
    const int file = ::open(name.constData(), O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0600);
    if (file < 0)
        return false;
    ::close(file);
    return true;
}

bool databasefile::publish(const QString &path)
{
    if (!moveIntoPlace(path)) {
        discard(path);
        return false;
    }
    syncToDisk(QFileInfo(path).absolutePath(), O_RDONLY | O_DIRECTORY);
    return true;
}

void databasefile::discard(const QString &path)
{
    QFile::remove(buildPath(path));
    removeJournals(buildPath(path));
}
