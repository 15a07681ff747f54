#include "network/jsonparser.h"

#include "base/log.h"
#include "network/jsonnode.h"
#include "network/jsonwalker.h"

#include <simdjson.h>

#include <array>
#include <cmath>
#include <string_view>

namespace {

QString toText(std::string_view utf8)
{
    const QString text = QString::fromUtf8(utf8.data(), int(utf8.size()));
    // A byte-order mark is a character inside a string, but the conversion drops it.
    return utf8.substr(0, 3) == "\xEF\xBB\xBF" ? QChar(QChar::ByteOrderMark) + text : text;
}

// One shared text for what a feed repeats many times: its keys, and values such as types.
class RepeatedTexts
{
public:
    QString text(std::string_view utf8)
    {
        if (utf8.empty() || utf8.size() > longest)
            return toText(utf8);
        const std::size_t ends = std::size_t(utf8.front() & 0xFF) * 3 + (utf8.back() & 0xFF);
        Entry &entry = mEntries[(utf8.size() * 7 + ends) % mEntries.size()];
        if (entry.utf8 != utf8)
            entry = {utf8, toText(utf8)};
        return entry.text;
    }

private:
    static constexpr std::size_t longest = 64;

    struct Entry
    {
        std::string_view utf8; // lives in the fast parser
        QString text;
    };
    std::array<Entry, 64> mEntries;
};

// The usual source: the tree of the fast parser.
class FastSource
{
public:
    using Value = simdjson::dom::element;

    bool isArray(const Value &value) const { return value.is_array(); }
    bool isObject(const Value &value) const { return value.is_object(); }

    QVariant scalar(const Value &value)
    {
        switch (value.type()) {
        case simdjson::dom::element_type::STRING:
            return mValues.text(value.get_string().value_unsafe());
        case simdjson::dom::element_type::BOOL:
            return value.get_bool().value_unsafe();
        case simdjson::dom::element_type::NULL_VALUE:
            return QVariant();
        default:
            return value.get_double().value_unsafe();
        }
    }

    template <typename Each>
    void eachItem(const Value &value, Each each) const
    {
        const simdjson::dom::array items = value.get_array().value_unsafe();
        for (const Value item : items)
            each(item);
    }

    template <typename Each>
    void eachMember(const Value &value, Each each)
    {
        const simdjson::dom::object members = value.get_object().value_unsafe();
        for (const auto field : members)
            each(mKeys.text(field.key), field.value);
    }

private:
    RepeatedTexts mKeys;
    RepeatedTexts mValues;
};

// The source for what the fast parser refuses, rightly or not.
struct ExactSource
{
    using Value = JsonNode;

    bool isArray(const Value &value) const { return value.kind == JsonNode::Array; }
    bool isObject(const Value &value) const { return value.kind == JsonNode::Object; }
    QVariant scalar(const Value &value) const { return value.scalar; }

    template <typename Each>
    void eachItem(const Value &value, Each each) const
    {
        for (const JsonNode &item : value.items)
            each(item);
    }

    template <typename Each>
    void eachMember(const Value &value, Each each) const
    {
        for (std::size_t i = 0; i < value.items.size(); ++i)
            each(value.keys[i], value.items[i]);
    }
};

template <typename Source>
JsonObject walk(Source source, const typename Source::Value &value)
{
    logLine("JsonParser::parse engine.evaluate OK.");
    return JsonWalker<Source>(source).top(value);
}

JsonObject fail()
{
    logLine("uncaught exception at line", 0, ":", "SyntaxError: Unable to parse JSON string");
    return JsonObject();
}

JsonObject parseExactly(const QString &text)
{
    const std::optional<JsonNode> node = readJson(text);
    return node ? walk(ExactSource(), *node) : fail();
}

// The one number that the fast parser gets wrong: -0 written without fraction or exponent. Takes
// some texts inside strings for it too.
bool mayHoldNegativeZero(std::string_view text)
{
    constexpr std::string_view before = ",:[ \t\n\r";
    constexpr std::string_view after = ".eE";
    for (std::size_t at = text.find('-', 1); at < text.size(); at = text.find('-', at + 1)) {
        const std::string_view rest = text.substr(at + 1, 2);
        if (rest.empty() || rest[0] != '0' || before.find(text[at - 1]) == before.npos)
            continue;
        if (rest.size() < 2 || after.find(rest[1]) == after.npos)
            return true;
    }
    return false;
}

constexpr std::size_t pageSize = 64 * 1024;

// False if the fast parser cannot be relied on for this text.
bool parseFast(const QByteArray &utf8, JsonObject &result)
{
    if (mayHoldNegativeZero({utf8.constData(), std::size_t(utf8.size())}))
        return false;
    // The buffers of a usual page stay for the next one.
    static simdjson::dom::parser pageParser;
    simdjson::dom::parser largeParser;
    const auto size = std::size_t(utf8.size());
    simdjson::dom::parser &parser = size <= pageSize ? pageParser : largeParser;
    simdjson::dom::element root;
    if (parser.allocate(std::max(size, pageSize), deepestJson) != simdjson::SUCCESS ||
        parser.parse(utf8.constData(), size).get(root) != simdjson::SUCCESS)
        return false;
    result = walk(FastSource(), root);
    return true;
}

// Decimal as far as a script engine writes numbers so; never a number of thousands as "1e+03".
QString textOfNumber(double number)
{
    constexpr double smallestPlain = 1e-6;
    constexpr double largestPlain = 1e21;
    const double size = std::fabs(number);
    if (size == 0)
        return QStringLiteral("0");
    const char format = size >= smallestPlain && size < largestPlain ? 'f' : 'g';
    return QString::number(number, format, QLocale::FloatingPointShortest);
}

} // namespace

JsonObject JsonParser::parse(const QString &text)
{
    JsonObject result;
    if (text.isValidUtf16() && parseFast(text.toUtf8(), result))
        return result;
    return parseExactly(text);
}

JsonObject JsonParser::parse(const QByteArray &utf8)
{
    JsonObject result;
    if (parseFast(utf8, result))
        return result;
    return parseExactly(toText({utf8.constData(), std::size_t(utf8.size())}));
}

QVariant JsonParser::value(const JsonObject &object, const QString &key)
{
    return object.value(key);
}

QString JsonParser::string(const JsonObject &object, const QString &key)
{
    const QVariant found = object.value(key);
    if (found.type() == QVariant::Double)
        return textOfNumber(found.toDouble());
    return found.canConvert<QString>() ? found.toString() : QString();
}
