#include "ui/slideoverlay.h"

#include "data/htmlentities.h"
#include "network/systemconfig.h"
#include "ui/slidemotion.h"

#include <QFontMetrics>
#include <QPainter>
#include <QStringList>
#include <QWidget>

#include <algorithm>

namespace {

constexpr int kDrift = 4;  // pixels, each way
constexpr int kShadow = 2; // pixels around the letters
constexpr qreal kRimOpacity = 110.0 / 255;
constexpr int kLongestText = 500; // characters; a line holds fewer
constexpr int kMarkRoom = 48;     // beside the middle, where play and pause are marked

QString oneLine(const QString &text)
{
    return unescapeHtml(text.left(kLongestText)).simplified();
}

// A text is cut before the middle of the screen.
int widestText(int screen)
{
    const int border = std::max(SystemConfig::borderLeft(), SystemConfig::borderRight());
    return std::max(screen / 4, screen / 2 - border - kMarkRoom);
}

bool isAtTop(SlideCorner corner)
{
    return corner == SlideCorner::TopLeft || corner == SlideCorner::TopRight;
}

bool isAtLeft(SlideCorner corner)
{
    return corner == SlideCorner::TopLeft || corner == SlideCorner::BottomLeft;
}

// Light letters with a dark rim: readable on any photo. The letters of the rim are laid out once.
void drawLine(QPainter &painter, const QRect &box, int flags, const QString &text)
{
    const qreal ratio = painter.device()->devicePixelRatioF();
    QPixmap letters((QSizeF(box.size()) * ratio).toSize());
    letters.setDevicePixelRatio(ratio);
    letters.fill(Qt::transparent);
    QPainter dark(&letters);
    dark.setFont(painter.font());
    dark.setPen(Qt::black);
    dark.drawText(QRect(QPoint(), box.size()), flags, text);
    dark.end();

    painter.setOpacity(kRimOpacity);
    for (int x = -kShadow; x <= kShadow; ++x) {
        for (int y = -kShadow; y <= kShadow; ++y) {
            if (x != 0 || y != 0)
                painter.drawPixmap(box.topLeft() + QPoint(x, y), letters);
        }
    }
    painter.setOpacity(1);
    painter.setPen(QColor(0xf2, 0xf6, 0xf9));
    painter.drawText(box, flags, text);
}

} // namespace

SlideOverlay::SlideOverlay(const SlideOptions &options, const QWidget *target)
    : mOptions(options)
    , mTarget(target)
{
}

void SlideOverlay::setPhoto(const QString &caption, const QString &date)
{
    mCaption = oneLine(caption);
    mDate = oneLine(date);
    layOut();
}

bool SlideOverlay::setClock(const QString &time)
{
    if (time == mClock)
        return false;
    mClock = time;
    layOut();
    return true;
}

void SlideOverlay::layOut()
{
    mLaidOutFor = mTarget->size();
    mBlocks.clear();
    for (SlideCorner corner : {SlideCorner::TopLeft, SlideCorner::TopRight, SlideCorner::BottomLeft,
                               SlideCorner::BottomRight}) {
        const Block block = makeBlock(corner);
        if (!block.text.isNull())
            mBlocks << block;
    }
}

// The texts of a corner, one below the other.
SlideOverlay::Block SlideOverlay::makeBlock(SlideCorner corner) const
{
    QFont font = mTarget->font();
    font.setPointSize(SystemConfig::appNormalFont());
    font.setWeight(QFont::DemiBold);
    const QFontMetrics metrics(font);
    const int widest = widestText(mTarget->width());
    QStringList lines;
    int width = 0;
    const auto add = [&](SlideCorner wanted, const QString &text) {
        if (wanted != corner || text.isEmpty())
            return;
        lines << metrics.elidedText(text, Qt::ElideRight, widest);
        width = std::max(width, metrics.horizontalAdvance(lines.last()));
    };
    add(mOptions.caption, mCaption);
    add(mOptions.date, mDate);
    add(mOptions.clock, mClock);
    if (lines.isEmpty())
        return {corner, QPixmap()};

    const qreal ratio = mTarget->devicePixelRatioF();
    const QSize size(width + 4 * kShadow, lines.size() * metrics.lineSpacing() + 2 * kShadow);
    QPixmap text((QSizeF(size) * ratio).toSize());
    text.fill(Qt::transparent);
    text.setDevicePixelRatio(ratio);
    QPainter painter(&text);
    painter.setFont(font);
    const int flags =
        Qt::AlignVCenter | Qt::TextSingleLine | (isAtLeft(corner) ? Qt::AlignLeft : Qt::AlignRight);
    QRect box(2 * kShadow, kShadow, width, metrics.lineSpacing());
    for (const QString &line : qAsConst(lines)) {
        drawLine(painter, box, flags, line);
        box.translate(0, box.height());
    }
    return {corner, text};
}

// Inside the part of the screen that every television shows.
QPoint SlideOverlay::placeOf(const Block &block) const
{
    const QSize size = (QSizeF(block.text.size()) / block.text.devicePixelRatioF()).toSize();
    const QRect room = mTarget->rect().adjusted(
        SystemConfig::borderLeft() + kDrift, SystemConfig::borderTop() + kDrift,
        -SystemConfig::borderRight() - kDrift, -SystemConfig::borderBottom() - kDrift);
    const int x = isAtLeft(block.corner) ? room.left() : room.right() + 1 - size.width();
    const int y = isAtTop(block.corner) ? room.top() : room.bottom() + 1 - size.height();
    return QPoint(x, y) + slidemotion::drift(mTurn, kDrift);
}

void SlideOverlay::paint(QPainter &painter)
{
    if (mLaidOutFor != mTarget->size())
        layOut();
    for (const Block &block : qAsConst(mBlocks))
        painter.drawPixmap(placeOf(block), block.text);
}
