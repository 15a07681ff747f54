#include "common/ui/picturebutton.h"

#include "common/ui/stretchedpicture.h"

#include <QStyleOptionButton>
#include <QStylePainter>

PictureButton::PictureButton(QWidget *parent)
    : PictureButton(QString(), parent)
{
}

PictureButton::PictureButton(const QString &text, QWidget *parent)
    : QPushButton(text, parent)
    , mFocused(QStringLiteral(":/res/Button_Focus.png"))
    , mNormal(QStringLiteral(":/res/Button_Normal.png"))
{
}

void PictureButton::setPictures(const QString &focused, const QString &normal)
{
    mFocused = focused;
    mNormal = normal;
}

void PictureButton::setMarked(bool marked)
{
    if (marked == mMarked)
        return;
    mMarked = marked;
    update();
}

void PictureButton::paintPicture(QPainter &painter) const
{
    const QString &picture = mMarked || hasFocus() ? mFocused : mNormal;
    painter.drawPixmap(0, 0, stretchedPicture(picture, size(), kPictureBorder, this));
}

void PictureButton::paintEvent(QPaintEvent *)
{
    QStylePainter painter(this);
    paintPicture(painter);
    QStyleOptionButton option;
    initStyleOption(&option);
    painter.drawControl(QStyle::CE_PushButtonLabel, option);
}
