#include "ui/photoitem.h"

#include "common/ui/picture.h"
#include "common/ui/stretchedpicture.h"
#include "data/packageproperty.h"
#include "network/systemconfig.h"

#include <QPaintEvent>
#include <QPainter>

namespace {

constexpr int kLongestCaption = 10000; // characters that are laid out at most
constexpr int kBorder = 2;
const QColor kFocusTint(0x1d, 0x78, 0xbd, 190);
constexpr int kSpaceBelow = 6; // between the caption and the edge of the focus bar

const char *const kUnfocusedStyle =
    "QFrame{border-style: solid; border-width: 2px; border-color: transparent}QLabel{border-width: "
    "0px}QPushButton{border-width:0px}";
const char *const kFocusedStyle =
    "PhotoItem{border-image: url(%1);border-width: 2px;}QPushButton{border-width:0px}QLabel{"
    "border-image:none;}";
const char *const kFocusBar = ":/res/FocusBar.png";

const char *const kAlbumStyle = "border-image:url(%1);";
const char *const kPhotoStyle = "background-color:white;border-image:url(%1)";
const char *const kPlainStyle = "border-image:none;background-color:transparent";
const char *const kAlbumGround = ":/res/Album_Thumbnail_Bg.png";
const char *const kPhotoGround = ":/res/Thumbnail_Bg.png";

QString latin(const char *text)
{
    return QString::fromLatin1(text);
}

} // namespace

PhotoItem::PhotoItem(QWidget *parent)
    : QFrame(parent)
    , mCaptionFont(font())
{
    const QSize cell = SystemConfig::photoItemSize();
    mCaptionHeight = cell.height() / 5;
    mPictureHeight = cell.height() - mCaptionHeight;
    setFocusPolicy(Qt::StrongFocus);
    setContentsMargins(10, 0, 10, 0);
    setFixedSize(cell);
}

PhotoItem::~PhotoItem()
{
    forgetFaces();
}

void PhotoItem::setBackdrop(QWidget *backdrop)
{
    mBackdrop = backdrop;
    setAttribute(Qt::WA_OpaquePaintEvent, backdrop);
    change();
}

QString PhotoItem::styleSheet() const
{
    return hasFocus() ? latin(kFocusedStyle).arg(latin(kFocusBar)) : latin(kUnfocusedStyle);
}

QString PhotoItem::groundStyleSheet() const
{
    if (mDisplayType == TYPE_ALBUM_LIST)
        return latin(kAlbumStyle).arg(latin(kAlbumGround));
    if (mDisplayType == TYPE_ALBUM_PHOTOS)
        return latin(kPhotoStyle).arg(latin(kPhotoGround));
    return latin(kPlainStyle);
}

void PhotoItem::setCaptionFont(const QFont &font)
{
    mCaptionFont = font;
    change();
}

void PhotoItem::setCaptionColor(const QColor &color)
{
    mCaptionColor = color;
    change();
}

void PhotoItem::setDisplayType(int type)
{
    mDisplayType = type;
    const QSize cell = SystemConfig::photoItemSize();
    const int line = QFontMetrics(mCaptionFont).lineSpacing();
    const int frame = type == TYPE_ALBUM_PHOTOS ? 25 : 0;
    mCaptionHeight = type == TYPE_ALBUM_LIST ? 2 * line : line;
    mPictureHeight = cell.height() - line - frame;
    mPicture = QPixmap(); // it had another size
    setFixedSize(cell.width(), cell.height() + mCaptionHeight + 10);
    change();
}

void PhotoItem::setCaption(const QString &text)
{
    mCaption = text.left(kLongestCaption);
    if (mDisplayType != TYPE_ALBUM_LIST)
        mCaption =
            QFontMetrics(mCaptionFont).elidedText(mCaption, Qt::ElideRight, captionRect().width());
    change();
}

QRect PhotoItem::groundRect() const
{
    QRect ground = contentsRect();
    ground.setHeight(height() - mCaptionHeight - kSpaceBelow);
    return ground;
}

QRect PhotoItem::pictureRect() const
{
    QRect picture(0, 0, int(width() * 0.8), mPictureHeight);
    picture.moveCenter(groundRect().center());
    return picture;
}

QRect PhotoItem::captionRect() const
{
    return {10, groundRect().bottom() + 1, width() - 20, mCaptionHeight};
}

QSize PhotoItem::imageSize() const
{
    return (QSizeF(pictureRect().size()) * devicePixelRatioF()).toSize();
}

void PhotoItem::setImage(const QPixmap &picture)
{
    const QSize size = imageSize();
    const bool fits = picture.width() <= size.width() && picture.height() <= size.height();
    show(fits ? picture : picture.scaled(size, Qt::KeepAspectRatio, Qt::SmoothTransformation));
}

void PhotoItem::setPlaceholder(const QString &resource)
{
    show(fittedPicture(resource, imageSize()));
}

void PhotoItem::show(const QPixmap &picture)
{
    const QSize size = imageSize();
    mPicture = picture;
    if (picture.size() != size) {
        QRect place(QPoint(0, 0), picture.size());
        place.moveTo((size.width() - picture.width()) / 2, (size.height() - picture.height()) / 2);
        QPixmap ground(size);
        ground.fill(Qt::transparent);
        QPainter painter(&ground);
        painter.drawPixmap(place, picture); // whatever the picture's device pixel ratio
        painter.end();
        mPicture = ground;
    }
    mPicture.setDevicePixelRatio(devicePixelRatioF());
    change();
}

void PhotoItem::change()
{
    forgetFaces();
    update();
}

void PhotoItem::forgetFaces()
{
    for (QPixmapCache::Key &key : mFaces)
        QPixmapCache::remove(key);
}

void PhotoItem::focusInEvent(QFocusEvent *event)
{
    QFrame::focusInEvent(event);
    update();
}

void PhotoItem::focusOutEvent(QFocusEvent *event)
{
    QFrame::focusOutEvent(event);
    update();
}

void PhotoItem::paintEvent(QPaintEvent *event)
{
    QPainter painter(this);
    if (mBackdrop)
        copyPixels(painter, face(hasFocus()), event->rect(), devicePixelRatioF());
    else
        paintFace(painter, hasFocus());
}

// Scrolling moves the cell over the backdrop, whose part in the face is then another one.
QPixmap PhotoItem::face(bool focused)
{
    const QRect ground(mapTo(mBackdrop, QPoint(0, 0)), mBackdrop->size());
    if (ground != mFacesGround)
        forgetFaces();
    mFacesGround = ground;
    QPixmap kept;
    if (!QPixmapCache::find(mFaces[focused], &kept)) {
        kept = renderFace(focused);
        mFaces[focused] = QPixmapCache::insert(kept);
    }
    return kept;
}

QPixmap PhotoItem::renderFace(bool focused) const
{
    QPixmap face((QSizeF(size()) * devicePixelRatioF()).toSize());
    face.fill(Qt::black);
    face.setDevicePixelRatio(devicePixelRatioF());
    QPainter painter(&face);
    mBackdrop->render(&painter, QPoint(0, 0), QRect(mFacesGround.topLeft(), size()),
                      QWidget::RenderFlags());
    paintFace(painter, focused);
    painter.end();
    face.setDevicePixelRatio(1);
    return face;
}

void PhotoItem::paintFace(QPainter &painter, bool focused) const
{
    if (focused)
        painter.drawPixmap(0, 0, stretchedPicture(latin(kFocusBar), size(), kBorder, this));
    const QRect ground = groundRect();
    if (mDisplayType == TYPE_ALBUM_LIST) {
        painter.drawPixmap(ground.topLeft(), loadPicture(latin(kAlbumGround), ground.size()));
    } else if (mDisplayType == TYPE_ALBUM_PHOTOS) {
        painter.fillRect(ground, Qt::white);
        painter.drawPixmap(ground.topLeft(), loadPicture(latin(kPhotoGround), ground.size()));
        // The print covers most of the focus bar.
        if (focused)
            painter.fillRect(ground, kFocusTint);
    }
    painter.drawPixmap(pictureRect().topLeft(), mPicture);
    painter.setFont(mCaptionFont);
    painter.setPen(mCaptionColor);
    painter.drawText(captionRect(), Qt::AlignCenter, mCaption);
}
