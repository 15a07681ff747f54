#pragma once

#include "data/packageproperty.h"

#include <QString>

// Builds the address of every feed. Ids and search words are encoded, so that they reach the
// service as they are. An empty text means that no request is to be made; why is only logged.
class UrlCreator
{
public:
    // The address for a list, by its type.
    static QString getUrl(const PackageProperty &property);

    static QString getUrlOfFeaturedPhotosList(int startIndex, int itemsPerPage);
    static QString getUrlOfAlbumsList(const QString &userId);
    static QString getUrlOfAlbumPhotosList(const QString &userId, const QString &albumId);
    static QString getUrlOfPhotoCommentsList(const QString &userId, const QString &albumId,
                                             const QString &photoId);
    static QString getUrlOfPhotoTagsList(const QString &userId, const QString &albumId,
                                         const QString &photoId);
    static QString getUrlOfFavoritePeopleList(const QString &userId);
    // The first block of results, or the block from a start index on.
    static QString getUrlOfSearchPhotosList(const QString &searchedString);
    static QString getUrlOfSearchPhotosList(const QString &searchedString, int startIndex);

    // Adds the access token and the switch to JSON.
    static QString appendAccessToken(const QString &url);
};
