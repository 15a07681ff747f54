#pragma once

#include <QHash>
#include <QString>
#include <QVariant>

using JsonObject = QHash<QString, QVariant>;

// Turns a feed's text into a tree of variants. What is accepted, and the tree it yields, is what a
// script engine's JSON.parse gives, put through these rules:
//  - an object becomes a JsonObject in a variant, an array a QVariantList, a number a double;
//  - an array inside an array is flattened into it;
//  - a top-level array yields its items under "0", "1", ... and its size under "length".
// Nesting deeper than 1,000 levels counts as malformed.
class JsonParser
{
public:
    // The members of the top-level value; an empty hash on any failure, which is only logged.
    static JsonObject parse(const QString &text);
    // The same for UTF-8 bytes as they arrive from the network; bytes that are not UTF-8 become
    // U+FFFD.
    static JsonObject parse(const QByteArray &utf8);

    // The value under the key, or an invalid variant.
    static QVariant value(const JsonObject &object, const QString &key);
    // The value converted to text, or the empty text.
    static QString string(const JsonObject &object, const QString &key);
};
