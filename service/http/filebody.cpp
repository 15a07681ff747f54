#include "http/filebody.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <memory>

namespace {

constexpr std::size_t pieceBytes = 64 * 1024;

// Goes with the answer that shares it.
class File
{
public:
    explicit File(const std::string &path)
        : mDescriptor(::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC))
    {
    }
    ~File()
    {
        if (mDescriptor >= 0)
            ::close(mDescriptor);
    }
    File(const File &) = delete;
    File &operator=(const File &) = delete;

    // 0 when it is no file, or an empty one.
    std::size_t size() const
    {
        struct stat status
        {
        };
        const bool isFile = ::fstat(mDescriptor, &status) == 0 && S_ISREG(status.st_mode);
        return isFile ? static_cast<std::size_t>(status.st_size) : 0;
    }
    bool send(std::size_t start, std::size_t most, httplib::DataSink &sink) const
    {
        std::string piece(std::min(most, pieceBytes), '\0');
        const ssize_t size =
            ::pread(mDescriptor, piece.data(), piece.size(), static_cast<off_t>(start));
        return size > 0 && sink.write(piece.data(), static_cast<std::size_t>(size));
    }

private:
    const int mDescriptor;
};

} // namespace

bool answerWithFile(httplib::Response &response, const std::string &path,
                    const std::string &mimeType)
{
    const auto file = std::make_shared<const File>(path);
    const std::size_t size = file->size();
    if (size == 0)
        return false;
    response.set_content_provider(
        size, mimeType, [file](std::size_t start, std::size_t most, httplib::DataSink &sink) {
            return file->send(start, most, sink);
        });
    return true;
}
