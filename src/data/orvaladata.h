#pragma once

#include "data/packageproperty.h"
#include "network/jsonparser.h"

#include <QDateTime>
#include <QSize>
#include <QString>
#include <QStringList>

// The records that the entries of a feed become. Each is built once from one entry and owned by the
// Package that holds it; a member that the entry lacks stays at its default. Texts are as the
// service sent them: show them as plain text.
class OrvalaData
{
public:
    virtual ~OrvalaData() = default;

    QString userId() const { return mUserId; }
    QString albumId() const { return mAlbumId; }
    void setUserId(const QString &id) { mUserId = id; }

protected:
    QString mUserId;
    QString mAlbumId;
};

// One photo.
class OrvalaPhoto : public OrvalaData
{
public:
    OrvalaPhoto() = default;
    explicit OrvalaPhoto(const JsonObject &entry);
    static bool isRecordOf(int packageType)
    {
        return packageType == ALBUM_PHOTOS_LIST || hasTotalCount(packageType);
    }

    QString imageUrl() const { return mImageUrl; } // asks the service for the display's width
    QString thumbnailUrl() const { return mThumbnailUrl; }
    QString title() const { return mTitle; }
    QDateTime published() const { return mPublished; } // local time as written
    QString summary() const { return mSummary; }
    QSize size() const { return mSize; } // pixels of the full-size image
    QString photoId() const { return mPhotoId; }
    QStringList keywords() const { return mKeywords; }
    int commentCount() const { return mCommentCount; }
    QString nickname() const { return mNickname; } // of the photo's owner

private:
    QString mImageUrl;
    QString mThumbnailUrl;
    QString mTitle;
    QDateTime mPublished;
    QString mSummary;
    QSize mSize = QSize(0, 0);
    QString mPhotoId;
    QStringList mKeywords;
    int mCommentCount = 0;
    QString mNickname;
};

// One album of an album list.
class Album : public OrvalaData
{
public:
    Album() = default;
    explicit Album(const JsonObject &entry);
    static bool isRecordOf(int packageType) { return packageType == ALBUMS_LIST; }

    int numPhotos() const { return mNumPhotos; }
    QString title() const { return mTitle; }
    QString contentUrl() const { return mContentUrl; } // cover image
    QString thumbnailUrl() const { return mThumbnailUrl; }
    QString id() const { return mId; }
    QString user() const { return mUser; }
    QString nickname() const { return mNickname; }
    QDateTime published() const { return mPublished; }

private:
    int mNumPhotos = 0;
    QString mTitle;
    QString mContentUrl;
    QString mThumbnailUrl;
    QString mId;
    QString mUser;
    QString mNickname;
    QDateTime mPublished;
};

// One comment on a photo; the author is userId().
class Comment : public OrvalaData
{
public:
    Comment() = default;
    explicit Comment(const JsonObject &entry);
    static bool isRecordOf(int packageType) { return packageType == PHOTO_COMMENTS_LIST; }

    QString content() const { return mContent; }
    QString nickname() const { return mNickname; }
    QString commentId() const { return mCommentId; }
    QString photoId() const { return mPhotoId; }
    QDateTime createdTime() const { return mCreatedTime; } // already in the zone to show

private:
    QString mContent;
    QString mNickname;
    QString mCommentId;
    QString mPhotoId;
    QDateTime mCreatedTime;
};

// One entry of a photo's tag feed.
class PhotoTagList : public OrvalaData
{
public:
    PhotoTagList() = default;
    explicit PhotoTagList(const JsonObject &entry);
    static bool isRecordOf(int packageType) { return packageType == PHOTO_TAGS_LIST; }

    QStringList tagList() const { return mTagList; }

private:
    QStringList mTagList;
};

// One contact of the user.
class FavoritePeople : public OrvalaData
{
public:
    FavoritePeople() = default;
    explicit FavoritePeople(const JsonObject &entry);
    static bool isRecordOf(int packageType) { return packageType == FAVORITE_PEOPLE_LIST; }

    QString user() const { return mUser; }
    QString nickname() const { return mNickname; }
    QString thumbnail() const { return mThumbnail; } // URL of the portrait

private:
    QString mUser;
    QString mNickname;
    QString mThumbnail;
};
