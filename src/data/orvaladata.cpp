#include "data/orvaladata.h"

#include "base/log.h"
#include "data/jsonwalk.h"
#include "data/publishedtime.h"
#include "network/systemconfig.h"
#include "platform/devicestate.h"

#include <QtGlobal>

using namespace jsonwalk;

namespace {

QStringList splitTags(const QString &text)
{
    return text.split(QLatin1String(", "), Qt::SkipEmptyParts);
}

// The service scales an image to the width that a segment "/sN" before the file name asks for.
QString atDisplayWidth(QString url, int photoWidth)
{
    const int lastSlash = url.lastIndexOf(QLatin1Char('/'));
    if (lastSlash < 0)
        return url;
    const int width = qMin(photoWidth, SystemConfig::displayWidth());
    return url.insert(lastSlash, QLatin1String("/s") + QString::number(width));
}

const JsonObject &firstAuthor(const JsonObject &entry)
{
    return firstObject(list(entry, QStringLiteral("author")));
}

QString lastThumbnailUrl(const JsonObject &mediaGroup)
{
    const QVariantList &thumbnails = list(mediaGroup, QStringLiteral("media$thumbnail"));
    if (thumbnails.isEmpty()) {
        logLine("thumbnailListVar is empty");
        return QString();
    }
    logLine("thumbnailListVar is not empty");
    return string(lastObject(thumbnails), QStringLiteral("url"));
}

QString firstUrl(const JsonObject &mediaGroup, const QString &key)
{
    return string(firstObject(list(mediaGroup, key)), QStringLiteral("url"));
}

// Without a zone from the platform the device's own zone holds. With one the value stays marked as
// UTC although it is shifted: the screens print it as it stands.
QDateTime inDisplayedZone(QDateTime created)
{
    created.setTimeSpec(Qt::UTC);
    logLine("11 mCreatedTime = ", created);
    if (!IsSetTimeZone) {
        created = created.toLocalTime();
        logLine("33 mCreatedTime = ", created);
        return created;
    }
    created = created.addSecs(Q_INT64_C(3600) * TimeZone);
    logLine("22 mCreatedTime = ", created);
    return created;
}

} // namespace

OrvalaPhoto::OrvalaPhoto(const JsonObject &entry)
    : mTitle(text(entry, QStringLiteral("title")))
    , mPublished(localTimeAsWritten(text(entry, QStringLiteral("published"))))
    , mSummary(text(entry, QStringLiteral("summary")))
    , mSize(number(entry, QStringLiteral("gphoto$width")),
            number(entry, QStringLiteral("gphoto$height")))
    , mPhotoId(text(entry, QStringLiteral("gphoto$id")))
    , mCommentCount(number(entry, QStringLiteral("gphoto$commentCount")))
{
    const JsonObject &content = object(entry, QStringLiteral("content"));
    const JsonObject &mediaGroup = object(entry, QStringLiteral("media$group"));
    mImageUrl = atDisplayWidth(string(content, QStringLiteral("src")), mSize.width());
    mThumbnailUrl = lastThumbnailUrl(mediaGroup);
    mKeywords = splitTags(text(mediaGroup, QStringLiteral("media$keywords")));
    mAlbumId = text(entry, QStringLiteral("gphoto$albumid"));
    const JsonObject &author = firstAuthor(entry);
    mUserId = text(author, QStringLiteral("gphoto$user"));
    mNickname = text(author, QStringLiteral("gphoto$nickname"));
}

Album::Album(const JsonObject &entry)
    : mNumPhotos(number(entry, QStringLiteral("gphoto$numphotos")))
    , mTitle(text(entry, QStringLiteral("title")))
    , mId(text(entry, QStringLiteral("gphoto$id")))
    , mUser(text(entry, QStringLiteral("gphoto$user")))
    , mNickname(text(entry, QStringLiteral("gphoto$nickname")))
    , mPublished(isoTime(text(entry, QStringLiteral("published"))))
{
    const JsonObject &mediaGroup = object(entry, QStringLiteral("media$group"));
    mContentUrl = firstUrl(mediaGroup, QStringLiteral("media$content"));
    mThumbnailUrl = firstUrl(mediaGroup, QStringLiteral("media$thumbnail"));
    mAlbumId = mId;
    mUserId = mUser;
}

Comment::Comment(const JsonObject &entry)
    : mContent(text(entry, QStringLiteral("content")))
    , mNickname(text(firstAuthor(entry), QStringLiteral("gphoto$nickname")))
    , mCommentId(text(entry, QStringLiteral("gphoto$id")))
    , mPhotoId(text(entry, QStringLiteral("gphoto$photoid")))
    , mCreatedTime(inDisplayedZone(isoTime(text(entry, QStringLiteral("published")))))
{
    mUserId = text(firstAuthor(entry), QStringLiteral("gphoto$user"));
}

PhotoTagList::PhotoTagList(const JsonObject &entry)
    : mTagList(splitTags(text(entry, QStringLiteral("title"))))
{
}

FavoritePeople::FavoritePeople(const JsonObject &entry)
    : mUser(text(entry, QStringLiteral("gphoto$user")))
    , mNickname(text(entry, QStringLiteral("gphoto$nickname")))
    , mThumbnail(text(entry, QStringLiteral("gphoto$thumbnail")))
{
}
