#pragma once

#include "data/imagetarget.h"

#include <QTimer>
#include <QWidget>

class QProgressIndicator;

// The place of the large photo: first its thumbnail at the photo's size, then the photo itself at
// the screen's own pixels, or a picture and a line that say why there is none.
class DetailStage : public QWidget, public ImageTarget
{
    Q_OBJECT

public:
    explicit DetailStage(QWidget *parent = nullptr);

    // Waits for the photo, with its thumbnail (null: none yet) in its place. The size is that of
    // the full-size photo, for its proportions.
    void showPreview(const QPixmap &thumbnail, const QSize &photo);
    bool isWaiting() const { return mIsWaiting; }
    // The photo as shown; null while there is only its thumbnail.
    QPixmap picture() const { return mIsPreview ? QPixmap() : mPicture; }

    // A line across the foot of the photo, "" for none.
    void setMessage(const QString &message);
    QString message() const { return mMessage; }
    // Shows that something is on its way, when it lasts.
    void setBusy(bool busy);
    void setMarked(bool marked);
    // Whether there are photos before and after this one.
    void setNeighbours(bool previous, bool next);

    QSize imageSize() const override;
    void setImage(const QPixmap &picture) override;
    void setPlaceholder(const QString &resource) override;

signals:
    // The room for the photo has changed: it is to be fitted anew.
    void resized();

protected:
    void paintEvent(QPaintEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void endWaiting();
    QRect pictureArea() const;
    void paintArrows(QPainter &painter) const;
    void paintMessage(QPainter &painter) const;

    QProgressIndicator *mIndicator;
    QTimer mIndicatorDelay;
    QPixmap mPicture;
    QSize mPhotoSize;
    QString mMessage;
    bool mIsWaiting = false;
    bool mHasFailed = false; // the picture, in whose place the failed-image picture stands
    bool mIsPreview = false;
    bool mMarked = false;
    bool mHasPrevious = false;
    bool mHasNext = false;
};
