#include "data/feedtranslation.h"
#include "network/systemconfig.h"
#include "support/bench.h"

#include <QCoreApplication>

#include <memory>
#include <simdjson.h>

namespace {

QByteArray photoEntry(int number)
{
    const QByteArray n = QByteArray::number(number);
    QByteArray text =
        "{'id':{'$t':'https://h/data/entry/user/u/albumid/5700/photoid/" + n +
        "'},'published':{'$t':'2012-03-01T10:20:30.000Z'},'updated':{'$t':'2012-03-01T10:20:"
        "30.000Z'},'category':[{'scheme':'https://h/2005#kind','term':'https://h/2007#photo'}],"
        "'title':{'$t':'IMG_" +
        n +
        ".jpg','type':'text'},'summary':{'$t':'A quiet evening by the sea','type':'text'},"
        "'content':{'type':'image/jpeg','src':'https://h/photos/5700/" +
        n +
        "/image.jpg'},'link':[{'rel':'self','type':'application/atom+xml','href':'https://h/x/" +
        n + "'},{'rel':'alternate','type':'text/html','href':'https://h/y/" + n +
        "'}],'author':[{'name':{'$t':'Ann'},'gphoto$user':{'$t':'ann'},'gphoto$nickname':{'$t':"
        "'Ann'}}],'gphoto$id':{'$t':'" +
        n +
        "'},'gphoto$albumid':{'$t':'5700'},'gphoto$width':{'$t':'4000'},'gphoto$height':{'$t':"
        "'3000'},'gphoto$size':{'$t':'2500000'},'gphoto$timestamp':{'$t':'1330597230000'},"
        "'gphoto$commentCount':{'$t':2},'media$group':{'media$content':[{'url':'https://h/photos/"
        "5700/" +
        n +
        "/image.jpg','height':3000,'width':4000,'type':'image/jpeg','medium':'image'}],"
        "'media$keywords':{'$t':'sea, evening, sky'},'media$thumbnail':[{'url':'https://h/photos/"
        "5700/" +
        n + "/s72/image.jpg','height':54,'width':72},{'url':'https://h/photos/5700/" + n +
        "/s288/image.jpg','height':216,'width':288}],'media$title':{'$t':'IMG_" + n +
        ".jpg','type':'plain'}}}";
    return text.replace('\'', '"');
}

QByteArray feed(int entries)
{
    QByteArray text = "{\"version\":\"1.0\",\"feed\":{\"openSearch$totalResults\":{\"$t\":" +
                      QByteArray::number(entries) + "},\"entry\":[";
    for (int i = 0; i < entries; ++i)
        text += (i ? "," : "") + photoEntry(100000 + i);
    return text + "]}}";
}

QString toText(std::string_view text)
{
    return QString::fromUtf8(text.data(), int(text.size()));
}

// The least that anyone has to do who wants the feed as hashes.
QVariant toVariant(simdjson::dom::element value)
{
    switch (value.type()) {
    case simdjson::dom::element_type::OBJECT: {
        JsonObject object;
        for (const auto field : simdjson::dom::object(value))
            object.insert(toText(field.key), toVariant(field.value));
        return QVariant::fromValue(object);
    }
    case simdjson::dom::element_type::ARRAY: {
        QVariantList list;
        for (const auto item : simdjson::dom::array(value))
            list.append(toVariant(item));
        return list;
    }
    case simdjson::dom::element_type::STRING:
        return toText(std::string_view(value));
    case simdjson::dom::element_type::BOOL:
        return bool(value);
    case simdjson::dom::element_type::NULL_VALUE:
        return QVariant();
    default:
        return double(value);
    }
}

void toRecords(const QByteArray &text, int entries)
{
    PackageProperty property;
    property.mType = FEATURED_PHOTOS_LIST;
    Package *package = nullptr;
    createPackage(property, text, &package);
    if (package->count() != entries)
        qFatal("the feed has lost records");
    delete package;
}

void toHash(const QByteArray &text)
{
    simdjson::dom::parser parser;
    if (toVariant(parser.parse(text.constData(), size_t(text.size())).value()).isNull())
        qFatal("the feed has lost its hash");
}

double measure(int entries, int count, const char *what, double goal)
{
    const QByteArray text = feed(entries);
    const auto result = bench::compare(
        21,
        [&] {
            for (int i = 0; i < count; ++i)
                toRecords(text, entries);
        },
        [&] {
            for (int i = 0; i < count; ++i)
                toHash(text);
        });
    bench::row(what, result.ratio, goal, bench::milliseconds(result));
    return result.ours / entries / count;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication application(argc, argv);
    SystemConfig::mScreen_Width = 1280;
    // What the log lines cost depends on where they go; here they are made and thrown away.
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});

    measure(8, 200, "feed of 8 entries to records, against simdjson to hash", 1.8);
    const double few = measure(100, 20, "feed of 100 entries to records", 1.8);
    const double many = measure(10000, 1, "feed of 10,000 entries to records", 1.8);
    bench::row("cost of an entry, 10,000 against 100", many / few, 2, "");
    return 0;
}
