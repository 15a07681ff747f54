#pragma once

#include "data/imagetarget.h"

#include <QFrame>
#include <QPixmapCache>
#include <QPointer>

// One cell of the focus grid: a picture on its ground, and a caption below.
//
// What it looks like is fixed by style sheets, which styleSheet() and groundStyleSheet() return.
// The cell paints that look itself, as a whole and opaque, and keeps it for each state: a focus
// move then takes one blit for each of the two cells, where a sheet set anew would re-polish and
// repaint widgets behind widgets.
class PhotoItem : public QFrame, public ImageTarget
{
    Q_OBJECT
    Q_PROPERTY(QString styleSheet READ styleSheet)

public:
    explicit PhotoItem(QWidget *parent = nullptr);
    ~PhotoItem() override;

    // The widget behind the cell that paints what shows through; without one the cell is
    // transparent and painted anew each time.
    void setBackdrop(QWidget *backdrop);

    // The sheet whose look the cell has now: focused or not; and the one of the picture's ground.
    QString styleSheet() const;
    QString groundStyleSheet() const;

    // Font and colour of the caption; set before the display type, which measures the font.
    void setCaptionFont(const QFont &font);
    void setCaptionColor(const QColor &color);
    QFont captionFont() const { return mCaptionFont; }

    // Lays the cell out for the kind of list it shows, a PackageType.
    void setDisplayType(int type);

    // The caption, as plain text. Albums show it unchanged, in two lines; all other lists cut it at
    // the right to the caption's width.
    void setCaption(const QString &text);
    QString caption() const { return mCaption; } // as shown

    QRect groundRect() const;
    QRect pictureRect() const;
    QRect captionRect() const;

    QSize imageSize() const override;
    // Pictures of another size than imageSize() are centred on a transparent ground of that size,
    // so that nothing is stretched.
    void setImage(const QPixmap &picture) override;
    void setPlaceholder(const QString &resource) override;
    const QPixmap &picture() const { return mPicture; }

protected:
    void focusInEvent(QFocusEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    void change();
    void forgetFaces();
    QPixmap face(bool focused);
    QPixmap renderFace(bool focused) const;
    void paintFace(QPainter &painter, bool focused) const;
    void show(const QPixmap &picture);

    int mDisplayType = 0;
    QFont mCaptionFont;
    QColor mCaptionColor = Qt::white;
    QString mCaption;
    QPixmap mPicture; // of exactly the picture's size
    int mPictureHeight;
    int mCaptionHeight;

    QPointer<QWidget> mBackdrop;
    QRect mFacesGround;          // where on the backdrop the kept faces were painted, and its size
    QPixmapCache::Key mFaces[2]; // unfocused, focused
};
