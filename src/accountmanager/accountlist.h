#pragma once

#include "common/ui/popupoverlay.h"

#include <QModelIndex>
#include <QStringList>

class QListView;

// Pops up the stored accounts to choose one from. Answering does not close it.
class AccountList : public PopupOverlay
{
    Q_OBJECT

public:
    AccountList(const QStringList &accounts, QWidget *parent);

signals:
    void selected(QModelIndex index);
    void returned();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    QListView *mList;
};
