#pragma once

#include "network/errorcode.h"

#include <QString>

// Uploads an image file into one of the user's albums.
class MediaUploader
{
public:
    enum Result : int {
        Busy = -2,
        UnknownFormat = -3, // also for an empty file
        NotOpened = -4,
        NotAnImage = -5,
        NothingRead = -6,
    };

    // Blocks until the service has answered. 0, a Result, or the code of PostHelper::postNewPhoto.
    // `busy`: an upload is under way already, and this one is refused.
    static ErrorCode startToUpload(QString filePath, QString title, QString userId, QString albumId,
                                   QString summary, bool busy);
};
