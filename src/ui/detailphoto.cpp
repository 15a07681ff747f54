#include "ui/detailphoto.h"

#include "data/htmlentities.h"
#include "data/orvaladata.h"
#include "data/packageproperty.h"

namespace {

constexpr int kLongestText = 10000;
constexpr int kMostTags = 200;

QStringList shownTags(const QStringList &tags)
{
    QStringList result;
    for (const QString &tag : tags.mid(0, kMostTags))
        result << shownText(tag).simplified();
    return result;
}

} // namespace

QString shownText(const QString &text)
{
    return unescapeHtml(text.left(kLongestText));
}

DetailPhoto DetailPhoto::of(const OrvalaPhoto &record)
{
    DetailPhoto photo;
    photo.userId = record.userId();
    photo.albumId = record.albumId();
    photo.photoId = record.photoId();
    photo.imageUrl = record.imageUrl();
    photo.thumbnailUrl = record.thumbnailUrl();
    photo.title = shownText(record.title()).simplified();
    photo.summary = shownText(record.summary()).trimmed();
    photo.owner = shownText(record.nickname()).simplified();
    if (photo.owner.isEmpty())
        photo.owner = shownText(record.userId()).simplified();
    photo.published = record.published();
    photo.size = record.size();
    photo.tags = shownTags(record.keywords());
    photo.commentCount = record.commentCount();
    return photo;
}

PackageProperty DetailPhoto::request(int packageType) const
{
    PackageProperty property;
    property.mType = packageType;
    property.mUserId = userId;
    property.mAlbumId = albumId;
    property.mPhotoId = photoId;
    return property;
}

bool DetailPhoto::isOf(const OrvalaPhoto &record) const
{
    return photoId == record.photoId() && albumId == record.albumId() &&
           userId == record.userId() && imageUrl == record.imageUrl();
}
