#pragma once

#include <QString>

// What the photo screen says beyond the wording of I18n, by index.
class DetailTexts
{
public:
    enum Text {
        Zoom = 0,
        Information = 1,
        FullScreen = 2,
        Closer = 3,
        Farther = 4,
        Actions = 5,
        Untitled = 6,
        By = 7,     // followed by a name
        Pixels = 8, // %1: width, %2: height
        LoadingComments = 9,
        NoComments = 10,
        CommentsFailed = 11,
        PhotoGone = 12,
        PhotoFailed = 13,
        PageFailed = 14,
        LoadingPage = 15,
    };

    // The text, or "Unknown" for an index outside the table.
    static QString text(int index);
};
