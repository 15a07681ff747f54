// Feed text to hash: our parser against simdjson and the barest walk into the same hash.
#include "network/jsonparser.h"
#include "support/bench.h"

#include <QCoreApplication>

#include <simdjson.h>

#include <cstdlib>
#include <string>

namespace {

QVariant bareVariant(simdjson::dom::element value)
{
    switch (value.type()) {
    case simdjson::dom::element_type::OBJECT: {
        QVariantHash hash;
        const simdjson::dom::object members = value.get_object().value_unsafe();
        for (const auto field : members)
            hash.insert(QString::fromUtf8(field.key.data(), int(field.key.size())),
                        bareVariant(field.value));
        return hash;
    }
    case simdjson::dom::element_type::ARRAY: {
        QVariantList list;
        const simdjson::dom::array items = value.get_array().value_unsafe();
        for (const simdjson::dom::element item : items)
            list.append(bareVariant(item));
        return list;
    }
    case simdjson::dom::element_type::STRING: {
        const std::string_view text = value.get_string().value_unsafe();
        return QString::fromUtf8(text.data(), int(text.size()));
    }
    case simdjson::dom::element_type::BOOL:
        return value.get_bool().value_unsafe();
    case simdjson::dom::element_type::NULL_VALUE:
        return QVariant();
    default:
        return value.get_double().value_unsafe();
    }
}

QByteArray text(const char *key, const QByteArray &value)
{
    return '"' + QByteArray(key) + "\":{\"$t\":\"" + value + "\"}";
}

QByteArray entry(int number)
{
    const QByteArray id = QByteArray::number(Q_INT64_C(5613423423423) + number);
    const QByteArray url = "https://album.orvala.example/photos/" + id + "/picture.jpg";
    const QByteArray thumbnail = "{\"url\":\"" + url + "?w=280\",\"height\":200,\"width\":280}";
    return '{' + text("id", "https://album.orvala.example/data/entry/user/1/photoid/" + id) + ',' +
           text("published", "2011-05-04T12:30:00.000Z") + ',' +
           text("updated", "2012-11-09T01:02:03.456Z") + ',' +
           "\"category\":[{\"scheme\":\"https://schemas.orvala.example/2005#kind\","
           "\"term\":\"https://schemas.orvala.example/photos/2007#photo\"}]," +
           text("title", "IMG_" + id + ".JPG") + ',' +
           text("summary", "Gr\xC3\xBC\xC3\x9F"
                           "e from the \\\"sea\\\"") +
           ',' + "\"content\":{\"type\":\"image/jpeg\",\"src\":\"" + url + "\"}," +
           "\"link\":[{\"rel\":\"self\",\"type\":\"application/atom+xml\",\"href\":\"" + url +
           "\"}]," + text("gphoto$id", id) + ',' + text("gphoto$width", "1600") + ',' +
           text("gphoto$height", "1200") + ',' + text("gphoto$commentCount", "3") + ',' +
           "\"media$group\":{\"media$content\":[{\"url\":\"" + url +
           "\",\"height\":1200,\"width\":1600,\"type\":\"image/jpeg\",\"medium\":\"image\"}]," +
           "\"media$thumbnail\":[" + thumbnail + ',' + thumbnail + ',' + thumbnail + "]}}";
}

QByteArray feed(int entries)
{
    QByteArray list;
    for (int i = 0; i < entries; ++i)
        list += (i ? "," : "") + entry(i);
    return "{\"version\":\"1.0\",\"encoding\":\"UTF-8\",\"feed\":{" +
           text("openSearch$totalResults", QByteArray::number(entries)) + ",\"entry\":[" + list +
           "]}}";
}

double compareFeed(int entries, int times, int rounds)
{
    const QByteArray utf8 = feed(entries);
    const auto ours = [&] {
        for (int i = 0; i < times; ++i) {
            if (JsonParser::parse(utf8).isEmpty())
                std::abort();
        }
    };
    const auto bare = [&] {
        for (int i = 0; i < times; ++i) {
            simdjson::dom::parser parser;
            const simdjson::dom::element root =
                parser.parse(utf8.constData(), std::size_t(utf8.size())).value_unsafe();
            if (bareVariant(root).toHash().isEmpty())
                std::abort();
        }
    };
    const bench::Comparison result = bench::compare(rounds, ours, bare);
    bench::row("feed of " + std::to_string(entries) + " entries to hash, against bare simdjson",
               result.ratio, 1.3, bench::milliseconds(result));
    return result.ours / times / entries;
}

} // namespace

int main(int argc, char **argv)
{
    QCoreApplication application(argc, argv);
    compareFeed(8, 500, 15);
    const double small = compareFeed(100, 50, 15);
    const double large = compareFeed(10000, 1, 9);
    char note[64];
    std::snprintf(note, sizeof note, "%.2f us against %.2f us", large * 1e6, small * 1e6);
    bench::row("cost of one entry, feed of 10000 against 100", large / small, 2, note);
    return 0;
}
