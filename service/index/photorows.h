#pragma once

#include "index/records.h"

class Query;

// One text for every list of photos: what follows it picks and orders.
#define PHOTO_COLUMNS                                                                              \
    "SELECT p.id, p.album, a.user, u.name, p.key, p.name, p.size, p.width, p.height, p.title, "    \
    "p.caption, p.published, "                                                                     \
    "(SELECT group_concat(tag, ', ') FROM (SELECT tag FROM tags WHERE photo = p.id ORDER BY "      \
    "id)), "                                                                                       \
    "(SELECT count(*) FROM comments WHERE photo = p.id), p.latitude, p.longitude "                 \
    "FROM photos p JOIN albums a ON a.id = p.album JOIN users u ON u.id = a.user "

// The record of the row at which a query with these columns stands.
PhotoRecord photoAt(const Query &query);
