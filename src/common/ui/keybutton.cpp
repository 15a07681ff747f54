#include "common/ui/keybutton.h"

#include "common/ui/popupoverlay.h"

#include <QStyleOptionButton>
#include <QStylePainter>

namespace {

constexpr int kTextHeight = 20; // pixels of the font
constexpr int kSmallestText = 14;
constexpr int kMargin = 6;
constexpr qreal kDimmed = 0.35;

QString markedStyle()
{
    return QStringLiteral("outline-width: 0px; border-image:url(%1);border-width: 6px;")
        .arg(QLatin1String(":/res/KeyBoard_Bg_Focus.png"));
}

QString plainStyle()
{
    return QStringLiteral("outline-width: 0px; border-image: url(%1);border-width: 6px;")
        .arg(QLatin1String(":/res/KeyBoard_Bg_Normal.png"));
}

} // namespace

KeyButton::KeyButton(QWidget *parent)
    : QPushButton(parent)
{
    setFocusPolicy(Qt::NoFocus);
    setPopupColours(this);
    setIconSize({28, 28});
    setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Expanding);
    setMarked(false);
}

void KeyButton::setLabel(const QString &label)
{
    setText(QString(label).replace(QLatin1Char('&'), QStringLiteral("&&")));
}

void KeyButton::setMarked(bool marked)
{
    setStyleSheet(marked ? markedStyle() : plainStyle());
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
    QStyleOptionButton option;
    initStyleOption(&option);
    option.text.clear();
    option.icon = QIcon();
    painter.drawControl(QStyle::CE_PushButton, option);
    painter.setOpacity(isEnabled() ? 1 : kDimmed); // not the frame, which may show the focus
    QRect picture(QPoint(), iconSize());
    picture.moveCenter(rect().center());
    icon().paint(&painter, picture);
    painter.setFont(fittingFont());
    painter.drawItemText(rect(), Qt::AlignCenter | Qt::TextHideMnemonic, palette(), true, text(),
                         QPalette::ButtonText);
}
