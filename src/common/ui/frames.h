#pragma once

#include <QFrame>

// The frames of pop-ups. They are classes of their own only so that style sheets can address them.

class QContentFrame : public QFrame
{
    Q_OBJECT

public:
    // Wears the look of a pop-up's content.
    explicit QContentFrame(QWidget *parent = nullptr);
};

class QViewFrame : public QFrame
{
    Q_OBJECT

public:
    explicit QViewFrame(QWidget *parent = nullptr);
};
