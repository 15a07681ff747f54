#pragma once

#include <unistd.h>

#include <utility>

// Owns one open file descriptor, or none (-1).
class FileDescriptor
{
public:
    explicit FileDescriptor(int fd = -1)
        : mFd(fd)
    {
    }
    ~FileDescriptor() { reset(); }
    FileDescriptor(FileDescriptor &&other) noexcept
        : mFd(std::exchange(other.mFd, -1))
    {
    }
    FileDescriptor &operator=(FileDescriptor &&other) noexcept
    {
        reset(std::exchange(other.mFd, -1));
        return *this;
    }

    int get() const { return mFd; }
    bool isOpen() const { return mFd >= 0; }
    void reset(int fd = -1)
    {
        if (mFd >= 0)
            ::close(mFd);
        mFd = fd;
    }

private:
    int mFd;
};
