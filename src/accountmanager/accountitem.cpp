#include "accountmanager/accountitem.h"

#include "accountmanager/pagebutton.h"
#include "base/i18n.h"
#include "common/ui/stretchedpicture.h"

#include <QMouseEvent>
#include <QPainter>
#include <QTextBoundaryFinder>

namespace {

constexpr int kDisc = 46;
constexpr int kPadding = 14;
constexpr int kNameHeight = 24; // pixels of the font
constexpr int kMailHeight = 20;
constexpr int kDeleteWidth = 110;
constexpr int kDeleteHeight = 46;
constexpr int kLongest = 1000; // characters that are measured at most

QFont fontOf(const QWidget *widget, int height)
{
    QFont font = widget->font();
    font.setPixelSize(height);
    return font;
}

void drawLine(QPainter *painter, const QRect &line, const QFont &font, Qt::TextElideMode mode,
              const QString &text)
{
    const QString shown = QFontMetrics(font).elidedText(text, mode, line.width());
    painter->setFont(font);
    painter->drawText(line, Qt::AlignLeft | Qt::AlignVCenter | Qt::TextDontClip, shown);
}

} // namespace

AccountItem::AccountItem(const QString &mail, const QString &name, QWidget *parent)
    : QWidget(parent)
    , mMail(mail)
    , mName(name)
    , mDelete(new PageButton(I18n::button(10), this))
{
    setFocusPolicy(Qt::StrongFocus);
    setFixedHeight(rowHeight);
    setAccessibleName(mail);
    connect(mDelete, &QAbstractButton::clicked, this, &AccountItem::clickedDelBut);
}

void AccountItem::focusDelete()
{
    mDelete->setFocus();
}

bool AccountItem::hasDeleteFocus() const
{
    return mDelete->hasFocus();
}

void AccountItem::resizeEvent(QResizeEvent *)
{
    mDelete->setGeometry(width() - kPadding - kDeleteWidth, (height() - kDeleteHeight) / 2,
                         kDeleteWidth, kDeleteHeight);
}

QSize AccountItem::sizeHint() const
{
    return {400, rowHeight};
}

QString AccountItem::initialOf(const QString &text)
{
    const QString start = text.left(kLongest).trimmed();
    QTextBoundaryFinder finder(QTextBoundaryFinder::Grapheme, start);
    const int end = finder.toNextBoundary();
    return end > 0 ? start.left(end).toUpper() : QStringLiteral("?");
}

QColor AccountItem::colourOf(const QString &mail)
{
    static const QRgb colours[] = {0xff1f6fb2, 0xff8e4585, 0xff2e7d4f, 0xffb0483a,
                                   0xff6a5acd, 0xff80642a, 0xff2a7a86, 0xff9c3d66};
    // qHash is seeded anew for each run.
    uint sum = 0;
    for (const QChar character : mail)
        sum = sum * 31 + character.unicode();
    return QColor(colours[sum % (sizeof colours / sizeof *colours)]);
}

void AccountItem::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    painter.drawPixmap(0, 0,
                       stretchedPicture(hasFocus() ? QStringLiteral(":/res/Button_Focus.png")
                                                   : QStringLiteral(":/res/Button_Normal.png"),
                                        size(), kPictureBorder, this));
    painter.setRenderHint(QPainter::Antialiasing);
    paintDisc(&painter);
    paintTexts(&painter);
}

void AccountItem::paintDisc(QPainter *painter) const
{
    const QRect disc(kPadding, (height() - kDisc) / 2, kDisc, kDisc);
    // The ring keeps the disc apart from a focused row, whose colour it may share.
    painter->setPen(QPen(QColor(0xf2, 0xf6, 0xf9), 2));
    painter->setBrush(colourOf(mMail));
    painter->drawEllipse(disc);
    painter->setFont(fontOf(this, kNameHeight));
    painter->drawText(disc, Qt::AlignCenter, initialOf(mName.trimmed().isEmpty() ? mMail : mName));
}

void AccountItem::paintTexts(QPainter *painter) const
{
    const int left = 2 * kPadding + kDisc;
    const QRect row(left, 0, mDelete->x() - left - kPadding, height());
    const QString mail = mMail.left(kLongest);
    painter->setPen(Qt::white);
    if (mName.trimmed().isEmpty()) {
        drawLine(painter, row, fontOf(this, kNameHeight), Qt::ElideMiddle, mail);
        return;
    }
    drawLine(painter, row.adjusted(0, 11, 0, -height() / 2 + 2), fontOf(this, kNameHeight),
             Qt::ElideRight, mName.left(kLongest));
    if (!hasFocus())
        painter->setPen(QColor(0xd5, 0xdf, 0xe6));
    drawLine(painter, row.adjusted(0, height() / 2 + 2, 0, -7), fontOf(this, kMailHeight),
             Qt::ElideMiddle, mail);
}

void AccountItem::mouseReleaseEvent(QMouseEvent *event)
{
    if (event->button() == Qt::LeftButton && rect().contains(event->pos()))
        emit selectItem();
}
