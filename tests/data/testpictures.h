#pragma once

#include "data/imagetarget.h"

#include <QBuffer>
#include <QImage>

inline QByteArray encoded(const QImage &image, const char *format)
{
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, format);
    return bytes;
}

inline QImage plain(int width, int height)
{
    QImage image(width, height, QImage::Format_RGB32);
    image.fill(Qt::red);
    return image;
}

struct TestTarget : ImageTarget
{
    explicit TestTarget(const QSize &room)
        : size(room)
    {
    }
    QSize imageSize() const override { return size; }
    void setImage(const QPixmap &picture) override { shown = picture; }
    void setPlaceholder(const QString &resource) override { placeholder = resource; }

    QSize size;
    QPixmap shown;
    QString placeholder;
};
