#include "ui/informationline.h"

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
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
}

void InformationLine::setTexts(const QString &title, const QString &position)
{
    const QString shown = title.left(kLongestTitle).simplified();
    if (shown == mTitle && position == mPosition)
        return;
    mTitle = shown;
    mPosition = position;
    update();
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

void InformationLine::paintEvent(QPaintEvent *)
{
    QFont bold = font();
    bold.setBold(true);
    const QFontMetrics metrics(bold);
    const int position =
        mPosition.isEmpty() ? 0 : fontMetrics().horizontalAdvance(mPosition) + kGap;
    const int room = std::max(0, width() - position);
    const QString title = metrics.elidedText(mTitle, Qt::ElideRight, room);

    QPainter painter(this);
    painter.setFont(bold);
    painter.setPen(QColor(0xe6, 0xed, 0xf2));
    painter.drawText(rect(), Qt::AlignVCenter, title);
    painter.setFont(font());
    painter.setPen(QColor(0xa2, 0xbb, 0xc9));
    painter.drawText(rect().adjusted(metrics.horizontalAdvance(title) + kGap, 0, 0, 0),
                     Qt::AlignVCenter, mPosition);
}
