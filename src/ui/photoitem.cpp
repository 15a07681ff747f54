#include "ui/photoitem.h"

#include "common/ui/picture.h"
#include "data/packageproperty.h"
#include "network/systemconfig.h"
#include "ui/stretchedpicture.h"

#include <QPainter>
#include <QVBoxLayout>

namespace {

constexpr int kLongestCaption = 10000; // characters that are laid out at most
constexpr int kBorder = 2;
constexpr int kSpaceBelow = 6; // between the caption and the edge of the focus bar

const char *const kUnfocusedStyle =
    "QFrame{border-style: solid; border-width: 2px; border-color: transparent}QLabel{border-width: "
    "0px}QPushButton{border-width:0px}";
const char *const kFocusedStyle =
    "PhotoItem{border-image: url(%1);border-width: 2px;}QPushButton{border-width:0px}QLabel{"
    "border-image:none;}";
const char *const kFocusBar = ":/res/FocusBar.png";

const char *const kPictureStyle = "border-image:none;background-color:transparent";
const char *const kAlbumGround = ":/res/Album_Thumbnail_Bg.png";
const char *const kPhotoGround = ":/res/Thumbnail_Bg.png";

QString latin(const char *text)
{
    return QString::fromLatin1(text);
}

} // namespace

PhotoItem::PhotoItem(QWidget *parent)
    : QFrame(parent)
    , mArea(new PictureArea(this))
    , mPicture(new PhotoLabel(mArea))
    , mCaption(new CaptionLabel(this))
{
    setFocusPolicy(Qt::StrongFocus);
    setContentsMargins(10, 0, 10, 0);
    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(0);
    column->addWidget(mArea);
    column->addWidget(mCaption, 1, Qt::AlignHCenter | Qt::AlignTop);

    auto *row = new QHBoxLayout(mArea);
    row->setContentsMargins(0, 0, 0, 0);
    row->addWidget(mPicture, 0, Qt::AlignCenter);

    const QSize cell = SystemConfig::photoItemSize();
    mPicture->setStyleSheet(latin(kPictureStyle));
    mPicture->setFixedWidth(int(cell.width() * 0.8));
    mPicture->setAlignment(Qt::AlignCenter);
    mCaption->setTextFormat(Qt::PlainText);
    mCaption->setAlignment(Qt::AlignCenter);
    mCaption->setFixedWidth(cell.width() - 20);
    const int caption = cell.height() / 5;
    setHeights(cell.height() - caption, caption, cell);
}

QString PhotoItem::styleSheet() const
{
    return hasFocus() ? latin(kFocusedStyle).arg(latin(kFocusBar)) : latin(kUnfocusedStyle);
}

void PhotoItem::setCaptionFont(const QFont &font)
{
    mCaption->setFont(font);
}

void PhotoItem::setCaptionColor(const QColor &color)
{
    QPalette colours = mCaption->palette();
    colours.setColor(QPalette::WindowText, color);
    mCaption->setPalette(colours);
}

void PhotoItem::setHeights(int picture, int caption, const QSize &cell)
{
    mPicture->setFixedHeight(picture);
    mCaption->setFixedHeight(caption);
    mArea->setFixedHeight(cell.height() - caption - kSpaceBelow);
    setFixedSize(cell);
}

void PhotoItem::setDisplayType(int type)
{
    mDisplayType = type;
    const QSize cell = SystemConfig::photoItemSize();
    const int line = mCaption->fontMetrics().lineSpacing();
    const int caption = type == TYPE_ALBUM_LIST ? 2 * line : line;
    const int frame = type == TYPE_ALBUM_PHOTOS ? 25 : 0;
    if (type == TYPE_ALBUM_LIST)
        mArea->setGround(QStringLiteral("border-image:url(%1);").arg(latin(kAlbumGround)),
                         latin(kAlbumGround), Qt::transparent);
    else if (type == TYPE_ALBUM_PHOTOS)
        mArea->setGround(
            QStringLiteral("background-color:white;border-image:url(%1)").arg(latin(kPhotoGround)),
            latin(kPhotoGround), Qt::white);
    else
        mArea->setGround(latin(kPictureStyle), QString(), Qt::transparent);
    setHeights(cell.height() - line - frame, caption,
               QSize(cell.width(), cell.height() + caption + 10));
}

void PhotoItem::setCaption(const QString &text)
{
    const QString shown = text.left(kLongestCaption);
    if (mDisplayType == TYPE_ALBUM_LIST)
        mCaption->setCaption(shown);
    else
        mCaption->setCaption(
            mCaption->fontMetrics().elidedText(shown, Qt::ElideRight, captionWidth()));
}

QString PhotoItem::caption() const
{
    return mCaption->text();
}

int PhotoItem::captionWidth() const
{
    return mCaption->maximumWidth();
}

QFont PhotoItem::captionFont() const
{
    return mCaption->font();
}

QSize PhotoItem::imageSize() const
{
    return (QSizeF(mPicture->maximumSize()) * devicePixelRatioF()).toSize();
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
    if (picture.size() == size) {
        QPixmap whole = picture;
        whole.setDevicePixelRatio(devicePixelRatioF());
        mPicture->setPicture(whole);
        return;
    }
    QPixmap ground(size);
    ground.fill(Qt::transparent);
    QPixmap photo = picture;
    photo.setDevicePixelRatio(1);
    QPainter painter(&ground);
    painter.drawPixmap((size.width() - photo.width()) / 2, (size.height() - photo.height()) / 2,
                       photo);
    painter.end();
    ground.setDevicePixelRatio(devicePixelRatioF());
    mPicture->setPicture(ground);
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

void PhotoItem::paintEvent(QPaintEvent *)
{
    if (!hasFocus())
        return;
    QPainter painter(this);
    painter.drawPixmap(0, 0, stretchedPicture(latin(kFocusBar), size(), kBorder, this));
}

void PictureArea::setGround(const QString &sheet, const QString &resource, const QColor &colour)
{
    mSheet = sheet;
    mResource = resource;
    mColour = colour;
    update();
}

void PictureArea::paintEvent(QPaintEvent *)
{
    if (mResource.isEmpty())
        return;
    QPainter painter(this);
    if (mColour.alpha() > 0)
        painter.fillRect(rect(), mColour);
    painter.drawPixmap(0, 0, loadPicture(mResource, size()));
}

void PhotoLabel::setPicture(const QPixmap &picture)
{
    const QSize size = (QSizeF(maximumSize()) * devicePixelRatioF()).toSize();
    mPicture = picture;
    if (!picture.isNull() && picture.size() != size) {
        mPicture = picture.scaled(size, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
        mPicture.setDevicePixelRatio(devicePixelRatioF());
    }
    update();
}

void PhotoLabel::paintEvent(QPaintEvent *)
{
    if (mPicture.isNull())
        return;
    QPainter painter(this);
    painter.drawPixmap(0, 0, mPicture);
}

void CaptionLabel::setCaption(const QString &text)
{
    setText(text);
    mRendered = QPixmap();
    update();
}

void CaptionLabel::changeEvent(QEvent *event)
{
    QLabel::changeEvent(event);
    mRendered = QPixmap();
}

void CaptionLabel::paintEvent(QPaintEvent *)
{
    if (text().isEmpty())
        return;
    const QSize pixels = (QSizeF(size()) * devicePixelRatioF()).toSize();
    if (mRendered.size() != pixels)
        render();
    QPainter painter(this);
    painter.drawPixmap(0, 0, mRendered);
}

void CaptionLabel::render()
{
    mRendered = QPixmap((QSizeF(size()) * devicePixelRatioF()).toSize());
    mRendered.fill(Qt::transparent);
    mRendered.setDevicePixelRatio(devicePixelRatioF());
    QPainter painter(&mRendered);
    painter.setFont(font());
    painter.setPen(palette().color(QPalette::WindowText));
    painter.drawText(rect(), int(alignment()), text());
}
