#pragma once

#include <QByteArray>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QString>

// Feeds as the album service sends them, made up for the tests.
namespace sample {

inline QJsonObject text(const QJsonValue &value)
{
    return {{"$t", value}};
}

inline QByteArray feed(const QJsonArray &entries, int total, const QString &owner = "owner")
{
    const QJsonObject feed{
        {"entry", entries}, {"gphoto$user", text(owner)}, {"openSearch$totalResults", text(total)}};
    return QJsonDocument(QJsonObject{{"feed", feed}}).toJson();
}

inline QJsonObject photo(const QString &title, const QString &thumbnail = QString())
{
    QJsonArray thumbnails;
    if (!thumbnail.isEmpty())
        thumbnails << QJsonObject{{"url", thumbnail}};
    return {{"title", text(title)},
            {"content", QJsonObject{{"src", thumbnail}}},
            {"media$group", QJsonObject{{"media$thumbnail", thumbnails}}}};
}

inline QJsonObject album(const QString &title, int photos, const QString &id)
{
    return {{"title", text(title)}, {"gphoto$numphotos", text(photos)}, {"gphoto$id", text(id)}};
}

// Records first to last, named "<name> <number>".
inline QByteArray photos(const QString &name, int first, int last, int total)
{
    QJsonArray entries;
    for (int i = first; i <= last; ++i)
        entries << photo(name + ' ' + QString::number(i));
    return feed(entries, total);
}

inline QByteArray albums(const QString &owner, int count)
{
    QJsonArray entries;
    for (int i = 1; i <= count; ++i)
        entries << album("Album " + QString::number(i), i, "a" + QString::number(i));
    return feed(entries, count, owner);
}

inline QByteArray people(int count)
{
    QJsonArray entries;
    for (int i = 1; i <= count; ++i)
        entries << QJsonObject{{"gphoto$user", text("p" + QString::number(i))},
                               {"gphoto$nickname", text("Person " + QString::number(i))}};
    return feed(entries, count);
}

} // namespace sample
