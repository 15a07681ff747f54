#include "common/ui/keybutton.h"

#include <QStyleOptionButton>
#include <QStylePainter>

namespace {

constexpr int kTextHeight = 20; // pixels of the font
constexpr int kSmallestText = 14;
constexpr int kMargin = 4;

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
    painter.drawControl(QStyle::CE_PushButton, option);
    if (text().isEmpty())
        return;
    painter.setFont(fittingFont());
    painter.drawItemText(rect(), Qt::AlignCenter | Qt::TextHideMnemonic, palette(), isEnabled(),
                         text(), QPalette::ButtonText);
}
