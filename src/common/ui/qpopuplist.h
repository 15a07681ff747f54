#pragma once

#include <QFrame>

#include <cstdint>

// A list that a pop-up form can host (tags, comments): it handles its keys and says by these
// signals what the user wants. It gets the keyboard's focus when the form is shown.
class QPopUpList : public QFrame
{
    Q_OBJECT

public:
    using QFrame::QFrame;

signals:
    void returnList();
    void delItem(int index);
    void switchProfile(int32_t index);
    void shareComment(QString &text);
};
