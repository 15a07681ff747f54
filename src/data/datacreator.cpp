#include "data/datacreator.h"

const DataCreator *DataCreator::forType(int packageType)
{
    static const OrvalaPhotoCreator photos;
    static const AlbumCreator albums;
    static const CommentCreator comments;
    static const TagCreator tags;
    static const FavoritePeopleCreator people;

    switch (packageType) {
    case FEATURED_PHOTOS_LIST:
    case ALBUM_PHOTOS_LIST:
    case SEARCH_PHOTOS_LIST:
    case SEARCH_MORE_PHOTOS_LIST:
        return &photos;
    case ALBUMS_LIST:
        return &albums;
    case PHOTO_COMMENTS_LIST:
        return &comments;
    case PHOTO_TAGS_LIST:
        return &tags;
    case FAVORITE_PEOPLE_LIST:
        return &people;
    default:
        return nullptr;
    }
}
