#pragma once

#include "network/errorcode.h"

#include <QMultiHash>
#include <QPixmap>
#include <QString>

class ImageTarget;

// Static call-backs for PhotoManager that put a finished picture into the labels waiting for it. A
// screen registers its labels under the URL (and the current URL, for the large pictures) before it
// calls PhotoManager::downloadPhoto with the matching call-back.
class Download
{
public:
    static QMultiHash<QString, ImageTarget *> mHomeLabelUrlHash;
    static QMultiHash<QString, ImageTarget *> mDetailLabelUrlHash;
    static QMultiHash<QString, ImageTarget *> mDetailSmallLabelUrlHash;
    static QMultiHash<QString, ImageTarget *> mPhotoSlideShowUrlHash;
    static QString mCurrentDetailImageUrl;    // the large picture that the photo screen wants now
    static QString mCurrentSlideShowImageUrl; // the picture that the slide show wants now

    static void downloadHomePhotoCB(QString &url, ErrorCode code);
    static void downloadDetailPhotoCB(QString &url, ErrorCode code);
    static void downloadDetailSmallPhotoCB(QString &url, ErrorCode code);
    static void downloadSlideShowPhotoCB(QString &url, ErrorCode code);

    // Scales a picture to fit the target and shows it: what the call-backs do, for a picture that
    // is already in the cache.
    static void showPicture(ImageTarget *target, const QPixmap &picture);

    // Takes the target out of every table.
    static void forget(ImageTarget *target);
};
