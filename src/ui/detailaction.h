#pragma once

#include <QVector>

// What can be done with the photo shown.
enum class DetailAction {
    Play,
    Zoom,
    AddComment,
    AllComments,
    TagList,
    AddTag, // one's own photos only
    Information,
};

using DetailActionList = QVector<DetailAction>;

// In the order of their places.
DetailActionList detailActions(bool isSelfPhoto);
