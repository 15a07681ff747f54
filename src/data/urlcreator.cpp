#include "data/urlcreator.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/log.h"
#include "network/systemconfig.h"

#include <QUrl>

namespace {

// Every argument goes into the pattern in one step: encoded text is full of percent signs, which a
// second step would take for place markers.
QString encoded(const QString &text, const char *keep = "")
{
    return QString::fromLatin1(QUrl::toPercentEncoding(text, keep));
}

// Keeps what may stand in a path as it is.
QString inPath(const QString &id)
{
    return encoded(id, "!$&'()*+,;=:@");
}

// Keeps what may stand in a query's value and means nothing there.
QString inQuery(const QString &value)
{
    return encoded(value, "!$'()*,;=:@/?");
}

QString feedUrl(const QString &path)
{
    return SystemConfig::feedBase() + path;
}

QString searchPageSize()
{
    return QString::number(SystemConfig::searchPageSize());
}

} // namespace

QString UrlCreator::getUrl(const PackageProperty &property)
{
    switch (property.mType) {
    case INVALID_LIST:
        logLine("Invalid Type!");
        return QString();
    case FEATURED_PHOTOS_LIST:
        return getUrlOfFeaturedPhotosList(property.mStartIndex, property.mItemsPerPage);
    case ALBUMS_LIST:
        return getUrlOfAlbumsList(property.mUserId);
    case ALBUM_PHOTOS_LIST:
        return getUrlOfAlbumPhotosList(property.mUserId, property.mAlbumId);
    case SEARCH_PHOTOS_LIST:
        return getUrlOfSearchPhotosList(property.mSearchedStr);
    case PHOTO_COMMENTS_LIST:
        return getUrlOfPhotoCommentsList(property.mUserId, property.mAlbumId, property.mPhotoId);
    case PHOTO_TAGS_LIST:
        return getUrlOfPhotoTagsList(property.mUserId, property.mAlbumId, property.mPhotoId);
    case FAVORITE_PEOPLE_LIST:
        return getUrlOfFavoritePeopleList(property.mUserId);
    case SEARCH_MORE_PHOTOS_LIST:
        return getUrlOfSearchPhotosList(property.mSearchedStr, property.mStartIndex);
    default:
        logLine("Error: Unknow Type!");
        return QString();
    }
}

QString UrlCreator::getUrlOfFeaturedPhotosList(int startIndex, int itemsPerPage)
{
    const QString path = QStringLiteral("/data/feed/api/featured?start-index=%1&max-results=%2&v=2"
                                        "&prettyprint=true&alt=json&strict=true&kind=photo");
    return feedUrl(path.arg(QString::number(startIndex), QString::number(itemsPerPage)));
}

QString UrlCreator::getUrlOfAlbumsList(const QString &userId)
{
    if (userId.isEmpty()) {
        logLine("Invalid parameters in UrlCreator::getUrlOfAlbumsList");
        return QString();
    }
    return appendAccessToken(feedUrl(QStringLiteral("/data/feed/api/user/%1").arg(inPath(userId))));
}

QString UrlCreator::getUrlOfAlbumPhotosList(const QString &userId, const QString &albumId)
{
    if (userId.isEmpty() || albumId.isEmpty()) {
        logLine("Invalid parameters in UrlCreator::getUrlOfAlbumPhotosList!");
        return QString();
    }
    const QString path = QStringLiteral("/data/feed/api/user/%1/albumid/%2");
    return appendAccessToken(feedUrl(path.arg(inPath(userId), inPath(albumId))));
}

QString UrlCreator::getUrlOfPhotoCommentsList(const QString &userId, const QString &albumId,
                                              const QString &photoId)
{
    if (userId.isEmpty() || albumId.isEmpty() || photoId.isEmpty()) {
        logLine("Invalid parameters in UrlCreator::getUrlOfPhotoCommentsList!");
        return QString();
    }
    const QString path =
        QStringLiteral("/data/feed/api/user/%1/albumid/%2/photoid/%3?kind=comment");
    return appendAccessToken(feedUrl(path.arg(inPath(userId), inPath(albumId), inPath(photoId))));
}

QString UrlCreator::getUrlOfPhotoTagsList(const QString &userId, const QString &albumId,
                                          const QString &photoId)
{
    if (userId.isEmpty() || albumId.isEmpty() || photoId.isEmpty()) {
        logLine("Invalid parameters in UrlCreator::getUrlOfPhotoTagsList!");
        return QString();
    }
    const QString path = QStringLiteral("/data/feed/api/user/%1/albumid/%2/photoid/%3?kind=tag");
    return appendAccessToken(feedUrl(path.arg(inPath(userId), inPath(albumId), inPath(photoId))));
}

QString UrlCreator::getUrlOfFavoritePeopleList(const QString &userId)
{
    if (userId.isEmpty()) {
        logLine("Invalid parameters in UrlCreator::getUrlOfFavoritePeopleList");
        return QString();
    }
    const QString path = QStringLiteral("/data/feed/api/user/%1/contacts?kind=user");
    return appendAccessToken(feedUrl(path.arg(inPath(userId))));
}

QString UrlCreator::getUrlOfSearchPhotosList(const QString &searchedString)
{
    const QString path = QStringLiteral("/data/feed/api/all?q=%1&max-results=%2&alt=json");
    return feedUrl(path.arg(encoded(searchedString), searchPageSize()));
}

QString UrlCreator::getUrlOfSearchPhotosList(const QString &searchedString, int startIndex)
{
    const QString path =
        QStringLiteral("/data/feed/api/all?q=%1&max-results=%2&start-index=%3&alt=json");
    return feedUrl(
        path.arg(encoded(searchedString), searchPageSize(), QString::number(startIndex)));
}

QString UrlCreator::appendAccessToken(const QString &url)
{
    const QString token = inQuery(AccountManagerHelper::getAccessToken());
    const QString pattern = url.contains(QLatin1Char('?'))
                                ? QStringLiteral("%1&access_token=%2&alt=json")
                                : QStringLiteral("%1?access_token=%2&alt=json");
    return pattern.arg(url, token);
}
