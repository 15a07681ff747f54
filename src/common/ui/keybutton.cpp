#include "common/ui/keybutton.h"

#include "common/ui/popupoverlay.h"

#include <QStylePainter>

namespace {

constexpr int kTextHeight = 20; // pixels of the font
constexpr int kSmallestText = 14;
constexpr int kMargin = 6;
constexpr qreal kDimmed = 0.35;

const QString kMarkedPicture = QStringLiteral(":/res/KeyBoard_Bg_Focus.png");
const QString kPlainPicture = QStringLiteral(":/res/KeyBoard_Bg_Normal.png");

QString markedStyle()
{
    return QStringLiteral("outline-width: 0px; border-image:url(%1);border-width: 6px;")
        .arg(kMarkedPicture);
}

QString plainStyle()
{
    return QStringLiteral("outline-width: 0px; border-image: url(%1);border-width: 6px;")
        .arg(kPlainPicture);
}

} // namespace

KeyButton::KeyButton(QWidget *parent)
    : PictureButton(parent)
{
    setFocusPolicy(Qt::NoFocus);
    setPopupColours(this);
    setIconSize({28, 28});
    setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Expanding);
    setPictures(kMarkedPicture, kPlainPicture);
    setMarked(false);
}

void KeyButton::setLabel(const QString &label)
{
    setText(QString(label).replace(QLatin1Char('&'), QStringLiteral("&&")));
}

void KeyButton::setMarked(bool marked)
{
    setStyleSheet(marked ? markedStyle() : plainStyle());
    PictureButton::setMarked(marked);
}

QFont KeyButton::fittingFont() const
{
    QFont fitting = font();
    int height = kTextHeight;
    do {
        fitting.setPixelSize(height);
    } while (QFontMetrics(fitting).horizontalAdvance(text()) > width() - 2 * kMargin &&
             --height >= kSmallestText);
    return fitting;
}

void KeyButton::paintEvent(QPaintEvent *)
{
    QStylePainter painter(this);
    paintPicture(painter);
    painter.setOpacity(isEnabled() ? 1 : kDimmed); // not the frame, which may show the focus
    QRect picture(QPoint(), iconSize());
    picture.moveCenter(rect().center());
    icon().paint(&painter, picture);
    painter.setFont(fittingFont());
    painter.drawItemText(rect(), Qt::AlignCenter | Qt::TextHideMnemonic, palette(), true, text(),
                         QPalette::ButtonText);
}
