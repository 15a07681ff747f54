#include "index/photorows.h"

#include "index/database.h"

PhotoRecord photoAt(const Query &query)
{
    PhotoRecord photo;
    photo.id = query.number(0);
    photo.albumId = query.number(1);
    photo.userId = query.number(2);
    photo.userName = query.text(3);
    photo.key = query.text(4);
    photo.fileName = query.text(5);
    photo.fileSize = query.number(6);
    photo.width = static_cast<int>(query.number(7));
    photo.height = static_cast<int>(query.number(8));
    photo.title = query.text(9);
    photo.caption = query.text(10);
    photo.published = query.text(11);
    photo.keywords = query.text(12);
    photo.commentCount = static_cast<int>(query.number(13));
    if (!query.isNull(14) && !query.isNull(15)) {
        photo.latitude = query.real(14);
        photo.longitude = query.real(15);
    }
    return photo;
}
