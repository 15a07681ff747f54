#include "ui/slidephotos.h"

#include "data/download.h"
#include "data/photomanager.h"

SlidePhotos *SlidePhotos::mInstance = nullptr;

namespace {

// Catches what Download would put into a label.
class ScaledPhoto : public ImageTarget
{
public:
    explicit ScaledPhoto(const QSize &room)
        : mRoom(room)
    {
    }
    QSize imageSize() const override { return mRoom; }
    void setImage(const QPixmap &picture) override { mPicture = picture; }
    void setPlaceholder(const QString &) override {}
    const QPixmap &picture() const { return mPicture; }

private:
    QSize mRoom;
    QPixmap mPicture;
};

} // namespace

SlidePhotos::SlidePhotos(SlideLabel *label, const SlideOptions &options, QObject *parent)
    : QObject(parent)
    , mLabel(label)
    , mOptions(options)
{
    mInstance = this;
    mPrepareTimer.setSingleShot(true);
    mPrepareTimer.setInterval(0); // behind the keys and paint events that wait
    connect(&mPrepareTimer, &QTimer::timeout, this, &SlidePhotos::prepareNext);
}

SlidePhotos::~SlidePhotos()
{
    clear();
    if (mInstance == this)
        mInstance = nullptr;
}

void SlidePhotos::show(const QString &url, const QString &thumbnailUrl, SlideLabel::Change change)
{
    if (url != mShown)
        mBefore = mShown;
    mShown = url;
    mIsAwaited = false;
    Download::forget(mLabel);
    Download::mCurrentSlideShowImageUrl = url;
    if (showNow(url, change))
        return;
    const bool hasThumbnail = PhotoManager::getPhoto(thumbnailUrl);
    standIn(thumbnailUrl);
    if (hasThumbnail && !mOptions.sharpen)
        return;
    const bool isRequested = request(url);
    Download::mPhotoSlideShowUrlHash.insert(url, mLabel);
    mIsAwaited = true;
    QString failed = url;
    if (!isRequested)
        Download::downloadSlideShowPhotoCB(failed, NET_FAILED);
}

bool SlidePhotos::showNow(const QString &url, SlideLabel::Change change)
{
    const SlidePicture slide = prepared(url);
    if (slide.isNull())
        return false;
    mLabel->showSlide(slide, change);
    return true;
}

void SlidePhotos::standIn(const QString &thumbnailUrl)
{
    if (const QPixmap *thumbnail = PhotoManager::getPhoto(thumbnailUrl))
        Download::showPicture(mLabel, *thumbnail);
    else
        mLabel->setPlaceholder(QStringLiteral(":/res/image_is_loading.png"));
}

// The photo ready to be painted, kept or made now from the cache; null when it is not there.
SlidePicture SlidePhotos::prepared(const QString &url)
{
    const auto kept = mPrepared.constFind(url);
    if (kept != mPrepared.constEnd() && kept->screen == mLabel->imageSize())
        return *kept;
    const QPixmap *photo = PhotoManager::getPhoto(url);
    if (!photo)
        return {};
    ScaledPhoto scaled(mLabel->imageSize());
    Download::showPicture(&scaled, *photo);
    return *mPrepared.insert(
        url, makeSlide(scaled.picture(), mLabel->imageSize(), mOptions.blurredFill));
}

bool SlidePhotos::isThere(const QString &url) const
{
    return mPrepared.contains(url) || PhotoManager::getPhoto(url);
}

bool SlidePhotos::isSettled(const QString &url) const
{
    return isThere(url) || mGone.contains(url) || mFailed.contains(url);
}

void SlidePhotos::want(const QStringList &urls)
{
    mWanted = urls;
    const auto isWanted = [this](const QString &url) {
        return url == mShown || mWanted.contains(url);
    };
    const QSet<QString> asked = mAsked;
    for (const QString &url : asked) {
        if (!isWanted(url))
            giveUp(url);
    }
    for (auto url = mGone.begin(); url != mGone.end();)
        url = isWanted(*url) ? ++url : mGone.erase(url);
    for (auto slide = mPrepared.begin(); slide != mPrepared.end();)
        slide = isWanted(slide.key()) || slide.key() == mBefore ? ++slide : mPrepared.erase(slide);

    for (const QString &url : urls) {
        if (!isThere(url) && !mGone.contains(url))
            request(url);
    }
    mPrepareTimer.start();
}

// The same call-back as for the photo shown, and ours, which learns of the others too.
bool SlidePhotos::request(const QString &url)
{
    if (!url.isEmpty() && PhotoManager::downloadPhoto(url, Download::downloadSlideShowPhotoCB)) {
        PhotoManager::downloadPhoto(url, arrivedCB);
        mAsked.insert(url);
        return true;
    }
    mFailed.insert(url);
    return false;
}

void SlidePhotos::giveUp(const QString &url)
{
    mAsked.remove(url);
    PhotoManager::withdraw(url, arrivedCB);
    PhotoManager::withdraw(url, Download::downloadSlideShowPhotoCB);
}

void SlidePhotos::clear()
{
    mShown.clear();
    mBefore.clear();
    want({});
    mPrepareTimer.stop();
    mFailed.clear();
    mPrepared.clear();
    Download::forget(mLabel);
    Download::mCurrentSlideShowImageUrl.clear();
}

void SlidePhotos::arrivedCB(QString &url, ErrorCode code)
{
    if (mInstance)
        mInstance->take(url, code);
}

void SlidePhotos::take(const QString &url, ErrorCode code)
{
    mAsked.remove(url);
    mGone.insert(url);
    if (code == NET_SUCCESS)
        mFailed.remove(url);
    else
        mFailed.insert(url);
    if (url == mShown && mIsAwaited && code == NET_SUCCESS && mLabel->placeholder().isEmpty())
        mPrepared.insert(url, mLabel->slide()); // Download has put it there already
    if (mWanted.value(0) == url)
        mPrepareTimer.start();
    emit arrived(url);
}

void SlidePhotos::prepareNext()
{
    if (!mWanted.isEmpty())
        prepared(mWanted.first());
}
