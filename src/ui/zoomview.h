#pragma once

#include "data/imagetarget.h"

#include <QVector>
#include <QWidget>

class ShortcutBar;

// The photo magnified, over the whole of the photo screen. Select goes closer step by step and then
// back to the first step, Page Up and Page Down go closer and farther, the arrows move, Return
// leaves. It begins with the picture that is there and takes a sharper one when it comes.
class ZoomView : public QWidget, public ImageTarget
{
    Q_OBJECT

public:
    explicit ZoomView(QWidget *parent = nullptr);

    // Shows the picture at the first step. The size is that of the full-size photo, as its record
    // has it: one with other proportions than the picture's is not believed.
    void open(const QPixmap &picture, const QSize &photo);
    void dismiss();

    // True when the key was for the magnified photo; all are but those that leave it.
    bool handleKey(int key);
    qreal factor() const { return mFactors.value(mStep); }
    // Pixels that the photo's width has at the last step.
    qreal largestWidth() const;

    QSize imageSize() const override { return QSize(); } // takes pictures as they are
    void setImage(const QPixmap &picture) override;
    void setPlaceholder(const QString &) override {} // what is there is better

signals:
    void left();

protected:
    void paintEvent(QPaintEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void leave();
    void setStep(int step);
    void pan(int x, int y);
    QSizeF drawnSize() const;
    void paintMap(QPainter &painter, const QRectF &photo) const;

    ShortcutBar *mKeys;
    QPixmap mPicture;
    QPixmap mMap; // the whole photo, small
    QSize mPhotoSize;
    QSizeF mFitted;
    QVector<qreal> mFactors;
    int mStep = 0;
    QPointF mCentre;
};
