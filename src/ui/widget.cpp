#include "ui/widget.h"

#include "ui/homewidget.h"

#include <QStackedLayout>

Widget::Widget(QWidget *parent)
    : QWidget(parent)
    , mHomeWidget(new HomeWidget(this))
    , mPages(new QStackedLayout(this))
{
    mPages->setContentsMargins(0, 0, 0, 0);
    mPages->setSizeConstraint(QLayout::SetNoConstraint); // the screen's size is given
    mPages->addWidget(mHomeWidget);
    setFocusProxy(mHomeWidget);
}
