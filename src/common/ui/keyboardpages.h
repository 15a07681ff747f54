#pragma once

#include "common/ui/keyboardlayout.h"

#include <QList>
#include <QWidget>

class QLabel;

// Shows the pages of the on-screen keyboard, one pair in each row, and which one is up.
class KeyboardPages : public QWidget
{
    Q_OBJECT

public:
    explicit KeyboardPages(QWidget *parent = nullptr);

    void setPage(KeyboardPage page);

private:
    QList<QLabel *> mNames;
};
