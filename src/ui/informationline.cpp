#include "ui/informationline.h"

#include <QPaintEvent>
#include <QPainter>

#include <algorithm>

namespace {

constexpr int kTextHeight = 22; // pixels of the font
constexpr int kGap = 16;        // between title and position
constexpr int kLongestTitle = 10000;

} // namespace

InformationLine::InformationLine(QWidget *parent)
    : QWidget(parent)
{
    QFont larger = font();
    larger.setPixelSize(kTextHeight);
    setFont(larger);
    mBold = larger;
    mBold.setBold(true);
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
}

void InformationLine::setTexts(const QString &title, const QString &position)
{
    const QString shown = title.left(kLongestTitle).simplified();
    if (shown == mTitle && position == mPosition)
        return;
    const bool onlyPosition = shown == mTitle && position.size() == mPosition.size();
    mTitle = shown;
    mPosition = position;
    if (onlyPosition) {
        update(mPositionLeft, 0, width() - mPositionLeft, height());
        return;
    }
    layOut();
    update();
}

void InformationLine::layOut()
{
    const QFontMetrics metrics(mBold);
    // Room for as many of the widest digits, so that the title stays put while the focus moves.
    const int position =
        fontMetrics().horizontalAdvance(QString(mPosition.size(), QLatin1Char('0')));
    const int room = std::max(0, width() - (mPosition.isEmpty() ? 0 : position + kGap));
    mShownTitle = metrics.elidedText(mTitle, Qt::ElideRight, room);
    mPositionLeft = metrics.horizontalAdvance(mShownTitle) + kGap;
}

void InformationLine::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    layOut();
}

QString InformationLine::text() const
{
    return QStringLiteral(
               "<font size='+1'><p style='margin:0px' align='left'><b>%1</b>%2</p></font>")
        .arg(mTitle.toHtmlEscaped(), mPosition.toHtmlEscaped());
}

QSize InformationLine::sizeHint() const
{
    return {200, fontMetrics().height()};
}

void InformationLine::paintEvent(QPaintEvent *event)
{
    QPainter painter(this);
    if (event->rect().left() < mPositionLeft) {
        painter.setFont(mBold);
        painter.setPen(QColor(0xe6, 0xed, 0xf2));
        painter.drawText(rect(), Qt::AlignVCenter, mShownTitle);
        painter.setFont(font());
    }
    painter.setPen(QColor(0xa2, 0xbb, 0xc9));
    painter.drawText(rect().adjusted(mPositionLeft, 0, 0, 0), Qt::AlignVCenter, mPosition);
}
