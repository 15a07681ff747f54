#pragma once

#include "ui/slideoptions.h"

#include <QPixmap>
#include <QString>
#include <QVector>

class QPainter;
class QWidget;

// The texts over the photos: caption, date and clock, each in the corner that the configuration
// names. They move by a few pixels with each photo, so that nothing burns in. Laid out once for
// each text and then blitted.
class SlideOverlay
{
public:
    SlideOverlay(const SlideOptions &options, const QWidget *target);

    bool hasClock() const { return mOptions.clock != SlideCorner::None; }

    // Plain texts of any length, as the service sent them; an empty one shows nothing.
    void setPhoto(const QString &caption, const QString &date);
    // Lays the clock out anew; false when it shows that already.
    bool setClock(const QString &time);
    void setTurn(int turn) { mTurn = turn; }

    // In layout pixels of the target.
    void paint(QPainter &painter);

private:
    struct Block
    {
        SlideCorner corner;
        QPixmap text;
    };

    void layOut();
    Block makeBlock(SlideCorner corner) const;
    QPoint placeOf(const Block &block) const;

    SlideOptions mOptions;
    const QWidget *mTarget;
    QString mCaption;
    QString mDate;
    QString mClock;
    QVector<Block> mBlocks;
    QSize mLaidOutFor;
    int mTurn = 0;
};
