#pragma once

#include "common/ui/selfpainted.h"

#include <QFrame>

// The frames of pop-ups. They are classes of their own only so that style sheets can address them.

// Wears the look of a pop-up's content.
class QContentFrame : public SelfPainted<QFrame>
{
    Q_OBJECT

public:
    // Below a title, whose corners are the upper ones, or without one.
    enum class Place { BelowTitle, Alone };

    explicit QContentFrame(QWidget *parent = nullptr, Place place = Place::BelowTitle);

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    Place mPlace;
};

class QViewFrame : public QFrame
{
    Q_OBJECT

public:
    explicit QViewFrame(QWidget *parent = nullptr);
};
