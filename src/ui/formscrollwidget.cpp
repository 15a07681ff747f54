#include "ui/formscrollwidget.h"

#include "base/log.h"
#include "ui/gridfocus.h"

#include <QAbstractScrollArea>
#include <QGridLayout>

FormScrollWidget::FormScrollWidget(QWidget *parent)
    : QWidget(parent)
    , mLayout(new QGridLayout(this))
{
    mLayout->setContentsMargins(0, 0, 0, 0);
    mLayout->setSpacing(0);
    setContentsMargins(0, 0, 0, 0);

    QPalette colours = palette();
    colours.setColor(QPalette::Text, Qt::black);
    colours.setColor(QPalette::Window, QColor(0, 0, 0, 0));
    setPalette(colours);
    setAutoFillBackground(true);
}

int FormScrollWidget::column() const
{
    return mColumn <= 0 ? -1 : mColumn;
}

bool FormScrollWidget::setColumn(int columns)
{
    if (columns < 1)
        return false;
    mColumn = columns;
    return true;
}

void FormScrollWidget::addItem(QFrame *cell, int position)
{
    if (column() == -1) {
        logLine("set mColumn first");
        return;
    }
    if (QObject *filter = keyFilter())
        cell->installEventFilter(filter);
    else
        logLine("ScrollWidget not has parentWidget()");
    const int row = position / mColumn;
    mLayout->addWidget(cell, row, position % mColumn, Qt::AlignHCenter);
    // Columns keep their places while cells are hidden, and rows stay at the top.
    mLayout->setColumnStretch(position % mColumn, 1);
    mLayout->setRowStretch(row, 0);
    if (row + 1 >= mLayout->rowCount())
        mLayout->setRowStretch(row + 1, 1);
}

// A scroll area puts its viewport between itself and its content.
QObject *FormScrollWidget::keyFilter() const
{
    QWidget *parent = parentWidget();
    QWidget *above = parent ? parent->parentWidget() : nullptr;
    auto *area = qobject_cast<QAbstractScrollArea *>(above);
    return area && area->viewport() == parent ? area : parent;
}

QList<QFrame *> FormScrollWidget::cells() const
{
    return findChildren<QFrame *>(QString(), Qt::FindDirectChildrenOnly);
}

QFrame *FormScrollWidget::cell(int index) const
{
    return cells().value(index, nullptr);
}

int FormScrollWidget::getIndex()
{
    const QList<QFrame *> list = cells();
    if (list.isEmpty() || mIndex < 0) {
        logLine("list is empty or have set mIndex = -1");
        return -1;
    }
    const auto isHidden = [&list](int index) { return list.at(index)->isHidden(); };
    const int index = gridfocus::repaired(mIndex, list.size(), column(), isHidden);
    if (index != mIndex) {
        mIndex = index;
        list.at(index)->setFocus();
    }
    return mIndex;
}

bool FormScrollWidget::setIndex(int index)
{
    const QList<QFrame *> list = cells();
    if (list.isEmpty() || index < 0) {
        mIndex = -1;
        return false;
    }
    if (index >= list.size())
        return false;
    if (list.at(index)->isHidden()) {
        logLine("FormScrollWidget::setIndex this item is hide mIndex=", index);
        return false;
    }
    mIndex = index;
    return true;
}
