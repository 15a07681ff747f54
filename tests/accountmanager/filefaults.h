#pragma once

#include "accountmanager/accountfile.h"

#include <csignal>
#include <sys/resource.h>
#include <unistd.h>

// Faults of the file system, for as long as the object lives.

// A full disk: no file of this process grows beyond the limit.
class FullDisk
{
public:
    explicit FullDisk(rlim_t bytes)
    {
        std::signal(SIGXFSZ, SIG_IGN);
        getrlimit(RLIMIT_FSIZE, &mBefore);
        const rlimit limit = {bytes, mBefore.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FullDisk() { setrlimit(RLIMIT_FSIZE, &mBefore); }

private:
    rlimit mBefore = {};
};

// A read-only file system, also for tests that run as root.
class ReadOnly
{
public:
    explicit ReadOnly(const AccountFile &file)
        : mFolder(file.folder())
    {
        QFile::setPermissions(file.path(), QFile::Permissions(0x4444));
        QFile::setPermissions(mFolder, QFile::Permissions(0x5555));
        if (mUser == 0 && seteuid(65534) != 0)
            qFatal("cannot change the user");
    }
    ~ReadOnly()
    {
        if (seteuid(mUser) != 0)
            qFatal("cannot change the user back");
        QFile::setPermissions(mFolder, QFile::Permissions(0x7700));
    }

private:
    QString mFolder;
    uid_t mUser = geteuid();
};
