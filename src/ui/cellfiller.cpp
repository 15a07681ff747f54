#include "ui/cellfiller.h"

#include "base/i18n.h"
#include "base/log.h"
#include "data/download.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "ui/formscrollwidget.h"
#include "ui/paging.h"
#include "ui/photoitem.h"
#include "ui/qimageslide.h"

#include <QFontMetrics>

#include <algorithm>

namespace {

constexpr int kCaptionHeight = 20; // pixels of the font
constexpr int kLongestTitle = 10000;

// One line of a text from the service.
QString oneLine(const QString &text)
{
    return text.left(kLongestTitle).simplified();
}

QString albumCaption(const Album &album, const PhotoItem &cell)
{
    const QString title =
        QFontMetrics(cell.captionFont())
            .elidedText(oneLine(album.title()), Qt::ElideRight, cell.captionRect().width());
    const QString unit = album.numPhotos() == 1 ? I18n::label(18) : I18n::label(26);
    return title + QLatin1Char('\n') + QString::number(album.numPhotos()) + unit;
}

} // namespace

CellFiller::CellFiller(FormScrollWidget *content, QWidget *backdrop)
{
    for (int i = 0; i < paging::pageSize; ++i) {
        auto *cell = new PhotoItem(content);
        QFont font = cell->captionFont();
        font.setPixelSize(kCaptionHeight);
        cell->setCaptionFont(font);
        cell->setCaptionColor(QColor(0xe6, 0xed, 0xf2));
        cell->setBackdrop(backdrop);
        cell->hide();
        content->addItem(cell, i);
        mCells << cell;
    }
}

int CellFiller::fill(const Package &package, int first)
{
    const int shown = std::clamp(package.count() - first, 0, mCells.size());
    const int type = package.mProperty.mType;
    for (int i = 0; i < mCells.size(); ++i) {
        PhotoItem *cell = mCells.at(i);
        if (type != mDisplayType)
            cell->setDisplayType(type);
        if (i < shown)
            show(cell, faceOf(package, first + i, *cell));
        cell->setVisible(i < shown);
    }
    mDisplayType = type;
    return shown;
}

CellFiller::Face CellFiller::faceOf(const Package &package, int index, const PhotoItem &cell)
{
    switch (package.mProperty.mType) {
    case TYPE_ALBUM_LIST:
        if (const Album *album = package.record<Album>(index))
            return {albumCaption(*album, cell), album->thumbnailUrl()};
        logLine("Error HomeWidget::pushPackageData: get iAlbum data NULL i =", index);
        break;
    case TYPE_FAVORITE_PEOPLE:
        if (const FavoritePeople *person = package.record<FavoritePeople>(index))
            return {oneLine(person->nickname()), person->thumbnail()};
        logLine("Error HomeWidget::pushPackageData: get people data NULL i=", index);
        break;
    default:
        if (const OrvalaPhoto *photo = package.record<OrvalaPhoto>(index))
            return {oneLine(photo->title()), photo->thumbnailUrl()};
        logLine("Error HomeWidget::pushPackageData: get iPhoto data NULL i=", index);
    }
    return {};
}

void CellFiller::show(PhotoItem *cell, const Face &face)
{
    cell->setCaption(face.caption);
    Download::forget(cell);
    showThumbnail(cell, face.thumbnail);
}

void CellFiller::showThumbnail(PhotoItem *cell, QString url)
{
    if (const QPixmap *picture = PhotoManager::getPhoto(url)) {
        Download::showPicture(cell, *picture);
        return;
    }
    cell->setPlaceholder(QStringLiteral(":/res/image_not_download.png"));
    if (url.isEmpty() || QImageSlide::mIsShowing)
        return;
    Download::mHomeLabelUrlHash.insert(url, cell);
    if (!PhotoManager::downloadPhoto(url, Download::downloadHomePhotoCB))
        Download::downloadHomePhotoCB(url, NET_FAILED);
}

void CellFiller::cancelThumbnails()
{
    Download::mHomeLabelUrlHash.clear();
    if (!QImageSlide::mIsShowing) // whose photos wait in the same line
        PhotoManager::cancelDownloadWaitingPhoto();
}
