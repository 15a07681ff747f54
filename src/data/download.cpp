#include "data/download.h"

#include "base/log.h"
#include "data/imagetarget.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"

#include <QPainter>

#include <utility>

using LabelTable = QMultiHash<QString, ImageTarget *>;

LabelTable Download::mHomeLabelUrlHash;
LabelTable Download::mDetailLabelUrlHash;
LabelTable Download::mDetailSmallLabelUrlHash;
LabelTable Download::mPhotoSlideShowUrlHash;
QString Download::mCurrentDetailImageUrl;
QString Download::mCurrentSlideShowImageUrl;

namespace {

// Takes the labels that wait for the URL now out of the table, one by one, for a label may do
// anything when it is given its picture: ask for another one, or delete its neighbours.
template <typename Action>
void takeEach(LabelTable &table, const QString &url, Action action)
{
    for (int left = table.count(url); left > 0 && table.contains(url); --left)
        action(table.take(url));
}

void showFailure(LabelTable &table, const QString &url, ErrorCode code)
{
    takeEach(table, url, [](ImageTarget *target) {
        target->setPlaceholder(QStringLiteral(":/res/image_download_failed.png"));
    });
    logLine("downloadPhoto :", url, "; failed with code :", code);
}

void deliver(LabelTable &table, const QString &url, ErrorCode code)
{
    if (!table.contains(url))
        return;
    if (code != NET_SUCCESS) {
        showFailure(table, url, code);
        return;
    }
    const QPixmap *cached = PhotoManager::getPhoto(url);
    if (!cached) {
        table.remove(url);
        logLine("downloadPhoto failed to show photo :", url);
        return;
    }
    logLine("downloadPhoto show photo :", url);
    const QPixmap picture = *cached;
    takeEach(table, url,
             [&picture](ImageTarget *target) { Download::showPicture(target, picture); });
}

bool isCurrent(const QString &currentUrl, const QString &url)
{
    if (currentUrl.isEmpty())
        logLine("Wrong maybe Wrong");
    return url == currentUrl;
}

// Scaling between neighbouring pixels: as good as averaging areas while hardly any pixel is left
// out, and more than twice as fast.
QPixmap interpolated(const QPixmap &picture, const QSize &size)
{
    const QImage source = picture.toImage();
    QImage result(size, source.format());
    QPainter painter(&result);
    painter.setCompositionMode(QPainter::CompositionMode_Source);
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    painter.drawImage(QRect(QPoint(0, 0), size), source);
    painter.end();
    return QPixmap::fromImage(std::move(result));
}

// A label that has no size yet gets the picture as it is; a very long and thin picture keeps at
// least one pixel.
QPixmap scaledToFit(const QPixmap &picture, const QSize &room)
{
    if (picture.isNull() || room.isEmpty())
        return picture;
    const QSize size = picture.size().scaled(room, Qt::KeepAspectRatio).expandedTo(QSize(1, 1));
    if (size == picture.size())
        return picture;
    return size.width() * 4 >= picture.width() * 3
               ? interpolated(picture, size)
               : picture.scaled(size, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
}

} // namespace

void Download::downloadHomePhotoCB(QString &url, ErrorCode code)
{
    deliver(mHomeLabelUrlHash, url, code);
}

void Download::downloadDetailPhotoCB(QString &url, ErrorCode code)
{
    if (isCurrent(mCurrentDetailImageUrl, url))
        deliver(mDetailLabelUrlHash, url, code);
}

void Download::downloadDetailSmallPhotoCB(QString &url, ErrorCode code)
{
    deliver(mDetailSmallLabelUrlHash, url, code);
}

void Download::downloadSlideShowPhotoCB(QString &url, ErrorCode code)
{
    if (isCurrent(mCurrentSlideShowImageUrl, url))
        deliver(mPhotoSlideShowUrlHash, url, code);
}

void Download::showPicture(ImageTarget *target, const QPixmap &picture)
{
    QPixmap fitting = scaledToFit(picture, target->imageSize());
    fitting.setDevicePixelRatio(SystemConfig::scale());
    target->setImage(fitting);
}

void Download::forget(ImageTarget *target)
{
    for (LabelTable *table : {&mHomeLabelUrlHash, &mDetailLabelUrlHash, &mDetailSmallLabelUrlHash,
                              &mPhotoSlideShowUrlHash}) {
        for (auto entry = table->begin(); entry != table->end();)
            entry = *entry == target ? table->erase(entry) : ++entry;
    }
}
