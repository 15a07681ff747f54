#pragma once

#include "network/jsonparser.h"

#include <QString>
#include <QVariant>

// Reading of a parsed feed without copying its hashes and lists. A member that is missing or of
// another kind reads as empty, so a feed may hold anything anywhere.
namespace jsonwalk {

// The value as an object or a list; an empty one when it is none. The reference lives as long as
// the value.
const JsonObject &toObject(const QVariant &value);
const QVariantList &toList(const QVariant &value);

const JsonObject &object(const JsonObject &parent, const QString &key);
const QVariantList &list(const JsonObject &parent, const QString &key);

// The member converted to text, as JsonParser::string does it.
QString string(const JsonObject &parent, const QString &key);

// The service wraps a text as {"key": {"$t": "text"}}: that text, or its value as an integer (0
// when it is none).
QString text(const JsonObject &parent, const QString &key);
int number(const JsonObject &parent, const QString &key);

// The object that stands first or last in the list, or an empty one.
const JsonObject &firstObject(const QVariantList &values);
const JsonObject &lastObject(const QVariantList &values);

} // namespace jsonwalk
