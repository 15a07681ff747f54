#include "common/ui/frames.h"

QContentFrame::QContentFrame(QWidget *parent)
    : QFrame(parent)
{
    setStyleSheet(QStringLiteral("QContentFrame{border:0px; border-image: url(%1);}")
                      .arg(QStringLiteral(":/res/PopUpMenu_Content_Bg.png")));
}

QViewFrame::QViewFrame(QWidget *parent)
    : QFrame(parent)
{
    setStyleSheet(QStringLiteral("QViewFrame {border-image:url(%1); border: 0px;}")
                      .arg(QStringLiteral(":/res/Content_Bg.png")));
}
