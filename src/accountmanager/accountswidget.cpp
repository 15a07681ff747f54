#include "accountmanager/accountswidget.h"

#include "accountmanager/accountitem.h"

#include <QKeyEvent>
#include <QScrollBar>
#include <QVBoxLayout>

#include <algorithm>

namespace {

constexpr int kSpacing = 7;
constexpr int kPitch = AccountItem::rowHeight + kSpacing;

// As many whole rows as fit into the height; at least one.
int rowsIn(int height)
{
    return std::max(1, (height + kSpacing) / kPitch);
}

} // namespace

AccountsWidget::AccountsWidget(QWidget *parent)
    : QScrollArea(parent)
{
    setFocusPolicy(Qt::NoFocus);
    setFrameShape(QFrame::NoFrame);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setWidgetResizable(true);
    auto *content = new QWidget;
    content->setObjectName(QStringLiteral("rows"));
    mRows = new QVBoxLayout(content);
    mRows->setContentsMargins(0, 0, kSpacing, 0);
    mRows->setSpacing(kSpacing);
    mRows->addStretch();
    setWidget(content);
}

void AccountsWidget::setAccounts(const QVector<Account> &accounts)
{
    const QString current = currentAccount();
    qDeleteAll(mItems);
    mItems.clear();
    mCurrent = qBound(0, mCurrent, std::max(0, accounts.size() - 1));
    for (const Account &account : accounts) {
        if (account.mail == current)
            mCurrent = mItems.size();
        addRow(account);
    }
    mRows->activate(); // the rows have their places at once, for the focus to scroll to
}

void AccountsWidget::addRow(const Account &account)
{
    auto *item = new AccountItem(account.mail, account.name, widget());
    const int row = mItems.size();
    connect(item, &AccountItem::selectItem, this, [this, row] {
        mCurrent = row;
        emit accountChosen();
    });
    connect(item, &AccountItem::clickedDelBut, this, [this, row] {
        mCurrent = row;
        emit deletionChosen();
    });
    mRows->insertWidget(row, item);
    item->show(); // at once: a hidden row takes no focus
    mItems << item;
}

bool AccountsWidget::contains(const QString &mail) const
{
    return std::any_of(mItems.cbegin(), mItems.cend(),
                       [&mail](const AccountItem *item) { return item->mail() == mail; });
}

QString AccountsWidget::currentAccount() const
{
    return mItems.isEmpty() ? QString() : mItems.at(mCurrent)->mail();
}

void AccountsWidget::focusCurrent()
{
    if (mItems.isEmpty())
        return;
    mItems.at(mCurrent)->setFocus();
    scrollToCurrent();
}

// By whole rows: the list begins with a row and ends with one.
void AccountsWidget::scrollToCurrent()
{
    const int first = verticalScrollBar()->value() / kPitch;
    const int last = std::max(0, mCurrent - rowsIn(height()) + 1);
    verticalScrollBar()->setValue(qBound(last, first, mCurrent) * kPitch);
}

void AccountsWidget::focusDelete()
{
    if (!mItems.isEmpty())
        mItems.at(mCurrent)->focusDelete();
}

void AccountsWidget::moveFocus(int rows)
{
    if (mItems.isEmpty())
        return;
    const bool isOnDelete = hasDeleteFocus();
    mCurrent = qBound(0, mCurrent + rows, mItems.size() - 1);
    focusCurrent();
    if (isOnDelete)
        focusDelete();
}

void AccountsWidget::movePage(int pages)
{
    moveFocus(pages * rowsIn(height()));
}

bool AccountsWidget::hasRowFocus() const
{
    return !mItems.isEmpty() && mItems.at(mCurrent)->hasFocus();
}

bool AccountsWidget::hasDeleteFocus() const
{
    return !mItems.isEmpty() && mItems.at(mCurrent)->hasDeleteFocus();
}

void AccountsWidget::keyPressEvent(QKeyEvent *event)
{
    event->ignore(); // a scroll area would take the arrows for itself
}

QSize AccountsWidget::sizeHint() const
{
    // The same for any number of rows: the page must not move with it.
    return {400, kPitch};
}

void AccountsWidget::resizeEvent(QResizeEvent *event)
{
    const int rows = rowsIn(height()) * kPitch - kSpacing;
    setViewportMargins(0, 0, 0, std::max(0, height() - rows));
    QScrollArea::resizeEvent(event);
    scrollToCurrent(); // what was in view need not be any more
}
