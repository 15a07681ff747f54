#pragma once

#include "data/imagetarget.h"

#include <QFrame>
#include <QLabel>

class PictureArea;
class PhotoLabel;
class CaptionLabel;

// One cell of the focus grid: a picture in its frame, and a caption below.
//
// What it looks like is fixed by the style sheets that styleSheet() returns, but they are painted
// by the cell itself, each picture stretched once: setting a sheet at every focus move would
// re-polish the cell's children and make a move three times as slow.
class PhotoItem : public QFrame, public ImageTarget
{
    Q_OBJECT
    Q_PROPERTY(QString styleSheet READ styleSheet)

public:
    explicit PhotoItem(QWidget *parent = nullptr);

    // The sheet whose look the cell has now: focused or not.
    QString styleSheet() const;

    // Font and colour of the caption; set before the display type, which measures the font.
    void setCaptionFont(const QFont &font);
    void setCaptionColor(const QColor &color);

    // Lays the cell out for the kind of list it shows, a PackageType.
    void setDisplayType(int type);

    // The caption, as plain text. Albums show it unchanged, in two lines; all other lists cut it at
    // the right to the caption's width.
    void setCaption(const QString &text);
    QString caption() const; // as shown
    int captionWidth() const;
    QFont captionFont() const;

    QSize imageSize() const override;
    // Centres the picture on a transparent ground of the label's size, so that the label has
    // nothing left to stretch.
    void setImage(const QPixmap &picture) override;
    void setPlaceholder(const QString &resource) override;

    const PhotoLabel *pictureLabel() const { return mPicture; }
    const PictureArea *pictureArea() const { return mArea; }

protected:
    void focusInEvent(QFocusEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    void setHeights(int picture, int caption, const QSize &cell);
    void show(const QPixmap &picture);

    PictureArea *mArea;
    PhotoLabel *mPicture;
    CaptionLabel *mCaption;
    int mDisplayType = 0;
};

// The ground on which a cell's picture lies.
class PictureArea : public QWidget
{
    Q_OBJECT
    Q_PROPERTY(QString styleSheet READ styleSheet)

public:
    using QWidget::QWidget;

    // The sheet whose look the area has; it is painted from the resource, stretched once.
    QString styleSheet() const { return mSheet; }
    void setGround(const QString &sheet, const QString &resource, const QColor &colour);

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    QString mSheet;
    QString mResource;
    QColor mColour;
};

// A label that shows a picture at its own size: one of another size is stretched once, when set.
class PhotoLabel : public QLabel
{
    Q_OBJECT

public:
    using QLabel::QLabel;

    void setPicture(const QPixmap &picture);
    const QPixmap &picture() const { return mPicture; }

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    QPixmap mPicture;
};

// A label whose plain text is laid out once and then blitted.
class CaptionLabel : public QLabel
{
    Q_OBJECT

public:
    using QLabel::QLabel;

    void setCaption(const QString &text);

protected:
    void paintEvent(QPaintEvent *event) override;
    void changeEvent(QEvent *event) override;

private:
    void render();

    QPixmap mRendered;
};
