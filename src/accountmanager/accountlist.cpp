#include "accountmanager/accountlist.h"

#include "base/i18n.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/frames.h"
#include "common/ui/remotekeys.h"
#include "common/ui/scrollbarstyle.h"
#include "common/ui/stretchedpicture.h"

#include <QKeyEvent>
#include <QLabel>
#include <QListView>
#include <QPainter>
#include <QStringListModel>
#include <QStyledItemDelegate>
#include <QVBoxLayout>

namespace {

constexpr int kWidth = 620;
constexpr int kMostRows = 6; // in view
constexpr int kMargin = 12;
constexpr int kRowHeight = 52;
constexpr int kPadding = 20;

const QString kStyle =
    QStringLiteral("QListView {background: transparent; border: 0px; font-size: 22px;}");

// A style sheet would blur the picture behind the selected row on a dense screen.
class RowDelegate : public QStyledItemDelegate
{
public:
    using QStyledItemDelegate::QStyledItemDelegate;

    QSize sizeHint(const QStyleOptionViewItem &, const QModelIndex &) const override
    {
        return {0, kRowHeight};
    }

    void paint(QPainter *painter, const QStyleOptionViewItem &option,
               const QModelIndex &index) const override
    {
        if (option.state & QStyle::State_Selected)
            painter->drawPixmap(option.rect.topLeft(),
                                stretchedPicture(QStringLiteral(":/res/Button_Focus.png"),
                                                 option.rect.size(), kPictureBorder,
                                                 option.widget));
        const QRect room = option.rect.adjusted(kPadding, 0, -kPadding, 0);
        painter->setFont(option.font);
        painter->setPen(QColor(0xf2, 0xf6, 0xf9));
        painter->drawText(
            room, Qt::AlignLeft | Qt::AlignVCenter,
            option.fontMetrics.elidedText(index.data().toString(), Qt::ElideMiddle, room.width()));
    }
};

} // namespace

AccountList::AccountList(const QStringList &accounts, QWidget *parent)
    : PopupOverlay(parent)
{
    auto *panel = new QWidget(this);
    panel->setFixedWidth(kWidth);
    QLabel *title = makePopupTitle(panel);
    title->setText(I18n::prompt(3));
    auto *content = new QContentFrame(panel);
    mList = new QListView(content);
    mList->setFocusPolicy(Qt::NoFocus); // the keys come here
    mList->setEditTriggers(QAbstractItemView::NoEditTriggers);
    mList->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    mList->setUniformItemSizes(true);
    mList->setStyleSheet(kStyle + scrollBarStyle());
    mList->setItemDelegate(new RowDelegate(mList));
    mList->setFixedHeight(qMin(accounts.size(), kMostRows) * kRowHeight);
    mList->setModel(new QStringListModel(accounts, mList));
    mList->setCurrentIndex(mList->model()->index(0, 0));
    auto *rows = new QVBoxLayout(panel);
    rows->setContentsMargins(0, 0, 0, 0);
    rows->setSpacing(0);
    rows->addWidget(title);
    rows->addWidget(content, 1);
    auto *inner = new QVBoxLayout(content);
    inner->setContentsMargins(kMargin, kMargin, kMargin, kMargin);
    inner->addWidget(mList);
    setPanel(panel);
}

void AccountList::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    const int row = mList->currentIndex().row();
    const int last = mList->model()->rowCount() - 1;
    switch (event->key()) {
    case DEVICE_UP_KEY:
        mList->setCurrentIndex(mList->model()->index(qMax(0, row - 1), 0));
        break;
    case DEVICE_DOWN_KEY:
        mList->setCurrentIndex(mList->model()->index(qMin(last, row + 1), 0));
        break;
    case DEVICE_SELECT_KEY:
        if (mList->currentIndex().isValid())
            emit selected(mList->currentIndex());
        break;
    case DEVICE_RETURN_KEY:
        emit returned();
        break;
    default:
        break;
    }
}
