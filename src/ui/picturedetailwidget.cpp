#include "ui/picturedetailwidget.h"

#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"
#include "ui/detailactions.h"
#include "ui/detailinformation.h"
#include "ui/detailpaging.h"
#include "ui/detailpictures.h"
#include "ui/detailstage.h"
#include "ui/detailstrip.h"
#include "ui/detailtexts.h"
#include "ui/paging.h"
#include "ui/zoom.h"
#include "ui/zoomview.h"

#include <QKeyEvent>

#include <algorithm>

PictureDetailWidget *PictureDetailWidget::mWidgetInst = nullptr;

namespace {

constexpr int kGap = 12;

bool isNote(const PackageProperty &property)
{
    return property.mType == PHOTO_COMMENTS_LIST || property.mType == PHOTO_TAGS_LIST;
}

} // namespace

PictureDetailWidget::PictureDetailWidget(QWidget *parent)
    : QWidget(parent)
    , mStage(new DetailStage(this))
    , mPictures(new DetailPictures(mStage, this))
    , mStrip(new DetailStrip(this))
    , mActions(new DetailActions(this))
    , mInformation(new DetailInformation(this))
    , mZoom(new ZoomView(this))
{
    mWidgetInst = this;
    setFocusPolicy(Qt::StrongFocus);
    connect(mStage, &DetailStage::resized, this, [this] {
        if (mNumber > 0 && isVisible())
            mPictures->refit();
    });
    connect(mPictures, &DetailPictures::settled, this, &PictureDetailWidget::fetchNotes);
    connect(mZoom, &ZoomView::left, this, [this] {
        mPictures->refit();
        emit viewChanged();
    });
}

PictureDetailWidget::~PictureDetailWidget()
{
    if (mWidgetInst == this)
        mWidgetInst = nullptr;
}

void PictureDetailWidget::showPhoto(int recordIndex, Package *package, bool isSelfPhoto,
                                    bool isEnterPress, int firstNumber)
{
    logLine("enter PictureDetailWidget::showPhoto(), index = ", recordIndex);
    mList.open(package, firstNumber);
    mIsSelfPhoto = isSelfPhoto;
    mActions->setActions(detailActions(isSelfPhoto));
    layOut();
    if (isEnterPress) {
        mActions->moveToFirst();
        setZone(Zone::Photo);
    }
    mNumber = 0; // whatever page it is on, the owner knows
    const int number = mList.number(recordIndex);
    if (const OrvalaPhoto *record = mList.photo(number))
        display(number, DetailPhoto::of(*record));
    else
        fetchList(number);
}

void PictureDetailWidget::goTo(int number)
{
    if (number < 1 || number > mList.total() || number == mNumber)
        return;
    if (const OrvalaPhoto *record = mList.photo(number))
        display(number, DetailPhoto::of(*record));
    else
        fetchList(number);
}

void PictureDetailWidget::display(int number, const DetailPhoto &photo)
{
    const int before = mNumber;
    mNumber = number;
    mWanted = 0;
    mPhoto = photo;
    mZoom->dismiss();
    mNotes.open(photo);
    const OrvalaPhoto *next = mList.photo(number >= before ? number + 1 : number - 1);
    mNextUrl = next ? next->imageUrl() : QString();
    if (isVisible())
        showPictures();
    showInformation();
    const int page = detailpaging::pageStart(mList.type(), number);
    mList.prepareFollowing(number);
    if (before > 0 && page != detailpaging::pageStart(mList.type(), before))
        emit handleDetailPageChange(page, number > before);
    emit viewChanged();
}

void PictureDetailWidget::showPictures()
{
    mPictures->show(mPhoto, mNextUrl);
    mStage->setNeighbours(mNumber > 1, mNumber < mList.total());
    showStrip();
}

// The photo shown stays until the one wanted is there.
void PictureDetailWidget::fetchList(int number)
{
    mWanted = number;
    mRequest = mList.requestFor(number);
    mStage->setBusy(true);
    mStage->setMessage(DetailTexts::text(DetailTexts::LoadingPage));
    if (!PackageManager::downloadPage(mRequest, downloadPackageCB))
        listArrived(mRequest, NET_FAILED);
}

void PictureDetailWidget::downloadPackageCB(PackageProperty &property, ErrorCode code)
{
    logLine("{PictureDetailWidget::downloadPackageCB} type ", property.mType, " code ", code);
    if (!mWidgetInst)
        return;
    if (isNote(property))
        mWidgetInst->takeNotes(property, code);
    else
        mWidgetInst->listArrived(property, code);
}

void PictureDetailWidget::listArrived(const PackageProperty &property, ErrorCode code)
{
    if (mWanted == 0 || property != mRequest)
        return;
    const bool isNew = code == NET_SUCCESS && mList.take(property);
    // A list fetched anew may have lost or gained photos before this one.
    const int moved = mNumber > 0 && isNew ? mList.find(mPhoto) - mNumber : 0;
    if (mNumber > 0 && mNumber + moved > 0) {
        mNumber += moved;
        mWanted += moved;
    }
    const int wanted = std::min(mWanted, mList.total());
    if (isNew && wanted > 0 && !mList.photo(wanted)) {
        fetchList(wanted); // another page nearer
        return;
    }
    mWanted = 0;
    mStage->setBusy(mStage->isWaiting());
    const bool failed = code != NET_SUCCESS || (!isNew && mNumber == 0);
    mStage->setMessage(failed ? DetailTexts::text(DetailTexts::PageFailed) : QString());
    if (isNew)
        goTo(wanted);
    mStage->setNeighbours(mNumber > 1, mNumber < mList.total());
}

void PictureDetailWidget::updateList(PackageProperty &property)
{
    if (mNumber == 0 || isNote(property) || !isVisible())
        return;
    if (mWanted > 0)
        listArrived(property, NET_SUCCESS);
    showStrip();
    showInformation();
}

void PictureDetailWidget::showStrip()
{
    const int places = std::min(mStrip->places(), std::max(1, mList.total()));
    const int first = detailpaging::stripStart(mNumber, mList.total(), places);
    QVector<DetailStrip::Neighbour> neighbours;
    for (int number = first; number < first + places; ++number) {
        const OrvalaPhoto *record = mList.photo(number);
        neighbours.append({record ? record->thumbnailUrl() : QString(), number == mNumber});
    }
    mStrip->showNeighbours(neighbours);
}

void PictureDetailWidget::showInformation()
{
    mInformation->showNotes(mPhoto, mNotes, QStringLiteral("%1/%2").arg(mNumber).arg(total()));
}

void PictureDetailWidget::fetchNotes()
{
    mNotes.request(downloadPackageCB);
    showInformation();
}

void PictureDetailWidget::takeNotes(const PackageProperty &property, ErrorCode code)
{
    if (mNotes.take(property, code))
        showInformation();
    emit notesArrived(property, code);
}

void PictureDetailWidget::refreshNotes()
{
    if (mNumber == 0)
        return;
    mNotes.forgetCached();
    fetchNotes();
}

QList<QPair<int, QString>> PictureDetailWidget::keyHints() const
{
    if (mZoom->isVisible())
        return {}; // it shows its own
    const QString select =
        mZone == Zone::Photo ? DetailTexts::text(DetailTexts::FullScreen) : I18n::shortCut(6);
    return {{DEVICE_SELECT_KEY, select},
            {DEVICE_DOWN_KEY, DetailTexts::text(DetailTexts::Actions)},
            {DEVICE_PLAY_KEY, I18n::shortCut(9)},
            {DEVICE_RETURN_KEY, I18n::shortCut(2)}};
}

void PictureDetailWidget::keyPressEvent(QKeyEvent *event)
{
    event->setAccepted(handleKey(event->key()));
}

// What the place with the focus does not take is the same everywhere on the screen.
bool PictureDetailWidget::handleKey(int key)
{
    if (mZoom->isVisible() && mZoom->handleKey(key))
        return true;
    if (mZone == Zone::Photo ? handlePhotoKey(key) : handleActionKey(key))
        return true;
    switch (key) {
    case DEVICE_PRE_KEY:
        goTo(mNumber - 1);
        return true;
    case DEVICE_NEXT_KEY:
        goTo(mNumber + 1);
        return true;
    case DEVICE_PAGEUP_KEY:
        goTo(std::max(1, mNumber - paging::pageSize));
        return true;
    case DEVICE_PAGEDOWN_KEY:
        goTo(std::min(mList.total(), mNumber + paging::pageSize));
        return true;
    case DEVICE_PLAY_KEY:
    case DEVICE_PLAYPAUSE_KEY:
        run(DetailAction::Play);
        return true;
    case DEVICE_RETURN_KEY:
        emit backSignal(recordIndex());
        return true;
    default:
        return false;
    }
}

bool PictureDetailWidget::handlePhotoKey(int key)
{
    switch (key) {
    case DEVICE_LEFT_KEY:
        goTo(mNumber - 1);
        return true;
    case DEVICE_RIGHT_KEY:
        goTo(mNumber + 1);
        return true;
    case DEVICE_DOWN_KEY:
        setZone(Zone::Actions);
        return true;
    case DEVICE_SELECT_KEY:
        if (mNumber > 0)
            emit slideShow(recordIndex());
        return true;
    default:
        return false;
    }
}

bool PictureDetailWidget::handleActionKey(int key)
{
    switch (key) {
    case DEVICE_LEFT_KEY:
        mActions->move(-1);
        return true;
    case DEVICE_RIGHT_KEY:
        mActions->move(1);
        return true;
    case DEVICE_UP_KEY:
        setZone(Zone::Photo);
        return true;
    case DEVICE_DOWN_KEY:
        return true;
    case DEVICE_SELECT_KEY:
        run(mActions->current());
        return true;
    default:
        return false;
    }
}

void PictureDetailWidget::run(DetailAction action)
{
    if (mNumber == 0)
        return;
    switch (action) {
    case DetailAction::Play:
        emit slidePlay(recordIndex());
        break;
    case DetailAction::Zoom:
        openZoom();
        break;
    case DetailAction::AddComment:
        emit addCommentSignal();
        break;
    case DetailAction::AllComments:
        emit showMoreCommentSignal();
        break;
    case DetailAction::TagList:
        emit showTagSignal();
        break;
    case DetailAction::AddTag:
        emit addTagSignal();
        break;
    case DetailAction::Information:
        mInformation->setVisible(mInformation->isHidden());
        layOut();
    }
}

// At once with the picture that is there; a sharper one follows.
void PictureDetailWidget::openZoom()
{
    const QPixmap *whole = PhotoManager::getPhoto(mPhoto.imageUrl);
    const QPixmap picture = whole ? *whole : mStage->picture();
    if (mStage->isWaiting() || picture.isNull() || !mStage->message().isEmpty())
        return;
    mZoom->open(picture, mPhoto.size);
    const int width =
        zoom::sourceWidth(mPhoto.size, mZoom->largestWidth(), SystemConfig::imageCacheSize() / 2);
    if (width > picture.width())
        mPictures->showSharper(mZoom, width);
    emit viewChanged();
}

void PictureDetailWidget::setZone(Zone zone)
{
    mZone = zone;
    updateMarks();
    emit viewChanged();
}

void PictureDetailWidget::updateMarks()
{
    mStage->setMarked(hasFocus() && mZone == Zone::Photo);
    mActions->setMarked(hasFocus() && mZone == Zone::Actions);
}

// Photo and information above, neighbours and actions below.
void PictureDetailWidget::layOut()
{
    const QSize actions = mActions->sizeHint();
    const int band = std::max(actions.height(), mStrip->sizeHint().height());
    const int above = std::max(1, height() - band - kGap);
    const int information = mInformation->isHidden() ? 0 : mInformation->sizeHint().width() + kGap;
    mStage->setGeometry(0, 0, std::max(1, width() - information), above);
    mInformation->setGeometry(width() - information + kGap, 0, mInformation->sizeHint().width(),
                              above);
    mStrip->setGeometry(0, above + kGap, std::max(1, width() - actions.width() - kGap), band);
    mActions->setGeometry(width() - actions.width(), above + kGap, actions.width(), band);
    mZoom->setGeometry(rect());
    if (mNumber > 0 && isVisible())
        showStrip();
}

void PictureDetailWidget::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    layOut();
}

void PictureDetailWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (mNumber > 0)
        showPictures();
}

void PictureDetailWidget::hideEvent(QHideEvent *event)
{
    QWidget::hideEvent(event);
    mZoom->dismiss();
    mPictures->stop();
}

void PictureDetailWidget::focusInEvent(QFocusEvent *event)
{
    QWidget::focusInEvent(event);
    updateMarks();
}

void PictureDetailWidget::focusOutEvent(QFocusEvent *event)
{
    QWidget::focusOutEvent(event);
    updateMarks();
}
