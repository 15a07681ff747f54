#pragma once

#include <QPixmap>
#include <QSize>

// What a finished picture is put into: the labels of the grid, the photo screen and the slide show
// implement it. A target that dies is forgotten by Download by itself.
class ImageTarget
{
public:
    ImageTarget() = default;
    virtual ~ImageTarget(); // takes itself out of Download's tables
    ImageTarget(const ImageTarget &) = delete;
    ImageTarget &operator=(const ImageTarget &) = delete;

    // Size that a picture is scaled to fit, in device pixels.
    virtual QSize imageSize() const = 0;
    // Shows the picture: already scaled to fit imageSize(), keeping its aspect ratio, with a device
    // pixel ratio of the interface's scale.
    virtual void setImage(const QPixmap &picture) = 0;
    // Shows a picture of the program's own (":/res/..."), such as the failed-image picture.
    virtual void setPlaceholder(const QString &resource) = 0;
};
