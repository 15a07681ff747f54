#include "ui/titleicon.h"

#include "common/ui/remotekeys.h"
#include "common/ui/stretchedpicture.h"
#include "network/systemconfig.h"

#include <QKeyEvent>
#include <QPainter>

namespace {

const char *const kTitleStyles[] = {
    // Normal
    "QLabel { color:white;background-color: rgb(100,149,237,0);border-style: outset;border-width: "
    "0px;border-radius: 0px;border-color: black;padding: 6px;text-align: center;margin: 0px }",
    // Focused
    "QLabel { color:green; background-color: rgb(100,149,237,0);border-style: outset;border-width: "
    "2px;border-color: green;border-radius: 10px;padding: 6px;text-align: center;margin: 0px }",
    // Selected
    "QLabel { color:black;border-image:url(:/res/TopBarBg_Selected.png);border-style: "
    "outset;border-width: 6px;border-color: rgb(0,0,0,0);border-radius: 0px;padding: "
    "6px;text-align: center;margin: 0px }",
    // FocusedSelected
    "QLabel { color:green;border-image:url(:/res/TopBarBg_Focus.png);border-style: "
    "outset;border-width: 2px;border-color: green;padding: 6px;text-align: center;margin: 0px }",
};

const char *const kSignOutStyles[] = {
    // Normal
    "QLabel { color: rgb(7,99,170);border-image:url(:/res/SignOut_Bg.png);border-style: "
    "outset;border-width: 2px;border-color: rgb(100,149,237,0);padding: 6px;text-align: "
    "left;margin: 0px }",
    // Focused
    "QLabel { color:green;border-image:url(:/res/SignOut_Bg.png);border-style: solid;border-width: "
    "2px;border-color: green;padding: 6px;text-align: left;margin: 0px }",
    // Selected
    "QLabel { background-color: rgba(100,149,237,0);border-style: outset;border-width: "
    "2px;border-color: rgb(100,149,237);padding: 6px;text-align: left;margin: 0px }",
    // FocusedSelected
    "QLabel { background-color: rgba(100,149,237,0);border-style: outset;border-width: "
    "2px;border-color: green;padding: 6px;text-align: left;margin: 0px }",
};

const QColor kGreen(0, 128, 0); // a style sheet's "green"
const QColor kBlue(100, 149, 237);
const QColor kLight(0xf4, 0xf8, 0xfa);
constexpr qreal kTitleRadius = 10;
constexpr qreal kSignOutRadius = 5; // of its picture
constexpr qreal kFocusFrame = 3;

void paintBox(QPainter &painter, const QRect &area, const QPen &pen, const QBrush &brush,
              qreal radius)
{
    const qreal inset = pen.widthF() / 2;
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(pen);
    painter.setBrush(brush);
    painter.drawRoundedRect(QRectF(area).adjusted(inset, inset, -inset, -inset), radius, radius);
}

QFont entryFont(QFont font, bool signOut)
{
    if (signOut) {
        font.setPointSize(15);
        font.setBold(true);
        font.setUnderline(true);
    } else {
        font.setPointSize(int(SystemConfig::titleFont() * 0.7));
    }
    return font;
}

} // namespace

TitleIcon::TitleIcon(const QString &text, bool signOut, QWidget *parent)
    : SelfPainted(parent)
    , isSignOut(signOut)
{
    setTextFormat(Qt::PlainText);
    setText(text);
    setFont(entryFont(font(), signOut));
    setLook(Look::Normal);
    setFixedHeight(int(fontMetrics().height() * 2.6));
    const int half = SystemConfig::mScreen_Width / 2;
    setFixedWidth(int(half * 0.26));
    setAlignment(Qt::AlignCenter);
    setWordWrap(false);
}

QString TitleIcon::style(Look look, bool signOut)
{
    return QString::fromLatin1((signOut ? kSignOutStyles : kTitleStyles)[int(look)]);
}

void TitleIcon::setLook(Look look)
{
    mLook = look;
    const QString sheet = style(look, isSignOut);
    if (sheet != styleSheet())
        setStyleSheet(sheet);
}

// Green alone is too dark for this background, and beside a border-image a style sheet draws no
// border: with the focus, the ground is light and the green frame drawn whatever else there is.
void TitleIcon::paintGround(QPainter &painter) const
{
    const auto picture = [&](const char *name, int border) {
        painter.drawPixmap(0, 0, stretchedPicture(QLatin1String(name), size(), border, this));
    };
    const QPen focus(kGreen, kFocusFrame);
    if (isSignOut && mLook == Look::Normal)
        picture(":/res/SignOut_Bg.png", kPictureBorder);
    else if (isSignOut && mLook == Look::Selected)
        paintBox(painter, rect(), QPen(kBlue, 2), Qt::NoBrush, kSignOutRadius);
    else if (isSignOut)
        paintBox(painter, rect(), focus, kLight, kSignOutRadius);
    else if (mLook == Look::Focused)
        paintBox(painter, rect(), focus, kLight, kTitleRadius);
    else if (mLook == Look::Selected)
        picture(":/res/TopBarBg_Selected.png", kPictureBorder);
    else if (mLook == Look::FocusedSelected)
        picture(":/res/TopBarBg_Focus.png", kPictureBorder);
}

QColor TitleIcon::textColour() const
{
    if (mLook == Look::Focused || mLook == Look::FocusedSelected)
        return kGreen;
    if (isSignOut)
        return mLook == Look::Normal ? QColor(7, 99, 170) : QColor(Qt::white);
    return mLook == Look::Selected ? Qt::black : Qt::white;
}

void TitleIcon::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    paintGround(painter);
    painter.setFont(font());
    painter.setPen(textColour());
    painter.drawText(rect(), Qt::AlignCenter, text());
}

void TitleIcon::keyPressEvent(QKeyEvent *event)
{
    if (event->key() == DEVICE_SELECT_KEY) {
        event->accept();
        emit pressEnter();
        return;
    }
    event->ignore();
}
