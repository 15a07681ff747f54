#pragma once

#include "common/ui/keyboardlayout.h"

#include <QList>
#include <QWidget>

class QLabel;

// The names of the on-screen keyboard's pages, in a row of pairs, which tell the one that is up.
class KeyboardPages : public QWidget
{
    Q_OBJECT

public:
    explicit KeyboardPages(QWidget *parent = nullptr);

    void setPage(KeyboardPage page);

private:
    QList<QLabel *> mNames;
};
