#include "data/jsonwalk.h"
#include "fuzz.h"

#include <QtGlobal>

namespace {

void silence(QtMsgType, const QMessageLogContext &, const QString &) {}

// Reads every value as everything that a record might take it for.
void walk(const JsonObject &object)
{
    for (auto member = object.cbegin(); member != object.cend(); ++member) {
        jsonwalk::string(object, member.key());
        jsonwalk::text(object, member.key());
        jsonwalk::number(object, member.key());
        walk(jsonwalk::object(object, member.key()));
        const QVariantList &list = jsonwalk::list(object, member.key());
        walk(jsonwalk::firstObject(list));
        for (const QVariant &item : list)
            walk(jsonwalk::toObject(item));
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    qInstallMessageHandler(silence);
    const QByteArray bytes(reinterpret_cast<const char *>(data), int(size));
    const JsonObject object = JsonParser::parse(bytes);
    walk(object);
    // The same text in the other shape gives the same tree; in that shape, a byte-order mark is
    // gone.
    if (!bytes.startsWith("\xEF\xBB\xBF") &&
        JsonParser::parse(QString::fromUtf8(bytes.constData(), bytes.size())).size() !=
            object.size())
        broken();
    return 0;
}
