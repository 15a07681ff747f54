#include "common/ui/frames.h"

#include "common/ui/stretchedpicture.h"

#include <QPainter>

QContentFrame::QContentFrame(QWidget *parent, Place place)
    : SelfPainted(parent)
    , mPlace(place)
{
    setStyleSheet(QStringLiteral("QContentFrame{border:0px; border-image: url(%1);}")
                      .arg(QStringLiteral(":/res/PopUpMenu_Content_Bg.png")));
}

void QContentFrame::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    paintPanel(painter, QStringLiteral(":/res/PopUpMenu_Content_Bg.png"), size(),
               mPlace == Place::Alone ? Qt::TopEdge | Qt::BottomEdge : Qt::Edges(Qt::BottomEdge));
}

QViewFrame::QViewFrame(QWidget *parent)
    : QFrame(parent)
{
    setStyleSheet(QStringLiteral("QViewFrame {border-image:url(%1); border: 0px;}")
                      .arg(QStringLiteral(":/res/Content_Bg.png")));
}
