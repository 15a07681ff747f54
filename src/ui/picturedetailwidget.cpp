#include "ui/picturedetailwidget.h"

#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"
#include "ui/detailactions.h"
#include "ui/detailinformation.h"
#include "ui/detailkeys.h"
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
    , mWalk(new DetailWalk(downloadPackageCB, this))
    , mStage(new DetailStage(this))
    , mPictures(new DetailPictures(mStage, this))
    , mStrip(new DetailStrip(this))
    , mActions(new DetailActions(this))
    , mInformation(new DetailInformation(this))
    , mZoom(new ZoomView(this))
{
    mWidgetInst = this;
    setFocusPolicy(Qt::StrongFocus);
    connectWalk();
    connect(mStage, &DetailStage::resized, this, [this] {
        if (number() > 0 && isVisible())
            mPictures->refit();
    });
    connect(mPictures, &DetailPictures::settled, this, &PictureDetailWidget::fetchNotes);
    connect(mZoom, &ZoomView::left, this, [this] {
        mPictures->refit();
        emit viewChanged();
    });
}

void PictureDetailWidget::connectWalk()
{
    connect(mWalk, &DetailWalk::moved, this, &PictureDetailWidget::display);
    connect(mWalk, &DetailWalk::pageChanged, this, &PictureDetailWidget::handleDetailPageChange);
    connect(mWalk, &DetailWalk::waiting, this, [this] {
        mStage->setBusy(true);
        mStage->setMessage(DetailTexts::text(DetailTexts::LoadingPage));
    });
    connect(mWalk, &DetailWalk::ended, this, [this](bool failed) {
        mStage->setBusy(mStage->isWaiting());
        mStage->setMessage(failed ? DetailTexts::text(DetailTexts::PageFailed) : QString());
        mStage->setNeighbours(number() > 1, number() < total());
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
    mIsSelfPhoto = isSelfPhoto;
    mActions->setActions(detailActions(isSelfPhoto));
    layOut();
    if (isEnterPress) {
        mActions->moveToFirst();
        setZone(Zone::Photo);
    }
    mWalk->open(recordIndex, package, firstNumber);
}

// Another photo than before.
void PictureDetailWidget::display()
{
    mZoom->dismiss();
    mNotes.open(photo());
    if (isVisible())
        showPictures();
    showInformation();
    emit viewChanged();
}

void PictureDetailWidget::showPictures()
{
    mPictures->show(photo(), mWalk->nextUrl());
    mStage->setNeighbours(number() > 1, number() < total());
    showStrip();
}

void PictureDetailWidget::downloadPackageCB(PackageProperty &property, ErrorCode code)
{
    logLine("{PictureDetailWidget::downloadPackageCB} type ", property.mType, " code ", code);
    if (!mWidgetInst)
        return;
    if (!isNote(property)) {
        mWidgetInst->mWalk->listArrived(property, code);
        return;
    }
    if (mWidgetInst->mNotes.take(property, code))
        mWidgetInst->showInformation();
    emit mWidgetInst->notesArrived(property, code);
}

void PictureDetailWidget::updateList(PackageProperty &property)
{
    if (number() == 0 || isNote(property) || !isVisible())
        return;
    if (mWalk->isWaiting())
        mWalk->listArrived(property, NET_SUCCESS);
    showStrip();
    showInformation();
}

void PictureDetailWidget::showStrip()
{
    const int places = std::min(mStrip->places(), std::max(1, total()));
    const int first = detailpaging::stripStart(number(), total(), places);
    QVector<DetailStrip::Neighbour> neighbours;
    for (int place = first; place < first + places; ++place)
        neighbours.append({mWalk->thumbnailUrl(place), place == number()});
    mStrip->showNeighbours(neighbours);
}

void PictureDetailWidget::showInformation()
{
    mInformation->showNotes(photo(), mNotes, QStringLiteral("%1/%2").arg(number()).arg(total()));
}

void PictureDetailWidget::fetchNotes()
{
    mNotes.request(downloadPackageCB);
    showInformation();
}

void PictureDetailWidget::refreshNotes()
{
    if (number() == 0)
        return;
    mNotes.forgetCached();
    fetchNotes();
}

QList<QPair<int, QString>> PictureDetailWidget::keyHints() const
{
    if (mZoom->isVisible())
        return {}; // it shows its own
    QList<QPair<int, QString>> hints;
    if (mZone == Zone::Photo)
        hints = {{DEVICE_SELECT_KEY, DetailTexts::text(DetailTexts::FullScreen)},
                 {DEVICE_DOWN_KEY, DetailTexts::text(DetailTexts::Actions)}};
    else
        hints = {{DEVICE_SELECT_KEY, I18n::shortCut(6)}};
    return hints << qMakePair(int(DEVICE_PLAY_KEY), I18n::shortCut(9))
                 << qMakePair(int(DEVICE_RETURN_KEY), I18n::shortCut(2));
}

void PictureDetailWidget::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (mZoom->isVisible() && mZoom->handleKey(event->key()))
        return;
    const DetailCommand command = detailCommand(mZone == Zone::Actions, event->key());
    if (command == DetailCommand::None)
        event->ignore();
    else
        perform(command);
}

void PictureDetailWidget::perform(DetailCommand command)
{
    switch (command) {
    case DetailCommand::Previous:
        mWalk->goTo(number() - 1);
        break;
    case DetailCommand::Next:
        mWalk->goTo(number() + 1);
        break;
    case DetailCommand::PageBack:
        mWalk->goTo(std::max(1, number() - paging::pageSize));
        break;
    case DetailCommand::PageOn:
        mWalk->goTo(std::min(total(), number() + paging::pageSize));
        break;
    case DetailCommand::FullScreen:
        if (number() > 0)
            emit slideShow(recordIndex());
        break;
    case DetailCommand::ToActions:
        setZone(Zone::Actions);
        break;
    case DetailCommand::ToPhoto:
        setZone(Zone::Photo);
        break;
    case DetailCommand::ActionLeft:
        mActions->move(-1);
        break;
    case DetailCommand::ActionRight:
        mActions->move(1);
        break;
    case DetailCommand::RunAction:
        run(mActions->current());
        break;
    case DetailCommand::Play:
        run(DetailAction::Play);
        break;
    case DetailCommand::Back:
        emit backSignal(recordIndex());
        break;
    case DetailCommand::Stay:
    case DetailCommand::None:
        break;
    }
}

void PictureDetailWidget::run(DetailAction action)
{
    if (number() == 0)
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
    const QPixmap *whole = PhotoManager::getPhoto(photo().imageUrl);
    const QPixmap picture = whole ? *whole : mStage->picture();
    if (mStage->isWaiting() || picture.isNull() || !mStage->message().isEmpty())
        return;
    mZoom->open(picture, photo().size);
    const int width =
        zoom::sourceWidth(photo().size, mZoom->largestWidth(), SystemConfig::imageCacheSize() / 2);
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
    if (number() > 0 && isVisible())
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
    if (number() > 0)
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
