#include "ui/notelist.h"

#include "base/i18n.h"
#include "common/ui/remotekeys.h"
#include "common/ui/scrollbarstyle.h"
#include "common/ui/textfit.h"
#include "network/systemconfig.h"

#include <QKeyEvent>
#include <QListWidget>
#include <QPainter>
#include <QStyledItemDelegate>
#include <QVBoxLayout>

#include <algorithm>

namespace {

enum Role { TextRole = Qt::DisplayRole, HeadingRole = Qt::UserRole, KindRole, DeleteRole };
enum Kind { AddRow, NoteRow, MessageRow };

constexpr int kWidth = 760;
constexpr int kHeight = 400;
constexpr int kPadding = 14;
constexpr int kScrollBar = 10;
constexpr int kDeleteWidth = 110;
constexpr int kSlack = 6; // for letters of other fonts, which may be higher
constexpr int kMostLines = 6;
constexpr int kRowsOfAPage = 4;

const QColor kText(0xf2, 0xf6, 0xf9);
const QColor kDimmed(0xa2, 0xbb, 0xc9);
const QColor kMarkGround(0x1a, 0x5f, 0x99);
const QColor kMark(0xf2, 0xf6, 0xf9);

QFont fontOf(int pixels, bool bold = false)
{
    QFont font;
    font.setPixelSize(pixels);
    font.setBold(bold);
    return font;
}

QFont textFont()
{
    return fontOf(24);
}

QFont headingFont()
{
    return fontOf(18, true);
}

// Draws a row: heading above text, and what Select does with the row that has the mark.
class RowDelegate : public QStyledItemDelegate
{
public:
    using QStyledItemDelegate::QStyledItemDelegate;

    QSize sizeHint(const QStyleOptionViewItem &, const QModelIndex &index) const override
    {
        const int lines = index.data(TextRole).toString().count(QLatin1Char('\n')) + 1;
        const bool hasHeading = !index.data(HeadingRole).toString().isEmpty();
        const int heading = hasHeading ? QFontMetrics(headingFont()).lineSpacing() : 0;
        return {0,
                2 * kPadding + heading + kSlack + lines * QFontMetrics(textFont()).lineSpacing()};
    }

    void paint(QPainter *painter, const QStyleOptionViewItem &option,
               const QModelIndex &index) const override
    {
        const bool isMarked = option.state & QStyle::State_Selected;
        painter->save();
        painter->setRenderHint(QPainter::Antialiasing);
        if (isMarked) {
            painter->setPen(QPen(kMark, 3));
            painter->setBrush(kMarkGround);
            painter->drawRoundedRect(option.rect.adjusted(3, 3, -3, -3), 8, 8);
        }
        QRect area = option.rect.adjusted(kPadding, kPadding, -kPadding, -kPadding);
        if (isMarked && index.data(DeleteRole).toBool())
            paintDelete(painter, area);
        paintTexts(painter, area, index, isMarked ? kText : kDimmed);
        painter->restore();
    }

private:
    static void paintDelete(QPainter *painter, const QRect &area)
    {
        const QRect pill(area.right() - kDeleteWidth, area.top(), kDeleteWidth, 32);
        painter->setPen(QPen(kText, 2));
        painter->setBrush(Qt::NoBrush);
        painter->drawRoundedRect(pill, 8, 8);
        painter->setFont(fontOf(18));
        painter->drawText(pill, Qt::AlignCenter, I18n::button(10));
    }

    static void paintTexts(QPainter *painter, QRect area, const QModelIndex &index,
                           const QColor &headingColour)
    {
        const QString heading = index.data(HeadingRole).toString();
        if (!heading.isEmpty()) {
            painter->setFont(headingFont());
            painter->setPen(headingColour);
            painter->drawText(area, Qt::AlignLeft | Qt::AlignTop, heading);
            area.setTop(area.top() + QFontMetrics(headingFont()).lineSpacing());
        }
        const int kind = index.data(KindRole).toInt();
        painter->setFont(textFont());
        painter->setPen(kind == MessageRow ? kDimmed : kText);
        const QString text = index.data(TextRole).toString();
        const int alignment = kind == MessageRow ? Qt::AlignHCenter : Qt::AlignLeft;
        if (index.data(DeleteRole).toBool())
            area.setRight(area.right() - kDeleteWidth - kPadding);
        painter->setLayoutDirection(text.isRightToLeft() ? Qt::RightToLeft : Qt::LeftToRight);
        painter->drawText(area, alignment | Qt::AlignTop | Qt::TextDontClip, text);
    }
};

QListWidgetItem *makeRow(Kind kind, const NoteList::Note &note)
{
    const int room =
        kWidth - kScrollBar - 2 * kPadding - (note.canDelete ? kDeleteWidth + kPadding : 0);
    const QFontMetrics metrics(textFont());
    auto *row = new QListWidgetItem;
    row->setData(TextRole,
                 fitText(note.text, textFont(), {room, kMostLines * metrics.lineSpacing()}));
    row->setData(HeadingRole,
                 QFontMetrics(headingFont()).elidedText(note.heading, Qt::ElideRight, room));
    row->setData(KindRole, kind);
    row->setData(DeleteRole, note.canDelete);
    if (kind == MessageRow)
        row->setFlags(Qt::NoItemFlags);
    return row;
}

} // namespace

NoteList::NoteList(const QString &addText, QWidget *parent)
    : QPopUpList(parent)
    , mAddText(addText)
    , mRows(new QListWidget(this))
{
    setFocusPolicy(Qt::StrongFocus);
    setFixedSize(kWidth + 2 * kPadding, kHeight + 2 * kPadding);
    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(kPadding, kPadding, kPadding, kPadding);
    column->addWidget(mRows);
    mRows->setFocusPolicy(Qt::NoFocus); // the keys are handled here
    mRows->setItemDelegate(new RowDelegate(mRows));
    mRows->setFrameShape(QFrame::NoFrame);
    mRows->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    mRows->setVerticalScrollMode(QAbstractItemView::ScrollPerPixel);
    mRows->setStyleSheet(QStringLiteral("QListWidget {background: transparent; border: 0px;}") +
                         scrollBarStyle());
    fill(QString());
}

void NoteList::showNotes(const QVector<Note> &notes)
{
    mNotes = notes;
    fill(QString());
}

void NoteList::showMessage(const QString &message)
{
    mNotes.clear();
    fill(message);
}

void NoteList::fill(const QString &message)
{
    const int marked = std::max(0, mRows->currentRow());
    mRows->clear();
    if (!mAddText.isEmpty())
        mRows->addItem(makeRow(AddRow, {QString(), mAddText, false}));
    for (const Note &note : qAsConst(mNotes))
        mRows->addItem(makeRow(NoteRow, note));
    const int last = mRows->count() - 1;
    if (!message.isEmpty())
        mRows->addItem(makeRow(MessageRow, {QString(), message, false}));
    mRows->setCurrentRow(std::min(marked, last));
}

QString NoteList::message() const
{
    const QListWidgetItem *last = mRows->item(mRows->count() - 1);
    return last && last->data(KindRole).toInt() == MessageRow ? last->text() : QString();
}

int NoteList::currentRow() const
{
    return mRows->currentRow();
}

void NoteList::move(int rows)
{
    const int last = mNotes.size() - (mAddText.isEmpty() ? 1 : 0);
    if (last >= 0)
        mRows->setCurrentRow(std::clamp(mRows->currentRow() + rows, 0, last));
}

void NoteList::select()
{
    const QListWidgetItem *row = mRows->currentItem();
    if (!row)
        return;
    if (row->data(KindRole).toInt() == AddRow)
        emit addWanted();
    else if (row->data(DeleteRole).toBool())
        emit delItem(mRows->currentRow() - (mAddText.isEmpty() ? 0 : 1));
}

void NoteList::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    switch (event->key()) {
    case DEVICE_UP_KEY:
        move(-1);
        break;
    case DEVICE_DOWN_KEY:
        move(1);
        break;
    case DEVICE_PAGEUP_KEY:
        move(-kRowsOfAPage);
        break;
    case DEVICE_PAGEDOWN_KEY:
        move(kRowsOfAPage);
        break;
    case DEVICE_SELECT_KEY:
        select();
        break;
    case DEVICE_RETURN_KEY:
        emit returnList();
        break;
    default:
        break;
    }
}
