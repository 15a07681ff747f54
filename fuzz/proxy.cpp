#include "fuzz.h"
#include "network/systemconfig.h"

#include <sys/mman.h>
#include <unistd.h>

namespace {

// A file in memory, at a path that a program can open.
QString filePath(int descriptor)
{
    return QStringLiteral("/proc/self/fd/%1").arg(descriptor);
}

} // namespace

// The first byte says which file the rest is: the one of the device's menu, or the settings.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    static const int descriptor = ::memfd_create("fuzz", MFD_CLOEXEC);
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
    if (size == 0 || ::ftruncate(descriptor, 0) != 0 ||
        ::pwrite(descriptor, data + 1, size - 1, 0) != ssize_t(size - 1))
        return 0;
    const bool isMenuFile = data[0] % 2 == 0;
    const QString nowhere = QStringLiteral("/nowhere/file");
    SystemConfig::setConfigFile(isMenuFile ? nowhere : filePath(descriptor));
    SystemConfig::setProxyFile(isMenuFile ? filePath(descriptor) : nowhere);
    SystemConfig::proxyAddress();
    SystemConfig::scaleSetting();
    SystemConfig::photoItemSize();
    SystemConfig::feedBase();
    SystemConfig::keysOf(QStringLiteral("Keys"));
    return 0;
}
