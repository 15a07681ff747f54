#include "data/feedtranslation.h"
#include "fuzz.h"

#include <QtGlobal>

#include <memory>

// The first byte chooses the kind of list, the rest is the feed: first as a new page, then as the
// page that follows it.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
    if (size == 0)
        return 0;
    PackageProperty property;
    property.mType = data[0] % (SEARCH_MORE_PHOTOS_LIST + 2);
    const QByteArray feed(reinterpret_cast<const char *>(data + 1), int(size - 1));
    Package *made = nullptr;
    const ErrorCode code = createPackage(property, feed, &made);
    const std::unique_ptr<Package> package(made);
    if ((code == 0) != bool(package))
        broken();
    if (!package)
        return 0;
    package->mProperty = property;
    appendPackage(property, feed, &made);
    for (int i = 0; i < package->count(); ++i) {
        if (const auto *photo = package->record<OrvalaPhoto>(i))
            photo->keywords().join(photo->title());
        if (!package->mDataList.at(i))
            broken();
    }
    return 0;
}
