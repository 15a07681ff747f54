#include "ui/titleicon.h"

#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"

#include <QKeyEvent>

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
    : QLabel(parent)
    , isSignOut(signOut)
{
    setTextFormat(Qt::PlainText);
    setText(text);
    setFont(entryFont(font(), signOut));
    setLook(Look::Normal);
    setFixedHeight(int(fontMetrics().height() * 2.6));
    setFixedWidth(int(SystemConfig::mScreen_Width / 2 * 0.26));
    setAlignment(Qt::AlignCenter);
    setWordWrap(false);
}

QString TitleIcon::style(Look look, bool signOut)
{
    return QString::fromLatin1((signOut ? kSignOutStyles : kTitleStyles)[int(look)]);
}

void TitleIcon::setLook(Look look)
{
    const QString sheet = style(look, isSignOut);
    if (sheet != styleSheet())
        setStyleSheet(sheet);
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
