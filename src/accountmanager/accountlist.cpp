#include "accountmanager/accountlist.h"

#include "base/i18n.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/frames.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>
#include <QLabel>
#include <QListView>
#include <QStringListModel>
#include <QVBoxLayout>

namespace {

constexpr int kWidth = 620;
constexpr int kHeight = 360;

const QString kStyle = QStringLiteral(
    "QListView {background: transparent; border: 0px; padding: 12px;"
    " color: #f2f6f9; font-size: 22px; outline: 0px;}"
    "QListView::item {min-height: 52px; padding: 0px 14px;}"
    "QListView::item:selected {border-image: url(:/res/Button_Focus.png) 6; border-width: 6px;"
    " color: white;}");

} // namespace

AccountList::AccountList(const QStringList &accounts, QWidget *parent)
    : PopupOverlay(parent)
{
    auto *panel = new QWidget(this);
    panel->setFixedSize(kWidth, kHeight);
    QLabel *title = makePopupTitle(panel);
    title->setText(I18n::prompt(3));
    auto *content = new QContentFrame(panel);
    mList = new QListView(content);
    mList->setFocusPolicy(Qt::NoFocus); // the keys come here
    mList->setEditTriggers(QAbstractItemView::NoEditTriggers);
    mList->setTextElideMode(Qt::ElideMiddle);
    mList->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    mList->setUniformItemSizes(true);
    mList->setStyleSheet(kStyle);
    mList->setModel(new QStringListModel(accounts, mList));
    mList->setCurrentIndex(mList->model()->index(0, 0));
    auto *rows = new QVBoxLayout(panel);
    rows->setContentsMargins(0, 0, 0, 0);
    rows->setSpacing(0);
    rows->addWidget(title);
    rows->addWidget(content, 1);
    auto *inner = new QVBoxLayout(content);
    inner->setContentsMargins(0, 0, 0, 0);
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
