#include "data/jsonwalk.h"

namespace jsonwalk {

namespace {

const QVariant &member(const JsonObject &parent, const QString &key)
{
    static const QVariant none;
    const auto found = parent.constFind(key);
    return found == parent.constEnd() ? none : *found;
}

const QString &wrappedKey()
{
    static const QString key = QStringLiteral("$t");
    return key;
}

} // namespace

const JsonObject &toObject(const QVariant &value)
{
    static const JsonObject none;
    if (value.userType() != qMetaTypeId<JsonObject>())
        return none;
    return *static_cast<const JsonObject *>(value.constData());
}

const QVariantList &toList(const QVariant &value)
{
    static const QVariantList none;
    if (value.userType() != QMetaType::QVariantList)
        return none;
    return *static_cast<const QVariantList *>(value.constData());
}

const JsonObject &object(const JsonObject &parent, const QString &key)
{
    return toObject(member(parent, key));
}

const QVariantList &list(const JsonObject &parent, const QString &key)
{
    return toList(member(parent, key));
}

QString string(const JsonObject &parent, const QString &key)
{
    const QVariant &value = member(parent, key);
    if (value.userType() == QMetaType::QString)
        return *static_cast<const QString *>(value.constData());
    return JsonParser::string(parent, key);
}

QString text(const JsonObject &parent, const QString &key)
{
    return string(object(parent, key), wrappedKey());
}

int number(const JsonObject &parent, const QString &key)
{
    return text(parent, key).toInt();
}

const JsonObject &firstObject(const QVariantList &values)
{
    return values.isEmpty() ? toObject(QVariant()) : toObject(values.first());
}

const JsonObject &lastObject(const QVariantList &values)
{
    return values.isEmpty() ? toObject(QVariant()) : toObject(values.last());
}

} // namespace jsonwalk
