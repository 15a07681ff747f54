#include "ui/detailpictures.h"

#include "data/download.h"
#include "data/imagetarget.h"
#include "ui/detailstage.h"
#include "ui/detailtexts.h"
#include "ui/qimageslide.h"
#include "ui/zoom.h"

DetailPictures *DetailPictures::mInstance = nullptr;

namespace {

constexpr int kSettleTime = 150; // milliseconds without another photo

void ignorePrefetched(QString &, ErrorCode) {}

} // namespace

// Takes the thumbnail for the stage when it was not in the cache yet.
class DetailPictures::Preview : public ImageTarget
{
public:
    explicit Preview(DetailStage *stage)
        : mStage(stage)
    {
    }

    QSize imageSize() const override { return QSize(); }
    void setImage(const QPixmap &picture) override
    {
        if (mStage->isWaiting())
            mStage->showPreview(picture, mPhotoSize);
    }
    void setPlaceholder(const QString &) override {}

    QSize mPhotoSize;

private:
    DetailStage *mStage;
};

DetailPictures::DetailPictures(DetailStage *stage, QObject *parent)
    : QObject(parent)
    , mStage(stage)
    , mPreview(std::make_unique<Preview>(stage))
{
    mInstance = this;
    mSettle.setSingleShot(true);
    mSettle.setInterval(kSettleTime);
    connect(&mSettle, &QTimer::timeout, this, &DetailPictures::settle);
}

DetailPictures::~DetailPictures()
{
    stop();
    if (mInstance == this)
        mInstance = nullptr;
}

// What was queued for the photos before is dropped, so that this one comes first.
void DetailPictures::show(const DetailPhoto &photo, const QString &nextUrl)
{
    const bool isRushing = mSettle.isActive();
    stop();
    mPhoto = photo;
    mNextUrl = nextUrl;
    mIsFetched = false;
    mSettle.start();
    showPreview();
    if (!isRushing || PhotoManager::getPhoto(photo.imageUrl))
        refit();
}

void DetailPictures::showPreview()
{
    const QPixmap *thumbnail = PhotoManager::getPhoto(mPhoto.thumbnailUrl);
    mStage->showPreview(thumbnail ? *thumbnail : QPixmap(), mPhoto.size);
    mPreview->mPhotoSize = mPhoto.size;
    if (!thumbnail && !mPhoto.thumbnailUrl.isEmpty())
        showSmall(mPreview.get(), mPhoto.thumbnailUrl);
}

void DetailPictures::refit()
{
    mIsFetched = true;
    fetchLarge(mStage, mPhoto.imageUrl);
}

void DetailPictures::showSharper(ImageTarget *target, int width)
{
    fetchLarge(target, zoom::addressForWidth(mPhoto.imageUrl, width));
}

void DetailPictures::fetchLarge(ImageTarget *target, QString url)
{
    Download::mDetailLabelUrlHash.clear();
    Download::mCurrentDetailImageUrl = url;
    if (const QPixmap *cached = PhotoManager::getPhoto(url)) {
        Download::showPicture(target, QPixmap(*cached));
        prefetch();
        return;
    }
    Download::mDetailLabelUrlHash.insert(url, target);
    if (url.isEmpty() || !PhotoManager::downloadPhoto(url, largePhotoCB))
        largePhotoCB(url, NET_FAILED);
}

void DetailPictures::showSmall(ImageTarget *target, QString url)
{
    if (const QPixmap *cached = PhotoManager::getPhoto(url)) {
        Download::showPicture(target, QPixmap(*cached));
        return;
    }
    Download::mDetailSmallLabelUrlHash.insert(url, target);
    if (!PhotoManager::downloadPhoto(url, Download::downloadDetailSmallPhotoCB))
        Download::downloadDetailSmallPhotoCB(url, NET_FAILED);
}

void DetailPictures::largePhotoCB(QString &url, ErrorCode code)
{
    Download::downloadDetailPhotoCB(url, code);
    if (mInstance)
        mInstance->largeFinished(url, code);
}

// A picture that the cache did not take is delivered to nobody: the stage would wait for ever.
void DetailPictures::largeFinished(const QString &url, ErrorCode code)
{
    if (url != mPhoto.imageUrl || url != Download::mCurrentDetailImageUrl)
        return;
    if (mStage->isWaiting()) {
        mStage->setPlaceholder(QStringLiteral(":/res/image_download_failed.png"));
        code = NET_FAILED;
    }
    if (code == NET_CONTENT_ERROR)
        mStage->setMessage(DetailTexts::text(DetailTexts::PhotoGone));
    else if (code != NET_SUCCESS)
        mStage->setMessage(DetailTexts::text(DetailTexts::PhotoFailed));
    prefetch();
}

void DetailPictures::prefetch()
{
    if (!mNextUrl.isEmpty() && !PhotoManager::getPhoto(mNextUrl))
        PhotoManager::downloadPhoto(mNextUrl, ignorePrefetched);
    mNextUrl.clear();
}

void DetailPictures::settle()
{
    if (!mIsFetched)
        refit();
    emit settled();
}

void DetailPictures::stop()
{
    mSettle.stop();
    Download::mDetailLabelUrlHash.clear();
    Download::mDetailSmallLabelUrlHash.clear();
    if (!QImageSlide::mIsShowing) // whose photos wait in the same line
        PhotoManager::cancelDownloadWaitingPhoto();
}
