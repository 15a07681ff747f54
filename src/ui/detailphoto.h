#pragma once

#include <QDateTime>
#include <QSize>
#include <QString>
#include <QStringList>

class OrvalaPhoto;
struct PackageProperty;

// What the photo screen shows of one photo: a copy of its record, which the cache may let go at any
// time. Texts are plain and of bounded length.
struct DetailPhoto
{
    QString userId;
    QString albumId;
    QString photoId;
    QString imageUrl;
    QString thumbnailUrl;
    QString title; // one line
    QString summary;
    QString owner; // name, or id without one
    QDateTime published;
    QSize size; // pixels of the full-size image
    QStringList tags;
    int commentCount = 0;

    static DetailPhoto of(const OrvalaPhoto &record);

    // The request for a list that belongs to this photo: its comments or its tags.
    PackageProperty request(int packageType) const;
    bool isOf(const OrvalaPhoto &record) const;
};

// A text from the service made ready to be shown: entities undone, length bounded.
QString shownText(const QString &text);
