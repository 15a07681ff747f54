#include "ui/detailstrip.h"

#include "data/download.h"
#include "ui/detailpaging.h"
#include "ui/detailpictures.h"

#include <QHash>
#include <QPainter>

namespace {

constexpr QSize kCell(80, 64);
constexpr int kGap = 8;
constexpr int kMark = 3; // width of the frame around the photo shown

// The middle of the picture, as large as fills the cell.
QPixmap cutToCell(QPixmap picture, qreal ratio)
{
    const QSize pixels = (QSizeF(kCell) * ratio).toSize();
    picture.setDevicePixelRatio(1);
    const QSize whole = picture.size().scaled(pixels, Qt::KeepAspectRatioByExpanding);
    // Only what is going to be seen is scaled, or a panorama would become a huge picture first.
    const qreal factor = qreal(whole.width()) / qMax(1, picture.width());
    QRect part(QPoint(), (QSizeF(pixels) / factor).toSize().expandedTo(QSize(1, 1)));
    part.moveCenter(picture.rect().center());
    QPixmap cell = picture.copy(part & picture.rect())
                       .scaled(pixels, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    cell.setDevicePixelRatio(ratio);
    return cell;
}

} // namespace

// One place of the strip, which takes its picture whole and cuts it.
class StripCell : public ImageTarget
{
public:
    explicit StripCell(QWidget *strip)
        : mStrip(strip)
    {
    }

    QSize imageSize() const override { return QSize(); }
    void setImage(const QPixmap &picture) override
    {
        mPicture = cutToCell(picture, mStrip->devicePixelRatioF());
        mStrip->update();
    }
    void setPlaceholder(const QString &resource) override
    {
        mPlaceholder = cutToCell(QPixmap(resource), mStrip->devicePixelRatioF());
        mStrip->update();
    }

    QString mUrl;
    QPixmap mPicture;
    QPixmap mPlaceholder; // instead of a picture that cannot be shown
    bool mIsCurrent = false;

private:
    QWidget *mStrip;
};

DetailStrip::DetailStrip(QWidget *parent)
    : QWidget(parent)
{
}

DetailStrip::~DetailStrip() = default;

int DetailStrip::places() const
{
    return detailpaging::stripPlaces(width(), kCell.width(), kGap);
}

QSize DetailStrip::sizeHint() const
{
    return {7 * (kCell.width() + kGap) - kGap, kCell.height() + 2 * kMark};
}

void DetailStrip::showNeighbours(const QVector<Neighbour> &neighbours)
{
    QHash<QString, QPixmap> known;
    for (const auto &cell : mCells)
        known.insert(cell->mUrl, cell->mPicture);
    cancel();
    mCells.clear();
    for (const Neighbour &neighbour : neighbours) {
        mCells.push_back(std::make_unique<StripCell>(this));
        StripCell *cell = mCells.back().get();
        cell->mUrl = neighbour.thumbnailUrl;
        cell->mIsCurrent = neighbour.isCurrent;
        cell->mPicture = known.value(cell->mUrl);
    }
    // Last, for a picture that is there at once may make a cell ask for its repaint.
    for (const auto &cell : mCells) {
        if (!cell->mUrl.isEmpty() && cell->mPicture.isNull())
            DetailPictures::showSmall(cell.get(), cell->mUrl);
    }
    update();
}

void DetailStrip::cancel()
{
    for (const auto &cell : mCells)
        Download::forget(cell.get());
}

int DetailStrip::pictureCount() const
{
    int count = 0;
    for (const auto &cell : mCells)
        count += cell->mPicture.isNull() ? 0 : 1;
    return count;
}

void DetailStrip::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    QRect area(QPoint(kMark, kMark), kCell);
    for (const auto &cell : mCells) {
        const QPixmap &shown = cell->mPicture.isNull() ? cell->mPlaceholder : cell->mPicture;
        if (shown.isNull())
            painter.fillRect(area, QColor(0x18, 0x22, 0x2b));
        else
            painter.drawPixmap(area.topLeft(), shown);
        if (cell->mIsCurrent) {
            painter.setPen(QPen(QColor(0xf2, 0xf6, 0xf9), kMark));
            painter.drawRect(area.adjusted(-1, -1, 1, 1));
        } else {
            painter.fillRect(area, QColor(0x0b, 0x10, 0x16, 0x60));
        }
        area.translate(kCell.width() + kGap, 0);
    }
}
