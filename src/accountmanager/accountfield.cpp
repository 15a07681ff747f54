#include "accountmanager/accountfield.h"

#include "common/ui/stretchedpicture.h"

#include <QPainter>

namespace {

constexpr int kPadding = 16; // between the edge and the text
constexpr int kCaretWidth = 2;
const QColor kText(0xf2, 0xf6, 0xf9);
const QColor kPlaceholder(0xa2, 0xbb, 0xc9);

} // namespace

AccountField::AccountField(QWidget *parent)
    : QLineEdit(parent)
{
    setStyleSheet(QStringLiteral("QLineEdit {border-image: url(:/res/InputBox_Normal.png); "
                                 "outline-width: 0px; border-width: 6px;}"
                                 "QLineEdit:focus {border-image: url(:/res/InputBox_Focus.png); "
                                 "outline-width: 0px; border-width: 6px;}"));
    setContextMenuPolicy(Qt::NoContextMenu);
}

void AccountField::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    painter.drawPixmap(0, 0,
                       stretchedPicture(hasFocus() ? QStringLiteral(":/res/InputBox_Focus.png")
                                                   : QStringLiteral(":/res/InputBox_Normal.png"),
                                        size(), kPictureBorder, this));
    paintText(painter, rect().adjusted(kPadding, 0, -kPadding, 0));
}

void AccountField::paintText(QPainter &painter, const QRect &room) const
{
    const QFontMetrics metrics = fontMetrics();
    const QString shown = metrics.elidedText(text().isEmpty() ? placeholderText() : text(),
                                             Qt::ElideRight, room.width());
    painter.setPen(text().isEmpty() ? kPlaceholder : kText);
    painter.drawText(room, int(alignment()) | Qt::AlignVCenter, shown);
    if (!hasFocus() || shown.size() < text().size())
        return;
    const int start = alignment() & Qt::AlignHCenter
                          ? room.center().x() - metrics.horizontalAdvance(text()) / 2
                          : room.left();
    // Behind the letter that was typed last, and before the first.
    const int before = cursorPosition() > 0
                           ? metrics.horizontalAdvance(text().left(cursorPosition()))
                           : -kCaretWidth - 1;
    painter.fillRect(QRect(start + before, room.center().y() - metrics.height() / 2, kCaretWidth,
                           metrics.height()),
                     kText);
}
