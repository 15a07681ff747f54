#include "common/ui/screenbackground.h"

#include <QPalette>
#include <QPixmap>
#include <QWidget>

void setScreenBackground(QWidget *widget)
{
    const QPixmap picture(QStringLiteral(":/res/orvala_background.png"));
    QPalette palette = widget->palette();
    palette.setBrush(QPalette::Window, picture.scaled(widget->size(), Qt::IgnoreAspectRatio,
                                                      Qt::SmoothTransformation));
    palette.setBrush(QPalette::WindowText, Qt::white);
    widget->setPalette(palette);
    widget->setAutoFillBackground(true);
}
